#include "report/TextChecks.h"

#include <gtest/gtest.h>

namespace {

TEST(TextChecks, StartsWith) {
    EXPECT_TRUE(report::startsWith("RELAY Failed", "RELAY"));
    EXPECT_TRUE(report::startsWith("x", ""));
    EXPECT_FALSE(report::startsWith("RE", "RELAY"));
}

TEST(TextChecks, EndsWith) {
    EXPECT_TRUE(report::endsWith("a.status", ".status"));
    EXPECT_FALSE(report::endsWith("status", ".status"));
}

TEST(TextChecks, DigitsOnlyAndNotEmpty) {
    EXPECT_TRUE(report::isDigits("0123"));
    EXPECT_FALSE(report::isDigits(""));
    EXPECT_FALSE(report::isDigits("-1"));
    EXPECT_FALSE(report::isDigits("1 "));
    EXPECT_FALSE(report::isDigits("\xD9\xA3"));
}

} // namespace
