#pragma once

#include <sys/types.h>

#include <string>

namespace util {

// A file written in pieces through a temporary file in the same folder,
// renamed over its path by commit(), so that a reader sees the old file or
// the whole new one and a large file need not be held in memory to be
// written that way. commit() flushes the temporary file to the disk before
// the rename and the folder after it, as writeFileAtomically does. Every
// failure throws SystemError ("write", path, errno of the failing call);
// the temporary file is removed then, as it is when the writer goes without
// commit(), and the old file stays. When only the folder's flush fails, the
// new file is in place and the same error is thrown.
class AtomicFileWriter {
public:
    // Makes the temporary file. The file gets the mode any file written in
    // place would get under the process's umask, or mode whatever the umask.
    explicit AtomicFileWriter(std::string path);
    AtomicFileWriter(std::string path, mode_t mode);
    ~AtomicFileWriter();
    AtomicFileWriter(AtomicFileWriter const&) = delete;
    AtomicFileWriter& operator=(AtomicFileWriter const&) = delete;

    void append(std::string const& text);
    void commit();

private:
    std::string _path;
    std::string _temporary;
    int _descriptor = -1;

    [[noreturn]] void _fail(int error);
};

} // namespace util
