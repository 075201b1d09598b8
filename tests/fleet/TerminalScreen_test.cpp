// The terminal model the progress tests read the final screen with.

#include "TerminalScreen.h"

#include <gtest/gtest.h>

namespace {

using FleetTest::TerminalScreen;

std::vector<std::string> shown(std::string const& bytes, std::size_t width = 20) {
    TerminalScreen screen(width);
    screen.write(bytes);
    return screen.rows();
}

TEST(TerminalScreen, CarriageReturnOverwritesTheRowAndEraseClearsItsRest) {
    EXPECT_EQ(shown("progress 1\rprogress 22\r\033[Kout\n"), (std::vector<std::string>{"out"}));
    EXPECT_EQ(shown("abcdef\rxy"), (std::vector<std::string>{"xycdef"}));
}

TEST(TerminalScreen, LongRowWrapsAndEraseReachesOnlyTheLastRow) {
    EXPECT_EQ(shown("0123456789abc\r\033[K", 10), (std::vector<std::string>{"0123456789"}));
}

TEST(TerminalScreen, BlanksAndEmptyRowsAtTheEndAreNotShown) {
    EXPECT_EQ(shown("a  \n\nb\n\n\n"), (std::vector<std::string>{"a", "", "b"}));
}

TEST(TerminalScreen, SavedCursorAndRowUpReturnToAnEarlierPlace) {
    EXPECT_EQ(shown("code 4\0337\nline\r\033[K\0338X"), (std::vector<std::string>{"code 4X"}));
    EXPECT_EQ(shown("one\ntwo\033[A\rON"), (std::vector<std::string>{"ONe", "two"}));
}

TEST(TerminalScreen, RowDownAndColumnMoveReturnAfterAnOpenRow) {
    EXPECT_EQ(shown("code 4\n\rline\033[K\033[A\033[7G\033[B\r\033[K\033[A\033[7GX"),
              (std::vector<std::string>{"code 4X"}));
    EXPECT_EQ(shown("ab\033[99Gc", 10), (std::vector<std::string>{"ab       c"}));
    TerminalScreen screen(20);
    screen.write("a\033[B\033[3Gb");
    EXPECT_EQ(screen.unknownSequences(), std::vector<std::string>{});
    EXPECT_EQ(screen.rows(), (std::vector<std::string>{"a", "  b"}));
}

TEST(TerminalScreen, OtherEscapeSequencesAreReported) {
    TerminalScreen screen(20);
    screen.write("a\033[1mb");
    EXPECT_EQ(screen.unknownSequences(), std::vector<std::string>{"\033[1m"});
}

} // namespace
