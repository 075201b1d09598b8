#include "TemporaryFiles.h"

#include "utility/FileText.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <sys/stat.h>

namespace QuorvexTest {

namespace {

constexpr char gc_ScratchVariable[] = "QUORVEX_TEST_SCRATCH";

std::string _temporaryBase() {
    char const* base = std::getenv("TMPDIR");
    return (base != nullptr && *base != '\0') ? base : "/tmp";
}

// A new folder named prefix + ".XXXXXX" in base; throws on failure.
std::string _makeFolder(std::string const& base, std::string const& prefix) {
    std::string pattern = base + "/" + prefix + ".XXXXXX";
    if (::mkdtemp(pattern.data()) == nullptr) {
        throw std::runtime_error("cannot create a temporary folder from " + pattern + ": " +
                                 std::strerror(errno));
    }
    return pattern;
}

} // namespace

TemporaryDirectory::TemporaryDirectory() : _path(_makeFolder(_temporaryBase(), "quorvex-test")) {}

TemporaryDirectory::~TemporaryDirectory() {
    std::error_code ignored;
    std::filesystem::remove_all(_path, ignored);
}

std::string const& TemporaryDirectory::path() const {
    return _path;
}

std::string TemporaryDirectory::file(std::string const& name) const {
    return _path + "/" + name;
}

std::string scratchDirectory() {
    char const* const inherited = std::getenv(gc_ScratchVariable);
    if (inherited != nullptr) {
        return inherited;
    }
    // In /tmp, like the shell command runner's own temporary files, whatever
    // $TMPDIR says.
    std::string folder = _makeFolder("/tmp", "quorvex-scratch");
    ::setenv(gc_ScratchVariable, folder.c_str(), 1);
    return folder;
}

void removeScratchDirectory() {
    char const* const current = std::getenv(gc_ScratchVariable);
    if (current == nullptr) {
        return;
    }
    std::error_code ignored;
    std::filesystem::remove_all(current, ignored);
    ::unsetenv(gc_ScratchVariable);
}

std::string readFile(std::string const& path) {
    return util::readWholeFile(path);
}

void writeFile(std::string const& path, std::string const& text) {
    std::ofstream out(path, std::ios::binary | std::ios::trunc);
    out << text;
    out.close();
    if (!out) {
        throw std::runtime_error("cannot write " + path);
    }
}

bool fileExists(std::string const& path) {
    struct stat info;
    return ::lstat(path.c_str(), &info) == 0;
}

std::vector<std::string> listFolder(std::string const& folder) {
    std::vector<std::string> names;
    std::error_code error;
    for (std::filesystem::directory_iterator entry(folder, error), end; !error && entry != end;
         entry.increment(error)) {
        names.push_back(entry->path().filename().string());
    }
    std::sort(names.begin(), names.end());
    return names;
}

void clearFolder(std::string const& folder) {
    for (std::string const& name : listFolder(folder)) {
        std::error_code ignored;
        std::filesystem::remove_all(std::filesystem::path(folder) / name, ignored);
    }
}

} // namespace QuorvexTest
