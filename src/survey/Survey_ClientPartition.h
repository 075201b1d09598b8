#pragma once

#include "pylon/ListOf_Partitions.h"
#include "survey/PartitionOutcome.h"
#include "system/Partition.h"

#include <functional>
#include <string>
#include <vector>

namespace Quorvex::PYLON::VPD {

// Surveys every partition of a listing in turn: runs the client survey on
// each active partition through the remote action channel and fetches its
// VPD document back, or writes a default document that carries the reason
// when either step fails. Never stops early and keeps no state.
class Survey_ClientPartition {
public:
    // Appends exactly one entry per listed partition, in listing order, to
    // each output: the local VPD file name (see Survey_Files.h; "" for an
    // inactive partition), the code ("0" surveyed, "8" not) and
    // the status text. The outputs are not cleared first.
    void operator()(::Quorvex::PYLON::ListOf_Partitions const& partitions,
                    ::std::vector<::std::string>& fileNames,
                    ::std::vector<::std::string>& returnCodes,
                    ::std::vector<::std::string>& statusTexts) const;

    // Gives the line that says why a remote action of the partition was
    // stopped from outside, or "" when none was.
    using StopNote = ::std::function<::std::string()>;

    // Surveys one partition as the loop does. A stop note, when it gives a
    // line for a partition that gets a default document, is appended to the
    // document's reason and written to the trace after the document.
    static PartitionOutcome survey_Partition(::Quorvex::System::Partition const& partition,
                                             StopNote const& stopNote = {});
};

} // namespace Quorvex::PYLON::VPD
