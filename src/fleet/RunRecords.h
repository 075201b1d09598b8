#pragma once

#include "report/ListingFailure.h"
#include "report/Outcome.h"
#include "report/RemoteAction.h"
#include "survey/PartitionOutcome.h"
#include "system/Partition.h"

#include <optional>
#include <string>
#include <vector>

namespace fleet {

// A remote action that the run stopped: which one, after how long, and
// whether a signal to the run (rather than the time limit) stopped it.
struct ActionStop {
    report::RemoteAction action = report::RemoteAction::RunCommand;
    double seconds = 0;
    bool bySignal = false;
};

// One listed partition and what became of it.
struct PartitionRecord {
    Quorvex::System::Partition partition;
    // What the survey of the partition left for the tool's outputs.
    Quorvex::PYLON::VPD::PartitionOutcome result;
    // How the partition ended; nullopt while its survey has not ended.
    std::optional<report::Outcome> outcome;
    std::optional<ActionStop> stop;
    std::optional<double> seconds;
    // The partition's block of the machine's trace, taken as soon as its
    // unit ends; none when the unit wrote nothing.
    std::optional<std::string> trace;
    // errno of the failure that kept some of those lines from the unit's
    // trace piece (a full Trace folder), 0 when none did.
    int traceError = 0;
};

// How a partition's worker ended when it died before telling how the survey
// ended: its wait status and how long it ran.
struct WorkerDeath {
    int waitStatus = 0;
    double seconds = 0;
};

// The one place a partition's outcome is decided: from what its survey left
// and whether the run stopped one of its actions, or from its worker's
// death. A survey that ended surveyed is surveyed, stop or not: the stop
// came after the answer and cost the partition nothing, so it is not
// recorded. Otherwise a partition an interruption stopped reads
// report::gc_InterruptedStatusText with code 8, and one the time limit
// stopped is timed out with the status text of the failure it ended as.
void settlePartition(PartitionRecord& record, Quorvex::PYLON::VPD::PartitionOutcome result);
// A partition whose worker died reads report::gc_WorkerDiedStatusText with
// code 8, names its default document and gives as reason what ended the
// worker, such as "The survey's worker was killed by SIGKILL after 3.2 s.".
void settlePartition(PartitionRecord& record, WorkerDeath const& death);
// A partition whose survey never ended because the run was interrupted.
void settleUnfinished(PartitionRecord& record);

// One machine of the run, its listing and its partitions in listing order.
struct MachineRecord {
    std::string identity;
    bool listed = false;
    // The lines the listing unit wrote to the trace.
    std::optional<std::string> listingTrace;
    // errno of the failure that kept some of them from the listing's trace
    // piece, 0 when none did.
    int listingTraceError = 0;
    // Set when the console's partition listing failed (an identity it does
    // not know, say), read from listingTrace, or when the time limit stopped
    // it. The machine then has no partitions, its status file reads as the
    // tool writes it ("No ACTIVE Partition Found."), and the summary, the
    // report and the recap say why. Unknown when the trace folder cannot be
    // written, since the failure is read from the machine's trace.
    std::optional<report::ListingFailure> listingFailure;
    std::vector<PartitionRecord> partitions;
};

// Settles every partition of the machines whose survey has not ended: the
// run was interrupted.
void settleUnfinished(std::vector<MachineRecord>& machines);

} // namespace fleet
