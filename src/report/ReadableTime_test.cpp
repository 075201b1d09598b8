#include "report/ReadableTime.h"

#include <gtest/gtest.h>

namespace {

using report::readableTime;

TEST(ReadableTime, OffsetTimeKeepsItsZoneNamedByTheOffset) {
    EXPECT_EQ(readableTime("2026-11-23T14:05:09+01:00"), "Mon 23 Nov 2026 14:05:09 UTC+01:00");
    EXPECT_EQ(readableTime("2026-07-04T23:59:60-05:30"), "Sat 4 Jul 2026 23:59:60 UTC-05:30");
}

TEST(ReadableTime, ZeroOffsetAndZReadAsUtc) {
    EXPECT_EQ(readableTime("2026-11-24T13:16:06+00:00"), "Tue 24 Nov 2026 13:16:06 UTC");
    EXPECT_EQ(readableTime("2026-11-24T13:16:06Z"), "Tue 24 Nov 2026 13:16:06 UTC");
}

TEST(ReadableTime, WeekdaysAcrossLeapDaysCenturiesAndTheEpoch) {
    EXPECT_EQ(readableTime("2024-02-29T00:00:00+00:00"), "Thu 29 Feb 2024 00:00:00 UTC");
    EXPECT_EQ(readableTime("2000-03-01T00:00:00+00:00"), "Wed 1 Mar 2000 00:00:00 UTC");
    EXPECT_EQ(readableTime("1970-01-01T00:00:00+00:00"), "Thu 1 Jan 1970 00:00:00 UTC");
    EXPECT_EQ(readableTime("1969-12-31T23:59:59+00:00"), "Wed 31 Dec 1969 23:59:59 UTC");
    EXPECT_EQ(readableTime("2100-01-01T00:00:00+00:00"), "Fri 1 Jan 2100 00:00:00 UTC");
}

TEST(ReadableTime, TextThatIsNoSuchTimeGivesNothing) {
    EXPECT_EQ(readableTime(""), std::nullopt);
    EXPECT_EQ(readableTime("2026-11-24"), std::nullopt);
    EXPECT_EQ(readableTime("2026-11-24T13:16:06"), std::nullopt);
    EXPECT_EQ(readableTime("2026-11-24 13:16:06+00:00"), std::nullopt);
    EXPECT_EQ(readableTime("2026-13-24T13:16:06+00:00"), std::nullopt);
    EXPECT_EQ(readableTime("2026-11-24T24:16:06+00:00"), std::nullopt);
    EXPECT_EQ(readableTime("2026-11-24T13:16:06+0100"), std::nullopt);
    EXPECT_EQ(readableTime("2026-11-24T13:16:06+01:00 "), std::nullopt);
    EXPECT_EQ(readableTime("2026-11-24T13:16:06CET"), std::nullopt);
}

} // namespace
