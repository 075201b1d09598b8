#include "fleet/TerminalWidth.h"

#include <fcntl.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include <gtest/gtest.h>

#include <cstdlib>

namespace {

// A pseudo-terminal's two ends, closed at the end of the test.
class PseudoTerminal {
public:
    PseudoTerminal() : _controller(posix_openpt(O_RDWR | O_NOCTTY)) {
        if (_controller >= 0 && grantpt(_controller) == 0 && unlockpt(_controller) == 0) {
            _terminal = open(ptsname(_controller), O_RDWR | O_NOCTTY);
        }
    }
    ~PseudoTerminal() {
        close(_terminal);
        close(_controller);
    }
    PseudoTerminal(PseudoTerminal const&) = delete;
    PseudoTerminal& operator=(PseudoTerminal const&) = delete;

    int terminal() const { return _terminal; }
    // What a terminal emulator does when its window is resized.
    bool resize(unsigned short columns) const {
        winsize size{};
        size.ws_row = 24;
        size.ws_col = columns;
        return ioctl(_terminal, TIOCSWINSZ, &size) == 0;
    }

private:
    int _controller;
    int _terminal = -1;
};

TEST(TerminalWidth, TerminalsWidthIsReadAgainAfterAResize) {
    PseudoTerminal const pty;
    ASSERT_GE(pty.terminal(), 0) << "no pseudo-terminal";
    ASSERT_TRUE(pty.resize(200));
    EXPECT_EQ(fleet::terminalColumns(pty.terminal()), 200U);
    ASSERT_TRUE(pty.resize(80));
    EXPECT_EQ(fleet::terminalColumns(pty.terminal()), 80U);
}

TEST(TerminalWidth, PipeHasNoWidth) {
    int ends[2];
    ASSERT_EQ(pipe(ends), 0);
    EXPECT_EQ(fleet::terminalColumns(ends[1]), 0U);
    close(ends[0]);
    close(ends[1]);
}

TEST(TerminalWidth, ClosedDescriptorHasNoWidth) {
    EXPECT_EQ(fleet::terminalColumns(-1), 0U);
}

} // namespace
