#pragma once

#include "fleet/CommandLine.h"

#include <string>
#include <vector>

namespace fleet {

// The run's outputs proven writable before any console command runs, so
// that a run which could not keep its results fails at once (exit status
// gc_ExitCannotCreate) rather than after hours of remote actions.
//
// The result folders (/var/adm/quorvex/VPD and Trace) must exist: like the
// single-machine tool, quorvex-survey never creates them (the package does).
// The folders of --summary, --report, --metrics and --junit are created
// when missing, all alike. Each folder is proven by creating and removing a file in it, which
// also holds for root and for read-only mounts.

// Why each output cannot be written ("cannot create /x/y: Not a directory",
// "cannot write into /var/adm/quorvex/VPD: Read-only file system"); empty
// when every one can.
std::vector<std::string> unwritableOutputs(Options const& options);

} // namespace fleet
