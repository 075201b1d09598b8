#pragma once

#include "fleet/RunRecords.h"

#include <optional>
#include <string>
#include <vector>

namespace fleet {

// What the single-machine tool prints and writes for one machine, made from
// the machine's records: its standard output and standard error block, its
// status file and its trace.
// Per partition with a document: its name on standard output and its code
// on standard error, each line flushed so that both streams interleave as
// they do when they go to one file; then the machine's overall code.
void printMachineBlock(MachineRecord const& machine);
// The status file's text: one line per partition, or the line that says
// none was listed.
std::string machineStatusText(MachineRecord const& machine);
std::vector<std::string> machineReturnCodes(MachineRecord const& machine);
// The trace: the listing's lines, then each partition's block in listing
// order, whichever unit ended first; nothing when no unit wrote any.
std::optional<std::string> machineTraceText(MachineRecord const& machine);

} // namespace fleet
