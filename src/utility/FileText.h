#pragma once

#include <string>

namespace util {

// Writes all of text to the descriptor, again after a short write or a
// signal. False when a write fails, errno then being that write's (EIO when
// the descriptor took nothing without an error). A descriptor names no path,
// so the caller, who knows what it writes, reports the failure: a writer of a
// file throws SystemError with the file's path, a forked child decides its
// exit.
[[nodiscard]] bool writeAll(int descriptor, std::string const& text);

// The exact bytes of the file at path, read with read() until its end, so
// that files of unknown size such as those under /proc read whole too.
// Throws SystemError ("read", path, errno) when the file cannot be opened or
// read.
std::string readWholeFile(std::string const& path);
// The same, for a file that may be gone by the time it is read (a process's
// /proc file, a survey file a run is replacing): such a file reads as empty.
std::string readWholeFileOrEmpty(std::string const& path);

} // namespace util
