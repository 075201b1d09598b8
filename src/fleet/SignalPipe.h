#pragma once

#include <optional>
#include <string>

namespace fleet {

// SIGINT and SIGTERM turned into bytes on a pipe that the run's poll loop
// watches, so the run reacts to them between its steps and never inside one.

// Makes the pipe and handles both signals through it. What failed, with
// errno's text, when it could not ("cannot create the signal pipe: Too many
// open files"); the signals then keep their default action.
[[nodiscard]] std::optional<std::string> installSignalPipe();
// The pipe's reading end, -1 while there is none.
int signalPipeDescriptor();
// The first signal received so far, 0 when none; drains the pipe.
int takeSignal();
// "SIGTERM" for SIGTERM, "SIGINT" for the other signal the run handles.
char const* signalName(int signalNumber);

} // namespace fleet
