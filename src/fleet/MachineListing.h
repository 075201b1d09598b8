#pragma once

#include "report/ListingFailure.h"

#include <optional>
#include <string>
#include <vector>

namespace fleet {

// The exit status of a run whose machines the console could not list
// (sysexits.h's EX_UNAVAILABLE).
constexpr int gc_ExitUnavailable = 69;

// The console's managed machines for --all, or why they could not be listed.
struct MachineListing {
    std::vector<std::string> identities;
    // Set when the listing command could not be run, failed, or ran past the
    // time limit; an interruption stops the listing without a failure.
    std::optional<report::ListingFailure> failure;
};

// Lists the managed machines in a worker of its own, so that this process
// never writes through the survey code's trace. The worker traces the
// listing command into a temporary file in /tmp, where the command runner
// keeps its own output files too, so that its exit status and standard error
// can be read back; the file is removed before this returns. A listing
// action that runs past the time limit, or an interruption, stops the
// listing with everything it started, and it never goes on.
MachineListing listManagedMachines(unsigned int timeoutSeconds);

} // namespace fleet
