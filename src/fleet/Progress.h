#pragma once

#include <cstddef>
#include <optional>
#include <string>

namespace fleet {

// The figures of the live progress line and the text made of them; the
// line on the terminal is ProgressLine's.
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

// For example "machines 1/3  partitions 12 ok 2 failed 4 running /40
// 00:01:12 elapsed, ~00:03:10 left  longest: 9119-MHE_21ABCDE-7 (45 s)" (on
// one line).
std::string formatProgress(ProgressFigures const& figures);
// The time left at the pace so far (elapsed time per finished partition
// times the partitions left); nullopt before one finished.
std::optional<double> estimateLeft(ProgressFigures const& figures);
// "HH:MM:SS"
std::string clockText(double seconds);
// The line cut to fit a terminal of this many columns, one column left free:
// a line that wrapped could not be erased with one "\r".
std::string fitToWidth(std::string const& line, std::size_t columns);

} // namespace fleet
