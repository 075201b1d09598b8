#include "utility/TextChecks.h"

#include <gtest/gtest.h>

namespace {

TEST(TextChecks, StartsWith) {
    EXPECT_TRUE(util::startsWith("RELAY Failed", "RELAY"));
    EXPECT_TRUE(util::startsWith("x", ""));
    EXPECT_FALSE(util::startsWith("RE", "RELAY"));
}

TEST(TextChecks, EndsWith) {
    EXPECT_TRUE(util::endsWith("a.status", ".status"));
    EXPECT_FALSE(util::endsWith("status", ".status"));
}

TEST(TextChecks, DigitsOnlyAndNotEmpty) {
    EXPECT_TRUE(util::isDigits("0123"));
    EXPECT_FALSE(util::isDigits(""));
    EXPECT_FALSE(util::isDigits("-1"));
    EXPECT_FALSE(util::isDigits("1 "));
    EXPECT_FALSE(util::isDigits("\xD9\xA3"));
}

} // namespace
