#pragma once

#include "fleet/RunRecords.h"

#include <optional>
#include <string>
#include <vector>

namespace Fleet {

// What the single-machine tool prints and writes for one machine, made from
// the machine's records: its standard output and standard error block, its
// status file and its trace.
class MachineReport {
public:
    // Per partition with a document: its name on standard output and its code
    // on standard error, each line flushed so that both streams interleave as
    // they do when they go to one file; then the machine's overall code.
    static void print(MachineRecord const& machine);
    // The status file's text: one line per partition, or the line that says
    // none was listed.
    static std::string statusText(MachineRecord const& machine);
    static std::vector<std::string> returnCodes(MachineRecord const& machine);
    // The trace: the listing's lines, then each partition's block in listing
    // order, whichever unit ended first; nothing when no unit wrote any.
    static std::optional<std::string> traceText(MachineRecord const& machine);
};

} // namespace Fleet
