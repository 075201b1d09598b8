#pragma once

#include "report/SinceLastRun.h"

#include <cstddef>
#include <optional>
#include <string>

namespace estate {

// What the history says of a console's run in the estate: its run, the
// console's previous run and how many changes came between them
// (docs/estate.md, "The history").
struct ConsoleChanges {
    std::optional<long long> runId;
    // None for the console's first recorded run.
    std::optional<long long> previousRunId;
    std::size_t newFailures = 0;
    std::size_t recoveries = 0;
    std::size_t inventoryChanges = 0;
    // Why the run could not be recorded or its changes read.
    std::optional<std::string> unavailable;
};

// The counts of the changes the console's report shows in full.
ConsoleChanges changesOf(report::SinceLastRun const& since);

} // namespace estate
