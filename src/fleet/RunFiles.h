#pragma once

#include <string>
#include <vector>

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
    // The temporary piece of a machine's trace written by one unit of work.
    static std::string tracePiece(std::string const& identity, std::size_t piece);

    // Writes text to path through a temporary name; false when it could not.
    static bool writeAtomically(std::string const& path, std::string const& text);
    // Joins the pieces that exist, in order, into target through a temporary
    // name, and removes them. Nothing is written when no piece exists.
    static void joinPieces(std::vector<std::string> const& pieces, std::string const& target);

private:
    static std::string _temporaryName(std::string const& path);
};

} // namespace Fleet
