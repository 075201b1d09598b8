#include "DifferentialCase.h"

#include "Lines.h"
#include "QuorvexTest.h"
#include "TextDifference.h"
#include "report/ListingFailure.h"
#include "utility/TextChecks.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <set>
#include <utility>

namespace FleetTest {

namespace {

constexpr char gc_Reference[] = "reference";
constexpr char gc_StatusSuffix[] = ".status";
constexpr char gc_NoPartitionLine[] = "No ACTIVE Partition Found.";
constexpr char gc_SurveyedEnding[] = " - VPD Survey - Ok";
constexpr char gc_MachineListingCall[] = "lsvtc\t-t0\n";

std::string sortedLines(std::string const& text) {
    std::vector<std::string> all = QuorvexTest::linesOf(text);
    std::sort(all.begin(), all.end());
    std::string joined;
    for (std::string const& line : all) {
        joined += line + "\n";
    }
    return joined;
}

std::string pathIn(std::string folder, std::string const& name) {
    folder += '/';
    folder += name;
    return folder;
}

std::string joinedLines(std::vector<std::string> const& texts) {
    std::string joined;
    for (std::string const& text : texts) {
        joined += text + "\n";
    }
    return joined;
}

} // namespace

DifferentialCase::DifferentialCase(std::string folder, long first, long last)
    : _folder(std::move(folder)), _first(first), _last(last) {}

std::string DifferentialCase::name() const {
    return std::filesystem::path(_folder).filename().string();
}

void DifferentialCase::expectSameAsReference(int jobs) const {
    std::string const run = "j" + std::to_string(jobs);
    if (!QuorvexTest::fileExists(_file(run, "exit-status"))) {
        ADD_FAILURE() << name() << " -j " << jobs << ": the run did not happen";
        return;
    }
    _expectEqual(run, "stdout", QuorvexTest::readFile(_file(gc_Reference, "stdout")),
                 QuorvexTest::readFile(_file(run, "stdout")));
    _expectEqual(run, "stderr", _expectedStderr(), QuorvexTest::readFile(_file(run, "stderr")));
    _expectEqual(run, "exit status", std::to_string(_expectedExitStatus()) + "\n",
                 QuorvexTest::readFile(_file(run, "exit-status")));
    _expectEqual(run, "console command lines (sorted)", _expectedCalls(),
                 sortedLines(QuorvexTest::readFile(_file(run, "calls"))));
    _expectEqual(run, "files left in /tmp", "", QuorvexTest::readFile(_file(run, "tmp")));
    _expectSameFolder(run, "VPD");
    _expectSameFolder(run, "Trace");
}

void DifferentialCase::expectRefusedUpFront(int jobs,
                                            std::vector<std::string> const& stderrTexts) const {
    std::string const run = "j" + std::to_string(jobs);
    if (!QuorvexTest::fileExists(_file(run, "exit-status"))) {
        ADD_FAILURE() << name() << " -j " << jobs << ": the run did not happen";
        return;
    }
    std::string const printed = QuorvexTest::readFile(_file(run, "stderr"));
    EXPECT_TRUE(QuorvexTest::contains(stderrTexts, printed))
        << name() << " " << run << ": " << printed;
    _expectEqual(run, "stdout", "", QuorvexTest::readFile(_file(run, "stdout")));
    _expectEqual(run, "exit status", "73\n", QuorvexTest::readFile(_file(run, "exit-status")));
    _expectEqual(run, "console command lines", "", QuorvexTest::readFile(_file(run, "calls")));
    _expectEqual(run, "files left in /tmp", "", QuorvexTest::readFile(_file(run, "tmp")));
    _expectEqual(run, "names in VPD", "", joinedLines(QuorvexTest::listFolder(_file(run, "VPD"))));
    _expectEqual(run, "names in Trace", "",
                 joinedLines(QuorvexTest::listFolder(_file(run, "Trace"))));
}

std::string DifferentialCase::_file(std::string const& run, std::string const& name) const {
    return _folder + "/" + run + "/" + name;
}

std::vector<std::string> DifferentialCase::_identities() const {
    return QuorvexTest::linesOf(QuorvexTest::readFile(_folder + "/identities"));
}

bool DifferentialCase::_surveysAll() const {
    return QuorvexTest::readFile(_folder + "/mode") == "all\n";
}

// The warnings for identities given more than once, once each, in the order
// of their first repetition, then the one-machine runs' texts.
std::string DifferentialCase::_expectedStderr() const {
    std::string warnings;
    std::set<std::string> seen;
    std::set<std::string> warned;
    for (std::string const& identity : _identities()) {
        if (!seen.insert(identity).second && warned.insert(identity).second) {
            warnings +=
                "quorvex-survey: warning: " + identity + " given more than once, surveyed once\n";
        }
    }
    return warnings + QuorvexTest::readFile(_file(gc_Reference, "stderr"));
}

// Whether the tool's trace of the machine whose status file this is holds a
// partition listing that failed.
bool DifferentialCase::_listingFailed(std::string const& statusFileName) const {
    std::string const traceName =
        statusFileName.substr(0, statusFileName.size() - std::string(gc_StatusSuffix).size()) +
        ".Trace";
    std::string const trace = _folder + "/" + gc_Reference + "/Trace/" + traceName;
    return QuorvexTest::fileExists(trace) &&
           report::listingFailureInTrace(QuorvexTest::readFile(trace)).has_value();
}

// The one-machine tool's rule over every listed partition of every machine:
// 0 all surveyed, 4 some, 8 none or none listed. For one machine that is the
// code the tool printed last; for several it is counted in the status files,
// where a machine the console could not list counts as not surveyed.
int DifferentialCase::_expectedExitStatus() const {
    std::vector<std::string> identities = _identities();
    std::sort(identities.begin(), identities.end());
    if (std::unique(identities.begin(), identities.end()) - identities.begin() == 1) {
        std::string const printed = QuorvexTest::readFile(_file(gc_Reference, "stderr"));
        return std::stoi(printed.substr(printed.rfind('\n') + 1));
    }
    std::size_t listed = 0;
    std::size_t surveyed = 0;
    std::string const vpd = _folder + "/" + gc_Reference + "/VPD";
    for (std::string const& fileName : QuorvexTest::listFolder(vpd)) {
        if (!util::endsWith(fileName, gc_StatusSuffix)) {
            continue;
        }
        for (std::string const& line :
             QuorvexTest::linesOf(QuorvexTest::readFile(pathIn(vpd, fileName)))) {
            listed += line == gc_NoPartitionLine ? 0 : 1;
            surveyed += util::endsWith(line, gc_SurveyedEnding) ? 1 : 0;
        }
        // A machine the console could not list counts as one not surveyed.
        listed += _listingFailed(fileName) ? 1 : 0;
    }
    if (surveyed == 0) {
        return 8;
    }
    return surveyed == listed ? 0 : 4;
}

std::string DifferentialCase::_expectedCalls() const {
    std::string const calls = QuorvexTest::readFile(_file(gc_Reference, "calls"));
    return sortedLines(_surveysAll() ? gc_MachineListingCall + calls : calls);
}

void DifferentialCase::_expectSameFolder(std::string const& run, std::string const& folder) const {
    std::string const expectedFolder = _file(gc_Reference, folder);
    std::string const actualFolder = _file(run, folder);
    std::vector<std::string> const names = QuorvexTest::listFolder(expectedFolder);
    _expectEqual(run, "names in " + folder, joinedLines(names),
                 joinedLines(QuorvexTest::listFolder(actualFolder)));
    for (std::string const& fileName : names) {
        std::string const actualPath = pathIn(actualFolder, fileName);
        if (QuorvexTest::fileExists(actualPath)) {
            _expectEqual(
                run, pathIn(folder, fileName),
                _normalised(folder, QuorvexTest::readFile(pathIn(expectedFolder, fileName))),
                _normalised(folder, QuorvexTest::readFile(actualPath)));
        }
    }
}

std::string DifferentialCase::_normalised(std::string const& folder,
                                          std::string const& text) const {
    return folder == "Trace"
               ? QuorvexTest::normaliseTemporaryNames(text, QuorvexTest::TemporaryNames::Numbered)
               : QuorvexTest::normaliseTimeStamps(text, _first, _last);
}

void DifferentialCase::_expectEqual(std::string const& run, std::string const& what,
                                    std::string const& expected, std::string const& actual) const {
    std::string const difference = QuorvexTest::firstDifference(expected, actual);
    if (!difference.empty()) {
        ADD_FAILURE() << name() << " " << run << ": " << what << ": " << difference;
    }
}

} // namespace FleetTest
