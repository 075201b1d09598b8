#pragma once

#include <optional>
#include <string>

namespace Quorvex::PYLON::VPD {

// Every name of a file a survey run writes, reads back or asks the console
// for is built here, and nowhere else. The names are fixed: the console's
// scripts and importers find the files by them.
// Kept for the console's readers: see docs/compatibility.md#file-names

// The tool's name: the stem of its trace, status and result file names.
inline constexpr char gc_ProgramName[] = "quorvexPYLON_VPD_Survey_ClientPartition";

// The trace of the run: rewritten by every run.
std::string get_TraceFileName();

// The trace of one machine's survey in a run over several machines, which
// keeps every machine's trace: the run's trace name with "_" and the machine
// identity before its suffix.
std::string get_MachineTraceFileName(std::string const& machineIdentity);

// The same trace relative to the console folder (Trace/...), so that a reader
// of a copy of the console's folders finds it beside the copy's VPD folder.
std::string get_MachineTraceName(std::string const& machineIdentity);

// The status file of the machine named on the command line, the identity
// taken as given.
std::string get_StatusFileName(std::string const& machineIdentity);

// The machine identity of a status file's name as a folder lists it (without
// the folder): the reverse of get_StatusFileName. Nothing for a name that
// get_StatusFileName does not build.
std::optional<std::string> get_IdentityOfStatusFileName(std::string const& fileName);

// The name of a partition's VPD document on the console, relative to the
// folder that get_LocalResultPath resolves it against; partitionText is the
// partition's identity text (machine identity, "-", partition ID). It is
// what standard output shows and what the console's get-file action gets.
std::string get_LocalResultName(std::string const& partitionText);

// The partition text of a local result's name as a folder lists it (without
// the folder): the reverse of get_LocalResultName. Nothing for a name that
// get_LocalResultName does not build.
std::optional<std::string> get_PartitionTextOfResultName(std::string const& fileName);

// The absolute path of a local result name.
std::string get_LocalResultPath(std::string const& localResultName);

// The document the client writes on the partition, and fetched from there.
std::string get_RemoteResultName(std::string const& partitionText);

// The client's own output file on the partition.
std::string get_ClientOutputName(std::string const& partitionText);

} // namespace Quorvex::PYLON::VPD
