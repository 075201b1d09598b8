#include "monitoring/SecondsText.h"

#include <gtest/gtest.h>

namespace {

TEST(SecondsText, KeepsThreeDecimals) {
    EXPECT_EQ(monitoring::secondsText(0), "0.000");
    EXPECT_EQ(monitoring::secondsText(2.5), "2.500");
    EXPECT_EQ(monitoring::secondsText(1800.0004), "1800.000");
    EXPECT_EQ(monitoring::secondsText(31536000.25), "31536000.250");
}

} // namespace
