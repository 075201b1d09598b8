#include "fleet/ProgressLine.h"

#include <gtest/gtest.h>

#include <sstream>

namespace {

using fleet::ProgressLine;
using Clock = ProgressLine::Clock;

// Not a terminal: the width is unknown and the line is kept whole.
constexpr int gc_NoTerminal = -1;

TEST(ProgressLine, LineOnAnEmptyRowIsDrawnInPlaceAndErasedToTheRowsStart) {
    std::ostringstream out;
    ProgressLine line(true, out, gc_NoTerminal);
    line.draw("machines 0/1", Clock::now());
    line.draw("machines 1/1", Clock::now());
    line.erase();
    EXPECT_EQ(out.str(), "\r\033[Kmachines 0/1\r\033[Kmachines 1/1\r\033[K");
}

TEST(ProgressLine, LineBelowAnOpenRowComesBackToJustAfterTheRowsText) {
    std::ostringstream out;
    ProgressLine line(true, out, gc_NoTerminal);
    line.leaveOpenRow(1);
    line.draw("machines 1/2", Clock::now());
    line.erase();
    EXPECT_EQ(out.str(), "\n\rmachines 1/2\033[K\033[A\033[2G"
                         "\033[B\r\033[K\033[A\033[2G");
}

TEST(ProgressLine, RowIsOpenOnlyWhileOutputLeftItWithoutALineEnd) {
    std::ostringstream out;
    ProgressLine line(false, out, gc_NoTerminal);
    EXPECT_FALSE(line.isRowOpen());
    line.leaveOpenRow(1);
    EXPECT_TRUE(line.isRowOpen());
    line.leaveOpenRow(0);
    EXPECT_FALSE(line.isRowOpen());
    EXPECT_EQ(out.str(), "");
}

TEST(ProgressLine, LineNotShownIsNotErased) {
    std::ostringstream out;
    ProgressLine line(true, out, gc_NoTerminal);
    line.erase();
    line.draw("x", Clock::now());
    line.erase();
    line.erase();
    EXPECT_EQ(out.str(), "\r\033[Kx\r\033[K");
}

TEST(ProgressLine, LineThatIsNotEnabledDrawsNothingAndIsNeverDue) {
    std::ostringstream out;
    ProgressLine line(false, out, gc_NoTerminal);
    EXPECT_FALSE(line.isDue(Clock::now()));
    line.draw("machines 0/1", Clock::now());
    line.erase();
    EXPECT_EQ(out.str(), "");
}

TEST(ProgressLine, NextLineIsDueAFifthOfASecondAfterTheLastDraw) {
    std::ostringstream out;
    ProgressLine line(true, out, gc_NoTerminal);
    Clock::time_point const drawn = Clock::now();
    EXPECT_TRUE(line.isDue(drawn));
    line.draw("x", drawn);
    EXPECT_FALSE(line.isDue(drawn + std::chrono::milliseconds(199)));
    EXPECT_TRUE(line.isDue(drawn + std::chrono::milliseconds(200)));
}

} // namespace
