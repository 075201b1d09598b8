#include "fleet/RunRecords.h"

#include "report/StatusText.h"

namespace fleet {

namespace {

void markInterrupted(PartitionRecord& record) {
    record.result.returnCode = report::gc_NotSurveyedCode;
    record.result.statusText = report::gc_InterruptedStatusText;
    record.outcome = report::Outcome::Interrupted;
}

} // namespace

void settlePartition(PartitionRecord& record, Quorvex::PYLON::VPD::PartitionOutcome result) {
    record.result = std::move(result);
    if (record.stop && record.stop->bySignal) {
        markInterrupted(record);
    } else if (record.stop) {
        record.outcome = report::Outcome::TimedOut;
    } else {
        record.outcome = report::outcomeOf(record.result.kind);
    }
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
