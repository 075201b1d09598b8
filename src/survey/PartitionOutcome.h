#pragma once

#include <optional>
#include <string>

namespace Quorvex::PYLON::VPD {

// How the survey of one partition ended.
enum class PartitionOutcomeKind {
    Surveyed,
    Inactive,
    ChannelFailure,
    ClientFailure,
    FetchFailure,
};

// Everything one partition's survey leaves for the run's outputs: the three
// entries the tool prints and writes, and the details a run summary needs.
struct PartitionOutcome {
    // The local VPD file name relative to "/var/adm/quorvex/", "" when inactive.
    std::string fileName;
    // "0" surveyed, "8" not.
    std::string returnCode;
    // The text after " - VPD Survey - " in the status file line.
    std::string statusText;
    PartitionOutcomeKind kind = PartitionOutcomeKind::Inactive;
    // Rc of the last remote action run and RcCmd of the client run, when they gave one.
    std::optional<int> rc;
    std::optional<int> rcCmd;
    // The default document's reason; empty when no default document was made.
    std::string reason;
    // errno of the default document's failed open or write, 0 when it was
    // written or none was due. The tool stays silent about it; quorvex-survey
    // names the document on standard error.
    int documentError = 0;
};

} // namespace Quorvex::PYLON::VPD
