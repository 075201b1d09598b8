#include "Lines.h"

#include <gtest/gtest.h>

namespace {

using Lines = std::vector<std::string>;

TEST(Lines, EachLineWithoutItsLineFeed) {
    EXPECT_EQ(QuorvexTest::linesOf("a\n\nb c\n"), (Lines{"a", "", "b c"}));
}

TEST(Lines, LastLineWithoutLineFeedCounts) {
    EXPECT_EQ(QuorvexTest::linesOf("a\nb"), (Lines{"a", "b"}));
}

TEST(Lines, EmptyTextHasNoLines) {
    EXPECT_EQ(QuorvexTest::linesOf(""), Lines{});
}

} // namespace
