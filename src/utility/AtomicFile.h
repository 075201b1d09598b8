#pragma once

#include <sys/types.h>

#include <string>

namespace util {

// Writes text into path through a temporary file in the same folder that is
// renamed over path once complete, so a reader sees the old file or the new
// one, never part of it. The temporary file is flushed to the disk before
// the rename and the folder after it, so that a crash or a power loss also
// leaves the old file or the new one, never an empty one. The file has the
// mode a new file gets under the process's umask. Throws SystemError
// ("write", path, errno of the failing call) when the file cannot be
// written; the temporary file is removed then, and the old file stays. When
// only the folder's flush fails, the new file is in place and the same
// error is thrown: the rename may not outlast a crash.
void writeFileAtomically(std::string const& path, std::string const& text);

// The same, the file getting mode whatever the umask: for files that other
// users' programs read (a monitoring agent's textfile folder, say).
void writeFileAtomically(std::string const& path, std::string const& text, mode_t mode);

// Flushes folder's entries to the disk, so that a rename in it lasts.
// Throws SystemError ("write", folder, errno) when it cannot; a file system
// that keeps no folder to flush (EINVAL) is no failure.
void flushFolderToDisk(std::string const& folder);

} // namespace util
