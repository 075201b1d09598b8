#pragma once

#include <cstddef>
#include <optional>
#include <string>

namespace Fleet {

// The figures of the live progress line.
struct ProgressFigures {
    std::size_t machinesDone = 0;
    std::size_t machines = 0;
    std::size_t surveyed = 0;
    std::size_t failed = 0;
    std::size_t running = 0;
    // Partitions listed so far.
    std::size_t partitions = 0;
    double elapsedSeconds = 0;
    // The estimate of the time left; nullopt while there is none.
    std::optional<double> leftSeconds;
    // The partition that has been running longest, and for how long.
    std::string longestName;
    double longestSeconds = 0;
};

// The one live line a person watching a terminal sees: redrawn in place and
// erased before any output line, so that the output stays as scripts read it.
class Progress {
public:
    // For example "machines 1/3  partitions 12 ok 2 failed 4 running /40
    // 00:01:12 elapsed, ~00:03:10 left  longest: 9119-MHE_21ABCDE-7 (45 s)"
    // (on one line).
    static std::string format(ProgressFigures const& figures);
    // The time left at the pace so far (elapsed time per finished
    // partition times the partitions left); nullopt before one finished.
    static std::optional<double> estimateLeft(ProgressFigures const& figures);
    // "HH:MM:SS"
    static std::string clock(double seconds);

    // The line cut to fit a terminal of this many columns, one column left
    // free: a line that wrapped could not be erased with one "\r".
    static std::string fitToWidth(std::string const& line, std::size_t columns);

    // Redraws the line on standard error, cut to the terminal's width.
    // openColumns is the length of the output row the cursor ends, which has
    // no line end yet (a machine's block ends with its code digit, and the
    // next machine's output continues that row); 0 when the row is empty.
    // An open row is left as it is: the line goes on the row below and the
    // cursor comes back to just after the row's text.
    static void draw(std::string const& line, std::size_t openColumns);
    // Takes the line away, leaving the cursor where output continues: at the
    // start of the row, or just after an open row's text.
    static void erase(std::size_t openColumns);
};

} // namespace Fleet
