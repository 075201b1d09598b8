#include "utility/LocalTime.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>
#include <regex>

namespace {

TEST(LocalTime, Iso8601WithColonInTheOffset) {
    std::regex const form(R"(\d{4}-\d\d-\d\dT\d\d:\d\d:\d\d[+-]\d\d:\d\d)");
    EXPECT_TRUE(std::regex_match(util::localTimeText(1700000000), form));
    EXPECT_TRUE(std::regex_match(util::localTimeText(0), form));
}

// The time zone is process-wide state: set it in a child process.
TEST(LocalTime, OffsetOfTheLocalZone) {
    EXPECT_EXIT(
        {
            ::setenv("TZ", "UTC-1", 1);
            ::tzset();
            std::exit(util::localTimeText(1700000000) == "2023-11-14T23:13:20+01:00" ? 0 : 1);
        },
        ::testing::ExitedWithCode(0), "");
}

TEST(LocalTime, TimeTextReadBackWithItsOffset) {
    EXPECT_EQ(util::secondsOfTimeText("2023-11-14T23:13:20+01:00"), 1700000000);
    EXPECT_EQ(util::secondsOfTimeText("2023-11-14T17:43:20-04:30"), 1700000000);
    EXPECT_EQ(util::secondsOfTimeText("1970-01-01T00:00:00+00:00"), 0);
}

TEST(LocalTime, TimeTextOfTheLocalZoneReadBack) {
    EXPECT_EQ(util::secondsOfTimeText(util::localTimeText(1700000000)), 1700000000);
}

TEST(LocalTime, TextOfAnotherFormHasNoTime) {
    for (char const* text : {"", "2023-11-14", "2023-11-14T23:13:20", "2023-11-14T23:13:20Z",
                             "2023-11-14T23:13:20+01:00 ", "2023-11-14 23:13:20+01:00",
                             "2023-11-14T23:13:20*01:00", "x023-11-14T23:13:20+01:00"}) {
        EXPECT_EQ(util::secondsOfTimeText(text), std::nullopt) << text;
    }
}

} // namespace
