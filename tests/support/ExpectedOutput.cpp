#include "ExpectedOutput.h"

#include "TemporaryFiles.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <stdexcept>
#include <unistd.h>

namespace QuorvexTest {

namespace {

constexpr char gc_UpdateVariable[] = "QUORVEX_UPDATE_EXPECTED";
constexpr char gc_CIVariable[] = "CI";

bool _isSet(char const* variable) {
    char const* value = std::getenv(variable);
    return value != nullptr && *value != '\0';
}

bool _updateAsked() {
    char const* value = std::getenv(gc_UpdateVariable);
    return value != nullptr && std::string(value) == "1";
}

// Writes under a temporary name beside the file, then renames it, so that a
// reader never sees half a file.
void _replaceFile(std::string const& path, std::string const& text) {
    std::string const temporary = path + ".new." + std::to_string(::getpid());
    writeFile(temporary, text);
    if (std::rename(temporary.c_str(), path.c_str()) != 0) {
        std::remove(temporary.c_str());
        throw std::runtime_error("cannot rename " + temporary + " to " + path + ": " +
                                 std::strerror(errno));
    }
}

// Where two texts first differ, as "line N" of the expected text.
std::string _firstDifference(std::string const& expected, std::string const& actual) {
    auto const differ =
        std::mismatch(expected.begin(), expected.end(), actual.begin(), actual.end());
    auto const lineEnds = std::count(expected.begin(), differ.first, '\n');
    return "line " + std::to_string(lineEnds + 1);
}

::testing::AssertionResult _mismatch(std::string const& expected, std::string const& actual,
                                     std::string const& expectedPath) {
    return ::testing::AssertionFailure()
           << "the output differs from " << expectedPath << " from "
           << _firstDifference(expected, actual) << " on (set " << gc_UpdateVariable
           << "=1 to rewrite the file from this run)\n--- expected\n"
           << expected << "\n--- actual\n"
           << actual;
}

} // namespace

::testing::AssertionResult matchesExpectedFile(std::string const& actual,
                                               std::string const& expectedPath) {
    if (_updateAsked() && _isSet(gc_CIVariable)) {
        return ::testing::AssertionFailure()
               << gc_UpdateVariable << "=1 is refused because " << gc_CIVariable
               << " is set: expected-output files are never rewritten on a build server ("
               << expectedPath << ")";
    }
    std::string const expected = fileExists(expectedPath) ? readFile(expectedPath) : "";
    if (fileExists(expectedPath) && expected == actual) {
        return ::testing::AssertionSuccess();
    }
    if (!_updateAsked()) {
        if (!fileExists(expectedPath)) {
            return ::testing::AssertionFailure()
                   << "no expected-output file " << expectedPath << " (set " << gc_UpdateVariable
                   << "=1 to write it from this run)";
        }
        return _mismatch(expected, actual, expectedPath);
    }
    _replaceFile(expectedPath, actual);
    return ::testing::AssertionFailure()
           << "rewrote " << expectedPath << " from this run because " << gc_UpdateVariable
           << "=1; review the change and run again without it";
}

} // namespace QuorvexTest
