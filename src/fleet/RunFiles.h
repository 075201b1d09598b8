#pragma once

#include <optional>
#include <string>

namespace fleet {

// Where a run puts each machine's files: the status file the single-machine
// tool writes, and a trace per machine named after the tool's one trace with
// the identity before ".Trace", so that no machine's trace replaces another's.
std::string statusFilePath(std::string const& identity);
std::string traceFilePath(std::string const& identity);
// The lock file that keeps a second run out of the same result folder
// (RunLock): in the folder of the status files, hidden by its leading dot.
std::string runLockPath();

// The temporary piece of a machine's trace that the unit of work running
// in one slot writes; the slot's next unit of the machine writes the same
// name once the run has taken the piece.
std::string tracePiecePath(std::string const& identity, std::size_t slot);

// What a piece holds, nothing when it does not exist or is no regular file
// (a link is not followed); the piece is removed, and the slot's next unit
// makes it anew.
std::optional<std::string> takeTracePiece(std::string const& piece);

// The folder of the machines' traces and their pieces.
std::string traceFolder();
// Removes the trace pieces in folder whose run has ended (no process has
// the PID in the piece's name any more): a run killed by SIGKILL may leave
// the piece of a unit that ended just before the kill. A run calls it once
// it holds the result folder, before any console command runs; the pieces
// of a live run are kept.
void removeTracePiecesOfEndedRuns(std::string const& folder);

} // namespace fleet
