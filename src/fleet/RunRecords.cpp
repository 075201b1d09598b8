#include "fleet/RunRecords.h"

#include "report/StatusText.h"
#include "survey/Survey_Files.h"

#include <sys/wait.h>

#include <cstdio>
#include <cstring>

namespace fleet {

namespace {

using Kind = Quorvex::PYLON::VPD::PartitionOutcomeKind;

// "SIGKILL", or "signal 70" for a number without a name.
std::string signalText(int signalNumber) {
    char const* const abbreviation = sigabbrev_np(signalNumber);
    return abbreviation != nullptr ? std::string("SIG") + abbreviation
                                   : "signal " + std::to_string(signalNumber);
}

std::string deathReason(WorkerDeath const& death) {
    std::string const how =
        WIFSIGNALED(death.waitStatus)
            ? "was killed by " + signalText(WTERMSIG(death.waitStatus))
            : "ended with exit status " + std::to_string(WEXITSTATUS(death.waitStatus));
    char seconds[32];
    std::snprintf(seconds, sizeof seconds, "%.1f", death.seconds);
    return "The survey's worker " + how + " after " + seconds + " s.\n";
}

void markInterrupted(PartitionRecord& record) {
    record.result.returnCode = report::gc_NotSurveyedCode;
    record.result.statusText = report::gc_InterruptedStatusText;
    record.outcome = report::Outcome::Interrupted;
}

} // namespace

void settlePartition(PartitionRecord& record, Quorvex::PYLON::VPD::PartitionOutcome result) {
    record.result = std::move(result);
    if (record.result.kind == Kind::Surveyed) {
        record.stop.reset();
    }
    if (record.stop && record.stop->bySignal) {
        markInterrupted(record);
    } else if (record.stop) {
        record.outcome = report::Outcome::TimedOut;
    } else {
        record.outcome = report::outcomeOf(record.result.kind);
    }
}

void settlePartition(PartitionRecord& record, WorkerDeath const& death) {
    Quorvex::PYLON::VPD::PartitionOutcome result;
    result.fileName = Quorvex::PYLON::VPD::get_LocalResultName(std::string(record.partition));
    result.returnCode = report::gc_NotSurveyedCode;
    result.statusText = report::gc_WorkerDiedStatusText;
    result.kind = Kind::ChannelFailure;
    result.reason = deathReason(death);
    record.result = std::move(result);
    record.outcome = report::Outcome::WorkerDied;
}

void settleUnfinished(PartitionRecord& record) {
    markInterrupted(record);
}

void settleUnfinished(std::vector<MachineRecord>& machines) {
    for (auto& machine : machines) {
        for (auto& record : machine.partitions) {
            if (!record.outcome) {
                settleUnfinished(record);
            }
        }
    }
}

} // namespace fleet
