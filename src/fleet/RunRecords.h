#pragma once

#include "survey/PartitionOutcome.h"
#include "system/Partition.h"

#include <optional>
#include <string>
#include <vector>

namespace Fleet {

// A remote action that the run stopped: which one, and after how long.
struct ActionStop {
    std::string action;
    double seconds = 0;
};

// One listed partition and what became of it.
struct PartitionRecord {
    Quorvex::System::Partition partition;
    Quorvex::PYLON::VPD::PartitionOutcome outcome;
    bool finished = false;
    bool timedOut = false;
    bool interrupted = false;
    std::optional<ActionStop> stop;
    std::optional<double> seconds;
    // The partition's block of the machine's trace, taken as soon as its
    // unit ends; none when the unit wrote nothing.
    std::optional<std::string> trace;
};

// One machine of the run, its listing and its partitions in listing order.
struct MachineRecord {
    std::string identity;
    bool listed = false;
    // The lines the listing unit wrote to the trace.
    std::optional<std::string> listingTrace;
    std::vector<PartitionRecord> partitions;
};

} // namespace Fleet
