#include "fleet/MachineListing.h"

#include "fleet/SignalPipe.h"
#include "fleet/TimeLimits.h"
#include "fleet/WorkUnits.h"
#include "fleet/WorkerPool.h"
#include "utility/FileText.h"
#include "utility/SystemError.h"

#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstdlib>

namespace fleet {

namespace {

constexpr char gc_TraceTemplate[] = "/tmp/quorvex-survey-listing-XXXXXX";

report::ListingFailure failureOf(std::string const& message) {
    return report::ListingFailure{"", std::nullopt, message};
}

// What the ended or stopped listing left: the machines, or its failure.
MachineListing listingResult(std::optional<std::string> const& result, std::string const& trace,
                             unsigned int timeoutSeconds) {
    MachineListing listing;
    if (!result) {
        listing.failure = report::stoppedListing(trace, timeoutSeconds);
        return listing;
    }
    listing.failure = report::listingFailureInTrace(trace);
    if (!listing.failure) {
        listing.identities = decodeMachines(*result);
    }
    return listing;
}

// The listing's result; nullopt when the time limit stopped it, an empty
// text when a signal interrupted the run.
std::optional<std::string> awaitListing(WorkerPool& pool, TimeLimits& limits) {
    while (true) {
        std::vector<WorkerEvent> const ended = pool.waitForEvents();
        if (!ended.empty()) {
            return ended.front().text;
        }
        limits.interrupt(takeSignal());
        bool const stopped = !pool.stopDueActions(limits).empty();
        if (limits.isInterrupted()) {
            return std::string();
        }
        if (stopped) {
            return std::nullopt;
        }
    }
}

MachineListing listInto(std::string const& tracePath, unsigned int timeoutSeconds) {
    std::optional<std::string> result;
    TimeLimits limits(timeoutSeconds);
    {
        // The pool ends a stopped worker with everything it started.
        WorkerPool pool(signalPipeDescriptor());
        if (std::optional<std::string> const failure = pool.start(
                0, UnitKind::MachineListing, [tracePath] { return listMachines(tracePath); })) {
            return MachineListing{{}, failureOf(*failure)};
        }
        result = awaitListing(pool, limits);
    }
    if (limits.isInterrupted()) {
        return {};
    }
    // An unreadable trace reads as one without the command's block.
    return listingResult(result, util::readWholeFileOrEmpty(tracePath), timeoutSeconds);
}

} // namespace

MachineListing listManagedMachines(unsigned int timeoutSeconds) {
    std::string tracePath = gc_TraceTemplate;
    int const descriptor = mkstemp(tracePath.data());
    if (descriptor < 0) {
        return MachineListing{
            {}, failureOf(util::SystemError("create", gc_TraceTemplate, errno).what())};
    }
    close(descriptor);
    MachineListing listing = listInto(tracePath, timeoutSeconds);
    std::remove(tracePath.c_str());
    return listing;
}

} // namespace fleet
