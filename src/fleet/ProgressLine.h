#pragma once

#include <chrono>
#include <cstddef>
#include <iosfwd>
#include <string>

namespace fleet {

// The one live line a person watching a terminal sees: redrawn in place,
// at most every gc_ProgressInterval, and erased before any output line, so
// that the output stays as scripts read it. It keeps what it must know of
// the terminal: whether the line is shown, and where the output left the
// cursor.
class ProgressLine {
public:
    using Clock = std::chrono::steady_clock;

    // Draws on out, cut to the width of the terminal on descriptor; a line
    // that is not enabled (no terminal, or --quiet) draws nothing.
    ProgressLine(bool enabled, std::ostream& out, int descriptor);

    // Enabled, and the last line was drawn long enough before now.
    bool isDue(Clock::time_point now) const;
    // Draws the line in place of the one shown. An open output row (see
    // leaveOpenRow) is left as it is: the line goes on the row below and the
    // cursor comes back to just after the row's text.
    void draw(std::string const& line, Clock::time_point now);
    // Takes the line away, if shown, leaving the cursor where output
    // continues: at the start of the row, or just after an open row's text.
    void erase();
    // The output just written ends its last row after this many characters
    // without a line end (a machine's block ends with its code digit, and
    // the next machine's output continues that row); 0 for an empty row.
    void leaveOpenRow(std::size_t openColumns);
    // The output's last row has text and no line end yet.
    bool isRowOpen() const;
    // The terminal's width now, read at every draw so that a resized
    // terminal gets a line that fits; 0 when unknown (not a terminal).
    std::size_t columns() const;

private:
    bool _enabled;
    std::ostream& _out;
    int _descriptor;
    bool _shown = false;
    std::size_t _openColumns = 0;
    Clock::time_point _lastDraw;
};

} // namespace fleet
