#pragma once

#include "report/RemoteAction.h"

#include <optional>
#include <string>

namespace report {

// What stopped a remote action before it ended.
enum class Stopper {
    TimeLimit,
    Signal,
};

// The line quorvex-survey adds to a stopped action's reason: "Stopped by the
// time limit of T s after S s." or "Stopped by SIGINT after S s.".
struct StopLine {
    Stopper stopper = Stopper::TimeLimit;
    // "SIGINT", "SIGTERM", "SIGHUP" or "SIGPIPE" when a signal stopped the
    // action; else empty.
    std::string signalName;
    // S: how long the action had run.
    double afterSeconds = 0;
};

// What a default document's reason says about a failed partition.
struct FailureReason {
    // The action that failed; none for a text the survey never writes as a
    // reason.
    std::optional<RemoteAction> action;
    // The Rc and RcCmd lines of the printed return codes, when numeric.
    std::optional<long long> rc;
    std::optional<long long> rcCmd;
    std::optional<StopLine> stop;

    bool isStoppedByTimeLimit() const;
    bool isStoppedBySignal() const;
};

// The reason as the survey writes it: a fixed first line ("Partition not
// surveyed, reason: " or "Unable to get File From Partition : "), for a
// client run "RELAY Failed." or "Partition Failed.", then the remote
// action's return codes one per line ("[     Rc] = 4").
FailureReason parseFailureReason(std::string const& reason);

// True when the text starts as only the survey's default documents' reasons do.
bool isFailureReason(std::string const& reason);

} // namespace report
