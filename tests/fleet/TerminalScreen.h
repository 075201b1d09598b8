#pragma once
// What a terminal shows after a stream of bytes: enough of a terminal for a
// program that redraws one line in place. Printable bytes overwrite the
// screen at the cursor and wrap at the width, a carriage return goes to the
// start of the row, a line feed to the start of the next row, ESC [ K
// erases from the cursor to the end of the row, ESC [ A and ESC [ B move up
// and down a row, ESC [ n G moves to column n (from 1), and ESC 7 and ESC 8
// save and restore the cursor. Any other escape sequence is
// recorded as unknown.

#include <string>
#include <utility>
#include <vector>

namespace FleetTest {

class TerminalScreen {
public:
    explicit TerminalScreen(std::size_t width);

    void write(std::string const& bytes);

    // Every row, blanks at the end cut, empty rows at the end left out.
    std::vector<std::string> rows() const;
    // The escape sequences met that this screen does not know.
    std::vector<std::string> const& unknownSequences() const;

private:
    void _put(char c);
    std::size_t _escape(std::string const& bytes, std::size_t at);
    static std::size_t _columnSequenceEnd(std::string const& bytes, std::size_t at);

    std::size_t _width;
    std::vector<std::string> _rows{""};
    std::size_t _row = 0;
    std::size_t _column = 0;
    std::pair<std::size_t, std::size_t> _saved{0, 0};
    std::vector<std::string> _unknown;
};

} // namespace FleetTest
