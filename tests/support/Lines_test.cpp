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

TEST(Lines, ContainsOnlyWholeLines) {
    Lines const lines{"--no-vpd-dir", "b"};
    EXPECT_TRUE(QuorvexTest::contains(lines, "--no-vpd-dir"));
    EXPECT_FALSE(QuorvexTest::contains(lines, "--no-vpd"));
    EXPECT_FALSE(QuorvexTest::contains(Lines{}, "b"));
}

} // namespace
