#pragma once

#include <optional>
#include <string>

namespace fleet {

// The signals that stop a run (SIGINT, SIGTERM, SIGHUP, SIGPIPE) turned into
// bytes on a pipe that the run's poll loop watches, so the run reacts to
// them between its steps and never inside one. SIGHUP (the terminal closed)
// and SIGPIPE (standard output or error read by nobody any more) stop the
// run as SIGTERM does, rather than killing it with its work half written.

// Makes the pipe and handles the signals through it. What failed, with
// errno's text, when it could not ("cannot create the signal pipe: Too many
// open files"); the signals then keep their default action.
[[nodiscard]] std::optional<std::string> installSignalPipe();
// The pipe's reading end, -1 while there is none.
int signalPipeDescriptor();
// The first signal received so far, 0 when none; drains the pipe.
int takeSignal();
// Holds the signals back from now on, for good: the run is finished, and a
// signal that comes later stays pending until the process exits, changing
// nothing. The last takeSignal() after this call is the run's final word.
void holdSignals();
// "SIGTERM" for SIGTERM, and so on for each signal the run handles.
char const* signalName(int signalNumber);

} // namespace fleet
