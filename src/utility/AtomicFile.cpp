#include "utility/AtomicFile.h"

#include "utility/FileText.h"
#include "utility/SystemError.h"

#include <cerrno>
#include <cstdio>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>
#include <vector>

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

void flushFolderToDisk(std::string const& folder) {
    int const descriptor = ::open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (descriptor < 0) {
        throw SystemError(gc_Operation, folder, errno);
    }
    int const error = ::fsync(descriptor) == 0 ? 0 : errno;
    ::close(descriptor);
    if (error != 0 && error != EINVAL) {
        throw SystemError(gc_Operation, folder, error);
    }
}

void writeFileAtomically(std::string const& path, std::string const& text) {
    // The file gets the mode any file written in place would get, as the
    // survey tool's files do.
    writeFileAtomically(path, text, newFileMode());
}

void writeFileAtomically(std::string const& path, std::string const& text, mode_t mode) {
    std::string const pattern = folderOf(path) + "/." + baseNameOf(path) + ".XXXXXX";
    std::vector<char> temporary(pattern.begin(), pattern.end());
    temporary.push_back('\0');
    int const descriptor = ::mkostemp(temporary.data(), O_CLOEXEC);
    if (descriptor < 0) {
        throw SystemError(gc_Operation, path, errno);
    }
    // mkstemp makes the file readable by its owner only.
    ::fchmod(descriptor, mode);
    bool const complete = writeAll(descriptor, text) && ::fsync(descriptor) == 0;
    int const error = errno;
    bool const closed = ::close(descriptor) == 0;
    if (!complete || !closed || std::rename(temporary.data(), path.c_str()) != 0) {
        int const reported = complete ? errno : error;
        ::unlink(temporary.data());
        throw SystemError(gc_Operation, path, reported);
    }
    // The new file is in place, but may not outlast a crash: still a file
    // not written for good.
    try {
        flushFolderToDisk(folderOf(path));
    } catch (SystemError const& failure) {
        throw SystemError(gc_Operation, path, failure.errorNumber());
    }
}

} // namespace util
