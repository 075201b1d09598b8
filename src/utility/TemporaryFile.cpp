#include "utility/TemporaryFile.h"

#include <cstdio>
#include <cstdlib>
#include <unistd.h>
#include <utility>

namespace Utility {

namespace {

// mkstemp replaces these six characters with unique ones.
constexpr char gc_UniqueSuffix[] = ".XXXXXX";

} // namespace

TemporaryFile::Observer TemporaryFile::ms_Observer = nullptr;

TemporaryFile::TemporaryFile(std::string const& baseFileName)
    : _baseFileName(baseFileName), _actualFileName() {
    // mkstemp writes the generated name into its argument.
    std::string name = _baseFileName + gc_UniqueSuffix;
    int const descriptor = ::mkstemp(name.data());
    if (descriptor < 0) {
        return;
    }
    ::close(descriptor);
    _actualFileName = std::move(name);
    _valid = true;
    if (ms_Observer != nullptr) {
        ms_Observer(_actualFileName, true);
    }
}

bool TemporaryFile::isValid() const {
    return _valid;
}

std::string TemporaryFile::get_ActualFileName() const {
    return _get_ActualFileName();
}

std::string const& TemporaryFile::_get_ActualFileName() const {
    return _actualFileName;
}

std::string TemporaryFile::get_BaseFileName() const {
    return _baseFileName;
}

bool TemporaryFile::remove() {
    // Told before the deletion: a name it was told of as deleted is never
    // one the observer may still remove.
    if (_valid && ms_Observer != nullptr) {
        ms_Observer(_actualFileName, false);
    }
    // The C library's remove: the member of the same name hides it here.
    if (!_valid || ::remove(_actualFileName.c_str()) != 0) {
        return false;
    }
    _actualFileName = "";
    _baseFileName = "";
    _valid = false;
    return true;
}

} // namespace Utility
