#pragma once

#include <optional>
#include <string>

namespace report {

// What a default document's reason says about a failed partition.
struct FailureReason {
    // "runCmdOnPartition" for a failed client run, "getFileFromPartition" for
    // a failed fetch; empty for a text the survey never writes as a reason.
    std::string action;
    // The Rc and RcCmd lines of the printed return codes, when numeric.
    std::optional<long long> rc;
    std::optional<long long> rcCmd;
    // The line "Stopped by the time limit of T s after S s." or
    // "Stopped by SIGINT after S s.": who stopped the action, and S.
    std::optional<std::string> stoppedBy;
    std::optional<double> stoppedAfterSeconds;
};

// The reason as the survey writes it: a fixed first line ("Partition not
// surveyed, reason: " or "Unable to get File From Partition : "), for a
// client run "RELAY Failed." or "Partition Failed.", then the remote
// action's return codes one per line ("[     Rc] = 4").
FailureReason parseFailureReason(std::string const& reason);

// True when the text starts as only the survey's default documents' reasons do.
bool isFailureReason(std::string const& reason);

} // namespace report
