#include "utility/FileText.h"

#include "utility/SystemError.h"

#include <cerrno>
#include <fcntl.h>
#include <unistd.h>

namespace util {

namespace {

constexpr std::size_t gc_ReadBlock = 65536;

// Closes on every way out of readWholeFile; a failed close of a file only
// read loses nothing.
class ReadDescriptor {
public:
    explicit ReadDescriptor(std::string const& path)
        : _descriptor(::open(path.c_str(), O_RDONLY | O_CLOEXEC)) {}
    ~ReadDescriptor() {
        if (_descriptor >= 0) {
            ::close(_descriptor);
        }
    }
    ReadDescriptor(ReadDescriptor const&) = delete;
    ReadDescriptor& operator=(ReadDescriptor const&) = delete;

    int get() const { return _descriptor; }

private:
    int _descriptor;
};

} // namespace

bool writeAll(int descriptor, std::string const& text) {
    std::size_t written = 0;
    while (written < text.size()) {
        ssize_t const n = ::write(descriptor, text.data() + written, text.size() - written);
        if (n < 0 && errno == EINTR) {
            continue;
        }
        if (n < 0) {
            return false;
        }
        if (n == 0) {
            errno = EIO;
            return false;
        }
        written += static_cast<std::size_t>(n);
    }
    return true;
}

std::string readWholeFile(std::string const& path) {
    ReadDescriptor const file(path);
    if (file.get() < 0) {
        throw SystemError("read", path, errno);
    }
    std::string text;
    char block[gc_ReadBlock];
    while (true) {
        ssize_t const n = ::read(file.get(), block, sizeof block);
        if (n < 0 && errno == EINTR) {
            continue;
        }
        if (n < 0) {
            throw SystemError("read", path, errno);
        }
        if (n == 0) {
            return text;
        }
        text.append(block, static_cast<std::size_t>(n));
    }
}

std::string readWholeFileOrEmpty(std::string const& path) {
    try {
        return readWholeFile(path);
    } catch (SystemError const&) {
        return "";
    }
}

} // namespace util
