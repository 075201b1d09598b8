#include "fleet/RunLock.h"

#include "fleet/SignalPipe.h"
#include "utility/FileText.h"

#include <fcntl.h>
#include <poll.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <utility>

namespace fleet {

namespace {

constexpr mode_t gc_LockFileMode = 0644;
// How long a waiting run sleeps between attempts unless a signal wakes it.
constexpr int gc_WaitMilliseconds = 200;

} // namespace

RunLock::RunLock(std::string path) : _path(std::move(path)) {}

RunLock::~RunLock() {
    if (_descriptor >= 0) {
        unlink(_path.c_str());
        close(_descriptor);
    }
}

// A read-only folder may still hold a file left by an earlier run; a flock
// needs no write access.
int RunLock::_open() const {
    int const descriptor =
        open(_path.c_str(), O_RDWR | O_CREAT | O_CLOEXEC | O_NOFOLLOW, gc_LockFileMode);
    if (descriptor >= 0) {
        return descriptor;
    }
    return open(_path.c_str(), O_RDONLY | O_CLOEXEC | O_NOFOLLOW);
}

bool RunLock::_isStillThePath(int descriptor) const {
    struct stat held {};
    struct stat named {};
    return fstat(descriptor, &held) == 0 && stat(_path.c_str(), &named) == 0 &&
           held.st_dev == named.st_dev && held.st_ino == named.st_ino;
}

// A holder that cannot be written (a read-only file) still locks.
void RunLock::_writeHolder(std::string const& holderText) const {
    if (ftruncate(_descriptor, 0) == 0) {
        static_cast<void>(util::writeAll(_descriptor, holderText + "\n"));
    }
}

bool RunLock::tryTake(std::string const& holderText) {
    while (true) {
        int const descriptor = _open();
        if (descriptor < 0) {
            return true;
        }
        if (flock(descriptor, LOCK_EX | LOCK_NB) != 0) {
            bool const isHeld = errno == EWOULDBLOCK;
            close(descriptor);
            // A file system without locks cannot tell runs apart either.
            return !isHeld;
        }
        if (_isStillThePath(descriptor)) {
            _descriptor = descriptor;
            _writeHolder(holderText);
            return true;
        }
        // The holder removed the file between our open and our lock.
        close(descriptor);
    }
}

bool RunLock::waitToTake(std::string const& holderText, int wakeDescriptor) {
    while (!tryTake(holderText)) {
        pollfd wake{wakeDescriptor, POLLIN, 0};
        static_cast<void>(poll(&wake, wakeDescriptor >= 0 ? 1 : 0, gc_WaitMilliseconds));
        if (takeSignal() != 0) {
            return false;
        }
    }
    return true;
}

std::string RunLock::holder() const {
    std::string text = util::readWholeFileOrEmpty(_path);
    while (!text.empty() && text.back() == '\n') {
        text.pop_back();
    }
    return text;
}

std::string const& RunLock::path() const {
    return _path;
}

} // namespace fleet
