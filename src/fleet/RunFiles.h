#pragma once

#include <optional>
#include <string>

namespace Fleet {

// Where a run puts each machine's files: the status file the single-machine
// tool writes, and a trace per machine named after the tool's one trace with
// the identity before ".Trace", so that no machine's trace replaces another's.
// Files that readers pick up are written under a temporary name in the same
// folder and renamed, so a reader never sees half of one.
class RunFiles {
public:
    static std::string statusFile(std::string const& identity);
    static std::string traceFile(std::string const& identity);
    // The temporary piece of a machine's trace that the unit of work running
    // in one slot writes. The slot's next unit of the machine writes over it,
    // so a run creates at most one piece file per slot and machine rather than
    // one per partition.
    static std::string tracePiece(std::string const& identity, std::size_t slot);

    // Writes text to path through a temporary name; false when it could not.
    static bool writeAtomically(std::string const& path, std::string const& text);
    // What a piece holds, nothing when it does not exist; the piece is left
    // empty for the slot's next unit.
    static std::optional<std::string> takePiece(std::string const& piece);
};

} // namespace Fleet
