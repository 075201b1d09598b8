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

} // namespace
