#pragma once
// The checks every fault run ends with, each returning what it found wrong
// (empty: nothing): temporary files left behind, and a summary, status files
// and documents that do not tell one story.

#include <string>
#include <vector>

namespace FleetFaultTest {

// The content the scenarios of the fault runs give every fetched document,
// so that a fetched document can be told from a default one.
extern char const gc_FetchedDocument[];

// /tmp/ShellCommand.* files, and temporary names (a leading dot, a trace
// piece) in the result folders and the given folder.
std::vector<std::string> temporaryFilesLeft(std::string const& workFolder);

// Each machine of the summary against its status file and documents: one
// status line per listed partition carrying the summary's status text, and
// for each partition an outcome, code, reason and document that agree.
std::vector<std::string> recordProblems(std::string const& summaryPath);

// The exit status against the summary's exit_status, interrupted and
// return_code.
std::vector<std::string> exitStatusProblems(std::string const& summaryPath, int exitStatus);

} // namespace FleetFaultTest
