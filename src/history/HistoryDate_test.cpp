#include "history/HistoryDate.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>
#include <iostream>

namespace {

using history::momentOfDate;

// 2026-11-01T00:00:00Z
constexpr long long gc_FirstOfNovember = 1793491200;

TEST(HistoryDate, ReadsATimeAtItsOffset) {
    EXPECT_EQ(momentOfDate("2026-11-01T00:00:00Z"), gc_FirstOfNovember);
    EXPECT_EQ(momentOfDate("2026-11-01T01:00:00+01:00"), gc_FirstOfNovember);
    EXPECT_EQ(momentOfDate("2026-10-31T22:30-0130"), gc_FirstOfNovember);
    EXPECT_EQ(momentOfDate("2026-11-01 00:00:05Z"), gc_FirstOfNovember + 5);
}

// The time zone is process-wide: set in a fresh copy of the test program.
TEST(HistoryDate, ReadsADateAloneAsLocalMidnightAndATimeWithoutOffsetAsLocal) {
    QuorvexTest::runInFreshProcess([] {
        setenv("TZ", "CET-1", 1);
        tzset();
        bool const midnight = momentOfDate("2026-11-01") == gc_FirstOfNovember - 3600;
        bool const local = momentOfDate("2026-11-01T01:00") == gc_FirstOfNovember;
        if (!midnight || !local) {
            std::cerr << "local dates read wrongly: midnight " << midnight << ", local " << local
                      << "\n";
            return 1;
        }
        return 0;
    });
}

TEST(HistoryDate, RefusesWhatIsNoDateOrNoSuchDay) {
    for (char const* text : {"", "yesterday", "2026-11", "2026-11-1", "2026-13-01", "2026-02-29",
                             "2026-04-31", "2026-11-01T24:00", "2026-11-01T12:60", "2026-11-01T12",
                             "2026-11-01T12:00+25:00", "2026-11-01T12:00 +01:00", "2026-11-01x"}) {
        EXPECT_FALSE(momentOfDate(text).has_value()) << text;
    }
}

} // namespace
