#pragma once

#include "fleet/CommandLine.h"
#include "fleet/RunRecords.h"
#include "report/RunSummary.h"

#include <string>
#include <vector>

namespace fleet {

// The facts of a whole run that its summary carries besides the machines.
struct RunFacts {
    Options options;
    std::string consoleHost;
    std::string started;
    std::string ended;
    double elapsedSeconds = 0;
    // The interrupting signal's name (fleet::signalName), or empty when the
    // run was not interrupted.
    std::string interruptedBy;
    int exitStatus = 0;
    // Why the console's machines could not be listed (--all).
    std::optional<report::ListingFailure> listingFailure;
};

// The summary of a run (report::summaryDocument makes its document): every
// machine's partitions as the run settled them, each with the files the run
// wrote for its machine.
report::RunSummary runSummary(RunFacts const& facts, std::vector<MachineRecord> const& machines);

} // namespace fleet
