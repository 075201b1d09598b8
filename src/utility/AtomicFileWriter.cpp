#include "utility/AtomicFileWriter.h"

#include "utility/AtomicFile.h"
#include "utility/FileText.h"
#include "utility/SystemError.h"

#include <cerrno>
#include <cstdio>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>
#include <utility>

namespace util {

namespace {

// The temporary file is the writer's own affair: whichever step fails, what
// failed is writing path.
constexpr char gc_Operation[] = "write";

std::string folderOf(std::string const& path) {
    std::string::size_type const slash = path.rfind('/');
    if (slash == std::string::npos) {
        return ".";
    }
    return slash == 0 ? "/" : path.substr(0, slash);
}

std::string baseNameOf(std::string const& path) {
    std::string::size_type const slash = path.rfind('/');
    return slash == std::string::npos ? path : path.substr(slash + 1);
}

mode_t newFileMode() {
    mode_t const mask = ::umask(0);
    ::umask(mask);
    return static_cast<mode_t>(0666 & ~mask);
}

} // namespace

AtomicFileWriter::AtomicFileWriter(std::string path)
    : AtomicFileWriter(std::move(path), newFileMode()) {}

AtomicFileWriter::AtomicFileWriter(std::string path, mode_t mode) : _path(std::move(path)) {
    // The name is whole before the file exists: nothing can fail between
    // making the file and knowing what to remove.
    _temporary = folderOf(_path) + "/." + baseNameOf(_path) + ".XXXXXX";
    _descriptor = ::mkostemp(_temporary.data(), O_CLOEXEC);
    if (_descriptor < 0) {
        throw SystemError(gc_Operation, _path, errno);
    }
    // mkstemp makes the file readable by its owner only.
    ::fchmod(_descriptor, mode);
}

AtomicFileWriter::~AtomicFileWriter() {
    if (_descriptor >= 0) {
        ::close(_descriptor);
        ::unlink(_temporary.c_str());
    }
}

void AtomicFileWriter::append(std::string const& text) {
    if (!writeAll(_descriptor, text)) {
        _fail(errno);
    }
}

void AtomicFileWriter::commit() {
    if (::fsync(_descriptor) != 0) {
        _fail(errno);
    }
    int const descriptor = std::exchange(_descriptor, -1);
    if (::close(descriptor) != 0 || std::rename(_temporary.c_str(), _path.c_str()) != 0) {
        int const error = errno;
        ::unlink(_temporary.c_str());
        throw SystemError(gc_Operation, _path, error);
    }
    // The new file is in place, but may not outlast a crash: still a file
    // not written for good.
    try {
        flushFolderToDisk(folderOf(_path));
    } catch (SystemError const& failure) {
        throw SystemError(gc_Operation, _path, failure.errorNumber());
    }
}

void AtomicFileWriter::_fail(int error) {
    ::close(std::exchange(_descriptor, -1));
    ::unlink(_temporary.c_str());
    throw SystemError(gc_Operation, _path, error);
}

} // namespace util
