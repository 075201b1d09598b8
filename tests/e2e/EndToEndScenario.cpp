#include "EndToEndScenario.h"

#include "Lines.h"

#include <algorithm>
#include <cstdlib>
#include <ctime>
#include <filesystem>
#include <sstream>

namespace {

constexpr char gc_ScenarioFolder[] = QUORVEX_E2E_SCENARIOS;
constexpr char gc_TraceFileName[] = "quorvexPYLON_VPD_Survey_ClientPartition.Trace";
constexpr char gc_InvocationLog[] = "invocations.log";
constexpr char gc_TmpListing[] = "tmp-listing";

std::string u_read_Optional(std::string const& path) {
    return QuorvexTest::fileExists(path) ? QuorvexTest::readFile(path) : std::string();
}

// The lines of a file, each without its line end; none for a missing file.
std::vector<std::string> u_read_Lines(std::string const& path) {
    return QuorvexTest::linesOf(u_read_Optional(path));
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

} // namespace

std::vector<std::string> EndToEndScenario::list() {
    return QuorvexTest::listFolder(gc_ScenarioFolder);
}

std::string EndToEndScenario::testName(::testing::TestParamInfo<std::string> const& info) {
    std::string name = info.param;
    std::replace(name.begin(), name.end(), '-', '_');
    return name;
}

EndToEndScenario::EndToEndScenario(std::string const& name) : _name(name) {}

std::string EndToEndScenario::probeFile(std::string const& name) const {
    return _probeFolder.file(name);
}

QuorvexTest::CommandResult EndToEndScenario::run(std::vector<std::string> const& tool) {
    _placeEarlierFiles();
    ConsoleEnvironment const console(_consoleScenario(), probeFile(gc_InvocationLog));
    _first = static_cast<long>(std::time(nullptr));
    QuorvexTest::CommandResult result =
        QuorvexTest::runInSandbox(_sandboxOptions(), _command(tool));
    _last = static_cast<long>(std::time(nullptr));
    return result;
}

void EndToEndScenario::expectExpectedOutcome(QuorvexTest::CommandResult const& result) const {
    EXPECT_TRUE(QuorvexTest::matchesExpectedFile(std::to_string(result.exitStatus) + "\n",
                                                 _scenarioFile("expected/exit-status")));
    EXPECT_TRUE(
        QuorvexTest::matchesExpectedFile(result.stdoutText, _scenarioFile("expected/stdout")));
    EXPECT_TRUE(
        QuorvexTest::matchesExpectedFile(result.stderrText, _scenarioFile("expected/stderr")));
    _expectVPDFolder();
    _expectTrace();
    _expectCalls();
    ASSERT_TRUE(QuorvexTest::fileExists(probeFile(gc_TmpListing))) << "the run did not finish";
    EXPECT_EQ(_leftInTmp(), std::vector<std::string>{}) << "files left in /tmp";
}

std::string EndToEndScenario::_scenarioFile(std::string const& name) const {
    return std::string(gc_ScenarioFolder) + "/" + _name + "/" + name;
}

std::string EndToEndScenario::_consoleScenario() const {
    std::vector<std::string> const shipped = u_read_Lines(_scenarioFile("shipped-console"));
    return shipped.empty() ? _scenarioFile("console.scn")
                           : QuorvexTest::shippedScenario(shipped.front());
}

void EndToEndScenario::_placeEarlierFiles() const {
    std::string const before = _scenarioFile("before/VPD");
    std::string const beforePrefix = before + "/";
    for (std::string const& name : QuorvexTest::listFolder(before)) {
        QuorvexTest::writeFile(_vpdFolder.file(name), QuorvexTest::readFile(beforePrefix + name));
    }
}

// The scenario's own sandbox options, then the bound result folders unless
// the scenario leaves them missing.
std::vector<std::string> EndToEndScenario::_sandboxOptions() const {
    std::vector<std::string> options = u_read_Lines(_scenarioFile("sandbox-options"));
    if (!QuorvexTest::contains(options, "--no-vpd-dir")) {
        options.insert(options.end(), {"--vpd", _vpdFolder.path()});
    }
    if (!QuorvexTest::contains(options, "--no-trace-dir")) {
        options.insert(options.end(), {"--trace", _traceFolder.path()});
    }
    return options;
}

// The tool with the scenario's arguments, followed by a listing of what is
// left in /tmp.
std::vector<std::string> EndToEndScenario::_command(std::vector<std::string> const& tool) const {
    std::vector<std::string> command{"/bin/sh", "-c",
                                     "\"$@\"; status=$?; ls -A /tmp > '" +
                                         probeFile(gc_TmpListing) + "'; exit $status",
                                     "survey"};
    command.insert(command.end(), tool.begin(), tool.end());
    std::vector<std::string> const arguments = u_read_Lines(_scenarioFile("arguments"));
    command.insert(command.end(), arguments.begin(), arguments.end());
    return command;
}

void EndToEndScenario::_expectVPDFolder() const {
    std::string const expectedFolder = _scenarioFile("expected/VPD");
    std::vector<std::string> const names = QuorvexTest::listFolder(_vpdFolder.path());
    EXPECT_EQ(names, QuorvexTest::listFolder(expectedFolder)) << "files in the VPD folder";
    std::string const expectedPrefix = expectedFolder + "/";
    for (std::string const& name : names) {
        EXPECT_TRUE(QuorvexTest::matchesExpectedFile(
            QuorvexTest::normaliseTimeStamps(QuorvexTest::readFile(_vpdFolder.file(name)), _first,
                                             _last),
            expectedPrefix + name))
            << "VPD file " << name;
    }
}

void EndToEndScenario::_expectTrace() const {
    std::string const expectedPath = _scenarioFile("expected/trace");
    std::vector<std::string> const expectedNames = QuorvexTest::fileExists(expectedPath)
                                                       ? std::vector<std::string>{gc_TraceFileName}
                                                       : std::vector<std::string>{};
    std::vector<std::string> const names = QuorvexTest::listFolder(_traceFolder.path());
    ASSERT_EQ(names, expectedNames) << "files in the trace folder";
    if (!names.empty()) {
        EXPECT_TRUE(QuorvexTest::matchesExpectedFile(
            QuorvexTest::normaliseTemporaryNames(
                QuorvexTest::readFile(_traceFolder.file(gc_TraceFileName)),
                QuorvexTest::TemporaryNames::Numbered),
            expectedPath));
    }
}

// A scenario without an expected calls file expects the console to receive
// no command at all.
void EndToEndScenario::_expectCalls() const {
    std::string const calls = u_read_Optional(probeFile(gc_InvocationLog));
    std::string const expectedPath = _scenarioFile("expected/calls");
    if (calls.empty() && !QuorvexTest::fileExists(expectedPath)) {
        return;
    }
    EXPECT_TRUE(QuorvexTest::matchesExpectedFile(calls, expectedPath))
        << "command lines the console received";
}

// What the run left in /tmp, apart from the probe folder that the sandbox
// makes visible there (the top one when it lies deeper in /tmp).
std::vector<std::string> EndToEndScenario::_leftInTmp() const {
    std::filesystem::path const inTmp =
        std::filesystem::path(_probeFolder.path()).lexically_relative("/tmp");
    std::string const probeName = inTmp.empty() ? "" : inTmp.begin()->string();
    std::vector<std::string> left = u_read_Lines(probeFile(gc_TmpListing));
    left.erase(std::remove(left.begin(), left.end(), probeName), left.end());
    return QuorvexTest::withoutNamesKeptInTmp(left);
}
