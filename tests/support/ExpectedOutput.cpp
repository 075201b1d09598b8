#include "ExpectedOutput.h"

#include "TemporaryFiles.h"
#include "TextDifference.h"

#include "utility/AtomicFile.h"

#include <cstdlib>

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

::testing::AssertionResult _mismatch(std::string const& expected, std::string const& actual,
                                     std::string const& expectedPath) {
    return ::testing::AssertionFailure()
           << "the output differs from " << expectedPath << ": "
           << firstDifference(expected, actual) << " (set " << gc_UpdateVariable
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
    util::writeFileAtomically(expectedPath, actual);
    return ::testing::AssertionFailure()
           << "rewrote " << expectedPath << " from this run because " << gc_UpdateVariable
           << "=1; review the change and run again without it";
}

} // namespace QuorvexTest
