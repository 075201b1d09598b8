#include "history/DisplayText.h"

#include <gtest/gtest.h>

namespace {

TEST(DisplayText, CountsAUtf8CharacterAsOneColumn) {
    EXPECT_EQ(history::displayWidth("caf\u00e9 \u2192"), 6U);
}

TEST(DisplayText, KeepsATextThatFits) {
    EXPECT_EQ(history::cutToWidth("lpar1", 5), "lpar1");
}

TEST(DisplayText, CutsATextWithAnEllipsisInItsLastColumn) {
    EXPECT_EQ(history::cutToWidth("8233-E8B_10ABCDE", 6), "8233-\u2026");
    EXPECT_EQ(history::cutToWidth("\u00e9\u00e9\u00e9\u00e9", 3), "\u00e9\u00e9\u2026");
    EXPECT_EQ(history::cutToWidth("abc", 0), "");
}

TEST(DisplayText, TurnsControlCharactersIntoSpaces) {
    EXPECT_EQ(history::oneLine("line one\nline\ttwo\r"), "line one line two ");
}

TEST(DisplayText, ShowsARecordedTimeToTheMinuteInItsOwnZone) {
    EXPECT_EQ(history::shownTime("2026-11-20T02:00:03+01:00"), "2026-11-20 02:00");
}

TEST(DisplayText, GivesARunsLengthInItsLargestUnits) {
    EXPECT_EQ(history::durationText(42), "42s");
    EXPECT_EQ(history::durationText(185), "3m 05s");
    EXPECT_EQ(history::durationText(7260), "2h 01m");
    EXPECT_EQ(history::durationText(std::nullopt), "?");
    EXPECT_EQ(history::durationText(-5), "?");
}

} // namespace
