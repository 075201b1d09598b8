#pragma once

#include "report/RunSummary.h"

#include <nlohmann/json.hpp>

#include <string>

namespace report {

// The run summary of the survey runs whose files lie in vpdFolder (the
// console's /var/adm/quorvex/VPD): runs of the single-machine tool as well
// as of quorvex-survey.
//
// Each status file gives a machine and, line by line in listing order, each
// partition's host, IP and status text. The rest comes from the VPD
// documents named after the machine, matched to status lines by host name in
// the order of their partition IDs, and a document that names no host by the
// partition ID of its file name where that cannot be mistaken (see
// MachineDocuments): a default document gives the partition's ID, the
// reason, Rc and RcCmd, and whether the time limit or a signal stopped it; a
// fetched document gives the ID. What the files do not keep is unknown:
// active statuses, seconds, the options of the run, and the ID and document
// of a partition no document matches (an inactive one always). Machines come
// in the order of their identities; the run's times are those of the oldest
// and the newest file read. A machine without listed partitions whose trace
// of quorvex-survey lies beside the VPD folder gets the failure of its
// partition listing that the trace shows (an identity the console did not
// know); a listing the time limit stopped reads there as one that ended, so
// it is not told from files. Texts are made valid UTF-8. Throws
// util::SystemError when vpdFolder cannot be listed (missing, not a folder,
// unreadable).
RunSummary readRunSummaryFromFolder(std::string const& vpdFolder);

// The document of readRunSummaryFromFolder (docs/summary.schema.json).
nlohmann::ordered_json readSummaryFromFolder(std::string const& vpdFolder);

} // namespace report
