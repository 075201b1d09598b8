#pragma once

#include <map>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace report {

// Partitions not surveyed for this many runs in a row are stale, unless
// --stale-after says otherwise.
inline constexpr int gc_DefaultStaleAfterRuns = 3;

// What changed since the console's previous run, as the history database
// keeps it for one run (docs/history.md), in the form the report shows:
// counts and lists of the changes, and each partition's failing streak and
// last survey. Filled by readSinceLastRun() (SinceLastRunReader.h).
struct SinceLastRun {
    // A partition's change: newly failing, recovered, still failing, newly
    // inactive, appeared or disappeared.
    struct PartitionChange {
        std::string machine;
        std::string partition;
        std::string outcome; // in this run; "" for a partition that disappeared
        std::string reason;
        std::optional<std::string> failingSince; // the start of the streak's first run
        long long runsFailing = 0;
    };

    // A component's change in a partition's inventory: added, removed,
    // replaced (oldValue, newValue the serial numbers) or property_changed.
    struct ComponentChange {
        std::string kind;
        std::string machine;
        std::string partition;
        std::string component;
        std::string componentName;
        std::string property;
        std::string oldValue;
        std::string newValue;
    };

    // A partition of this run as its history sees it.
    struct PartitionState {
        std::optional<std::string> failingSince; // the start of the streak's first run
        std::optional<std::string> lastSurveyed; // the start of the latest run that surveyed it
        long long runsNotSurveyed = 0;           // runs in a row, this one included
        bool isStale = false;
    };

    // The run's history could not be recorded or read: why. The report then
    // says so in place of the changes.
    std::optional<std::string> unavailable;
    long long runId = 0;
    // The console's previous run: none for the first recorded run.
    std::optional<long long> previousRunId;
    std::string previousStarted;
    int staleAfterRuns = gc_DefaultStaleAfterRuns;

    std::vector<PartitionChange> newFailures;
    std::vector<PartitionChange> recoveries;
    std::vector<PartitionChange> stillFailing;
    std::vector<PartitionChange> newlyInactive;
    std::vector<PartitionChange> partitionsAppeared;
    std::vector<PartitionChange> partitionsDisappeared;
    std::vector<std::string> machinesAppeared;
    std::vector<std::string> machinesDisappeared;
    std::vector<ComponentChange> inventoryChanges;

    // By (machine, partition), partition as the history names it
    // (historyPartitionNames()).
    std::map<std::pair<std::string, std::string>, PartitionState> partitions;
};

} // namespace report
