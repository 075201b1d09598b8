// Runs the built survey tool inside tools/sandbox against simulated consoles
// and compares everything a run leaves behind with the expected texts of its
// scenario folder (scenarios/<name>/):
//
//   console.scn       the simulated console (sim/README.md), or
//   shipped-console   the name of a scenario shipped in sim/scenarios/
//   arguments         the tool's arguments, one per line (an empty line is an
//                     empty argument)
//   sandbox-options   optional: further tools/sandbox options, one per line
//   before/VPD/       optional: files lying in the VPD folder before the run
//   expected/exit-status, expected/stdout, expected/stderr
//   expected/calls    the console's invocation log (absent: no call)
//   expected/trace    the trace file (absent: no trace file at all)
//   expected/VPD/     every file of the VPD folder after the run
//
// Time stamps of the run are written as 1700000000000 and temporary file
// names as /tmp/ShellCommand.aaaaaa, .bbbbbb and so on, in order of use.
// No file may be left in /tmp.

#include "survey/SurveyTest_Utility.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <ctime>
#include <filesystem>
#include <sstream>
#include <string>
#include <vector>

namespace {

constexpr char gc_ScenarioFolder[] = QUORVEX_E2E_SCENARIOS;
constexpr char gc_TraceFileName[] = "quorvexPYLON_VPD_Survey_ClientPartition.Trace";
constexpr int gc_SandboxUnavailable = 77;

std::string u_read_Optional(std::string const& path) {
    return QuorvexTest::fileExists(path) ? QuorvexTest::readFile(path) : std::string();
}

// The lines of a file, each without its line end; none for a missing file.
std::vector<std::string> u_read_Lines(std::string const& path) {
    std::vector<std::string> lines;
    std::istringstream text(u_read_Optional(path));
    std::string line;
    while (std::getline(text, line)) {
        lines.push_back(line);
    }
    return lines;
}

bool u_contains(std::vector<std::string> const& texts, std::string const& text) {
    return std::find(texts.begin(), texts.end(), text) != texts.end();
}

std::vector<std::string> u_list_Scenarios() {
    return SurveyTest_Utility::u_list_Folder(gc_ScenarioFolder);
}

// Points the simulated console at a scenario file and an invocation log for
// as long as the object lives; children inherit both.
class ConsoleEnvironment {
public:
    ConsoleEnvironment(std::string const& scenarioPath, std::string const& logPath) {
        ::setenv("PYLON_SIM_SCENARIO", scenarioPath.c_str(), 1);
        ::setenv("PYLON_SIM_LOG", logPath.c_str(), 1);
    }
    ~ConsoleEnvironment() {
        ::unsetenv("PYLON_SIM_SCENARIO");
        ::unsetenv("PYLON_SIM_LOG");
    }
    ConsoleEnvironment(ConsoleEnvironment const&) = delete;
    ConsoleEnvironment& operator=(ConsoleEnvironment const&) = delete;
};

class SurveyEndToEnd : public ::testing::TestWithParam<std::string> {
protected:
    std::string scenarioFile(std::string const& name) const {
        return std::string(gc_ScenarioFolder) + "/" + GetParam() + "/" + name;
    }

    std::string consoleScenario() const {
        std::vector<std::string> const shipped = u_read_Lines(scenarioFile("shipped-console"));
        return shipped.empty() ? scenarioFile("console.scn")
                               : QuorvexTest::shippedScenario(shipped.front());
    }

    void placeEarlierFiles(std::string const& vpdFolder) const {
        std::string const before = scenarioFile("before/VPD");
        for (std::string const& name : SurveyTest_Utility::u_list_Folder(before)) {
            QuorvexTest::writeFile(vpdFolder + "/" + name,
                                   QuorvexTest::readFile(before + "/" + name));
        }
    }

    // The sandbox options: the scenario's own, then the bound result folders
    // unless the scenario leaves them missing.
    std::vector<std::string> sandboxOptions(std::string const& vpdFolder,
                                            std::string const& traceFolder) const {
        std::vector<std::string> options = u_read_Lines(scenarioFile("sandbox-options"));
        if (!u_contains(options, "--no-vpd-dir")) {
            options.insert(options.end(), {"--vpd", vpdFolder});
        }
        if (!u_contains(options, "--no-trace-dir")) {
            options.insert(options.end(), {"--trace", traceFolder});
        }
        return options;
    }

    // The tool with the scenario's arguments, followed by a listing of what
    // is left in /tmp, written to listingPath.
    std::vector<std::string> command(std::string const& listingPath) const {
        std::vector<std::string> command{
            "/bin/sh", "-c", "\"$@\"; status=$?; ls -A /tmp > '" + listingPath + "'; exit $status",
            "survey", QUORVEX_SURVEY_TOOL};
        std::vector<std::string> const arguments = u_read_Lines(scenarioFile("arguments"));
        command.insert(command.end(), arguments.begin(), arguments.end());
        return command;
    }

    void expectFolder(std::string const& folder, std::string const& expectedFolder, long first,
                      long last) const {
        std::vector<std::string> const names = SurveyTest_Utility::u_list_Folder(folder);
        EXPECT_EQ(names, SurveyTest_Utility::u_list_Folder(expectedFolder))
            << "files in the VPD folder";
        for (std::string const& name : names) {
            std::string const expected = u_read_Optional(expectedFolder + "/" + name);
            EXPECT_EQ(SurveyTest_Utility::u_normalise_TimeStamps(
                          QuorvexTest::readFile(folder + "/" + name), first, last),
                      expected)
                << "VPD file " << name;
        }
    }

    void expectTrace(std::string const& traceFolder) const {
        std::string const expectedPath = scenarioFile("expected/trace");
        std::vector<std::string> const expectedNames =
            QuorvexTest::fileExists(expectedPath) ? std::vector<std::string>{gc_TraceFileName}
                                                  : std::vector<std::string>{};
        std::vector<std::string> const names = SurveyTest_Utility::u_list_Folder(traceFolder);
        ASSERT_EQ(names, expectedNames) << "files in the trace folder";
        if (!names.empty()) {
            EXPECT_EQ(SurveyTest_Utility::u_normalise_TemporaryNames(
                          QuorvexTest::readFile(traceFolder + "/" + gc_TraceFileName)),
                      QuorvexTest::readFile(expectedPath));
        }
    }

    // What the run left in /tmp, apart from the folder of this test that the
    // sandbox makes visible there (the top one when it lies deeper in /tmp).
    static std::vector<std::string> leftInTmp(std::string const& listingPath,
                                              std::string const& probeFolder) {
        std::filesystem::path const inTmp =
            std::filesystem::path(probeFolder).lexically_relative("/tmp");
        std::string const probeName = inTmp.empty() ? "" : inTmp.begin()->string();
        std::vector<std::string> left = u_read_Lines(listingPath);
        left.erase(std::remove(left.begin(), left.end(), probeName), left.end());
        return left;
    }
};

TEST_P(SurveyEndToEnd, RunLeavesExactlyTheExpectedOutputsAndFiles) {
    QuorvexTest::TemporaryDirectory const vpdFolder;
    QuorvexTest::TemporaryDirectory const traceFolder;
    QuorvexTest::TemporaryDirectory const probeFolder;
    placeEarlierFiles(vpdFolder.path());
    std::string const logPath = probeFolder.file("invocations.log");
    std::string const listingPath = probeFolder.file("tmp-listing");
    ConsoleEnvironment const console(consoleScenario(), logPath);

    long const first = static_cast<long>(std::time(nullptr));
    QuorvexTest::CommandResult const result = QuorvexTest::runInSandbox(
        sandboxOptions(vpdFolder.path(), traceFolder.path()), command(listingPath));
    long const last = static_cast<long>(std::time(nullptr));
    if (result.exitStatus == gc_SandboxUnavailable) {
        GTEST_SKIP() << result.stderrText;
    }

    EXPECT_EQ(std::to_string(result.exitStatus) + "\n",
              QuorvexTest::readFile(scenarioFile("expected/exit-status")));
    EXPECT_EQ(result.stdoutText, QuorvexTest::readFile(scenarioFile("expected/stdout")));
    EXPECT_EQ(result.stderrText, QuorvexTest::readFile(scenarioFile("expected/stderr")));
    expectFolder(vpdFolder.path(), scenarioFile("expected/VPD"), first, last);
    expectTrace(traceFolder.path());
    EXPECT_EQ(u_read_Optional(logPath), u_read_Optional(scenarioFile("expected/calls")))
        << "command lines the console received";
    ASSERT_TRUE(QuorvexTest::fileExists(listingPath)) << "the run did not finish";
    EXPECT_EQ(leftInTmp(listingPath, probeFolder.path()), std::vector<std::string>{})
        << "files left in /tmp";
}

std::string u_name_Test(::testing::TestParamInfo<std::string> const& info) {
    std::string name = info.param;
    std::replace(name.begin(), name.end(), '-', '_');
    return name;
}

INSTANTIATE_TEST_SUITE_P(Scenario, SurveyEndToEnd, ::testing::ValuesIn(u_list_Scenarios()),
                         u_name_Test);

} // namespace
