#include "utility/AtomicFile.h"

#include "utility/AtomicFileWriter.h"
#include "utility/SystemError.h"

#include <cerrno>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace util {

namespace {

// The temporary file is the writer's own affair: whichever step fails, what
// failed is writing path.
constexpr char gc_Operation[] = "write";

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
    AtomicFileWriter writer(path);
    writer.append(text);
    writer.commit();
}

void writeFileAtomically(std::string const& path, std::string const& text, mode_t mode) {
    AtomicFileWriter writer(path, mode);
    writer.append(text);
    writer.commit();
}

} // namespace util
