#pragma once

#include <string>

namespace util {

// Writes text into path through a temporary file in the same folder that is
// renamed over path once complete, so a reader sees the old file or the new
// one, never part of it. The file has the mode a new file gets under the
// process's umask. Throws SystemError ("write", path, errno of the failing
// call) when the file cannot be written; the temporary file is removed then.
void writeFileAtomically(std::string const& path, std::string const& text);

} // namespace util
