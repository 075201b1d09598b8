#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

namespace fleet {

// The estimate of the time left.
struct TimeLeft {
    double seconds = 0;
    // The time a running partition may still take under the time limit,
    // longer than the pace so far foretells: "up to" it, not "about".
    bool isTimeLimit = false;
};

// The figures of the live progress line and the text made of them; the
// line on the terminal is ProgressLine's.
struct ProgressFigures {
    // Machines whose listing and surveys have all ended, written out or not.
    std::size_t machinesDone = 0;
    std::size_t machines = 0;
    // Machines not listed yet: their partitions are still to be counted.
    std::size_t listingsPending = 0;
    // Partitions ended: surveyed or inactive, or failed (report::isFailure).
    std::size_t endedWithoutFailure = 0;
    std::size_t failed = 0;
    std::size_t running = 0;
    // Machines whose partitions are being listed now.
    std::size_t listingsRunning = 0;
    // Partitions listed so far.
    std::size_t partitions = 0;
    double elapsedSeconds = 0;
    // nullopt while there is no estimate.
    std::optional<TimeLeft> left;
    // The partition that has been running longest, by host name, and for
    // how long.
    std::string longestName;
    double longestSeconds = 0;
};

// What the estimate knows of the partitions running now.
struct RunningSurveys {
    // How long each has been running.
    std::vector<double> seconds;
    // The time limit of one remote action; 0 for none.
    unsigned int timeoutSeconds = 0;
};

// The line's fields, each a whole, joined by two blanks in this order: "8/9
// partitions done, 1 failed, 1 running" ("8/9+" while machines are still
// to be listed; "..., listing 2 machines" after the partitions running, or
// in their place when none runs, while listings run), "1/2 machines done", "00:00:36 elapsed",
// "~00:04:20 left" (or "time left unknown"), "longest host7 36 s". Where they do not all fit in
// columns (0: any width), fields go in a fixed order, the least telling first: elapsed time,
// machines, partitions, time left; the longest-running partition goes last, cut if it alone does
// not fit.
std::string formatProgress(ProgressFigures const& figures, std::size_t columns = 0);
// The time left: at the pace so far (elapsed time per finished partition
// times the partitions not finished), but never less than what a running
// partition may still take under the time limit (with no limit, the pace
// alone). nullopt while a listing is
// pending (the count of partitions is not known) or before one finished.
std::optional<TimeLeft> estimateLeft(ProgressFigures const& figures, RunningSurveys const& running);
// "HH:MM:SS"
std::string clockText(double seconds);
// The line cut to fit a terminal of this many columns, one column left free:
// a line that wrapped could not be erased with one "\r".
std::string fitToWidth(std::string const& line, std::size_t columns);

} // namespace fleet
