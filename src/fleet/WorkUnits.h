#pragma once

#include "survey/PartitionOutcome.h"
#include "system/Partition.h"

#include <optional>
#include <string>
#include <vector>

namespace fleet {

// What each forked unit of work does, and how its result travels back to
// the parent. Each body runs in a child process of its own: the survey code
// keeps one trace and runs commands with system(), which only one unit may
// use per process.

// The identities of the managed machines of object type 0, in the listing's
// sorted order, each once. Traces the listing command into tracePath alone.
std::string listMachines(std::string const& tracePath);
std::vector<std::string> decodeMachines(std::string const& text);

// Opens the trace on tracePiece, writes the line the tool's trace starts
// with and lists the machine's partitions. Its result, like a survey's,
// also carries why the piece could not be written, if it could not.
std::string listPartitions(std::string const& identity, std::string const& tracePiece);
// nullopt when the result is cut short (the child did not finish).
std::optional<std::vector<Quorvex::System::Partition>> decodePartitions(std::string const& identity,
                                                                        std::string const& text);

// Opens the trace on tracePiece and surveys the partition; a remote action
// stopped by the parent gets the note the parent left.
std::string surveyPartition(Quorvex::System::Partition const& partition,
                            std::string const& tracePiece);
std::optional<Quorvex::PYLON::VPD::PartitionOutcome> decodeOutcome(std::string const& text);

// The errno of the failure that kept lines of a listing's or survey's trace
// from its piece (a full Trace folder), as its result carries it: 0 when
// every line reached the piece or the result is cut short.
int decodeTraceError(std::string const& text);

} // namespace fleet
