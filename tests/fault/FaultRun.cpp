#include "FaultRun.h"

#include "Lines.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <ctime>
#include <filesystem>

namespace {

namespace fs = std::filesystem;

constexpr char const* gc_ConsoleTools[] = {"/opt/vtc/bin/lspartition", "/opt/lsvtc/bin/lsvtc",
                                           "/usr/bin/runact-api"};
constexpr char gc_TraceFileName[] = "quorvexPYLON_VPD_Survey_ClientPartition.Trace";
constexpr char gc_TmpListing[] = "tmp-listing";
constexpr char gc_QuorvexListing[] = "quorvex-listing";
constexpr char gc_PeakMemory[] = "peak-kib";

// Run inside the sandbox as: sh -c <this> fault <tmp listing> <quorvex
// listing> <tool command...>. The listings are opened before the prelude,
// which may hide the run's folder (a new /tmp), and closed for the tool.
constexpr char gc_CommandHead[] = "exec 3>\"$1\" 4>\"$2\" || exit 125\n"
                                  "shift 2\n";
constexpr char gc_CommandTail[] = "\n\"$@\" 3>&- 4>&-\n"
                                  "status=$?\n"
                                  "ls -A /tmp >&3\n"
                                  "ls -A /var/adm/quorvex >&4\n"
                                  "exit $status\n";

void u_skip(std::string const& reason) {
    GTEST_SKIP() << reason;
}

} // namespace

bool FaultRun::ranInSandbox(QuorvexTest::CommandResult const& result) {
    if (result.exitStatus != QuorvexTest::gc_SandboxUnavailable) {
        return true;
    }
    u_skip(result.stderrText);
    return false;
}

FaultRun::FaultRun(std::string const& scenarioText) : _console(scenarioText) {}

FaultRun::FaultRun(QuorvexTest::ScenarioFile const& scenario) : _console(scenario) {}

std::string FaultRun::file(std::string const& name) const {
    return _console.directory() + "/" + name;
}

void FaultRun::removeTool(std::string const& toolPath) {
    _removedTools.push_back(toolPath);
}

void FaultRun::replaceTool(std::string const& toolPath, std::string const& script) {
    std::string const scriptPath = file("tool-" + fs::path(toolPath).filename().string());
    QuorvexTest::writeFile(scriptPath, script);
    fs::permissions(scriptPath, fs::perms::owner_all | fs::perms::group_read |
                                    fs::perms::group_exec | fs::perms::others_read |
                                    fs::perms::others_exec);
    _replacedTools[toolPath] = scriptPath;
}

void FaultRun::addSandboxOptions(std::vector<std::string> const& options) {
    _sandboxOptions.insert(_sandboxOptions.end(), options.begin(), options.end());
}

void FaultRun::setPrelude(std::string const& shellText) {
    _prelude = shellText;
}

void FaultRun::runToolCopiedTo(std::string const& folder) {
    _toolCopyFolder = folder;
}

void FaultRun::measurePeakMemory() {
    _measurePeakMemory = true;
}

QuorvexTest::CommandResult FaultRun::run(std::string const& identity) {
    std::vector<std::string> argv{QuorvexTest::sandboxPath()};
    for (std::vector<std::string> const& part :
         {_toolPlacement(), _resultFolders(), _sandboxOptions}) {
        argv.insert(argv.end(), part.begin(), part.end());
    }
    argv.emplace_back("--");
    std::vector<std::string> const command = _command(identity);
    argv.insert(argv.end(), command.begin(), command.end());
    // Another run made since may have pointed the simulator elsewhere.
    ::setenv("PYLON_SIM_SCENARIO", _console.scenarioPath().c_str(), 1);
    ::setenv("PYLON_SIM_LOG", _console.logPath().c_str(), 1);
    _first = static_cast<long>(std::time(nullptr));
    QuorvexTest::CommandResult result = QuorvexTest::runCommand(argv);
    _last = static_cast<long>(std::time(nullptr));
    return result;
}

std::string const& FaultRun::vpdFolder() const {
    return _vpdFolder.path();
}

std::vector<std::string> FaultRun::vpdFiles() const {
    return QuorvexTest::listFolder(_vpdFolder.path());
}

std::string FaultRun::vpdFile(std::string const& name) const {
    return QuorvexTest::normaliseTimeStamps(QuorvexTest::readFile(_vpdFolder.file(name)), _first,
                                            _last);
}

bool FaultRun::hasTrace() const {
    return QuorvexTest::fileExists(_traceFolder.file(gc_TraceFileName));
}

std::string FaultRun::trace() const {
    return QuorvexTest::normaliseTemporaryNames(
        QuorvexTest::readFile(_traceFolder.file(gc_TraceFileName)),
        QuorvexTest::TemporaryNames::Numbered);
}

std::string FaultRun::calls() const {
    return _console.logText();
}

std::vector<std::string> FaultRun::leftInTmp() const {
    fs::path const inTmp = fs::path(_console.directory()).lexically_relative("/tmp");
    std::string const runFolder = inTmp.empty() ? "" : inTmp.begin()->string();
    std::vector<std::string> left = _readListing(gc_TmpListing);
    left.erase(std::remove(left.begin(), left.end(), runFolder), left.end());
    return QuorvexTest::withoutNamesKeptInTmp(left);
}

std::vector<std::string> FaultRun::quorvexFolders() const {
    return _readListing(gc_QuorvexListing);
}

long FaultRun::peakMemoryKiB() const {
    std::vector<std::string> const lines =
        QuorvexTest::linesOf(QuorvexTest::readFile(file(gc_PeakMemory)));
    return lines.empty() ? -1 : std::stol(lines.back());
}

// The simulator at every console tool path, or only at those not removed;
// then the replacing scripts, which the sandbox binds last.
std::vector<std::string> FaultRun::_toolPlacement() const {
    std::vector<std::string> options;
    std::string const simulator = QuorvexTest::simulatorPath();
    if (_removedTools.empty()) {
        options = {"--sim", simulator};
    }
    for (char const* tool : gc_ConsoleTools) {
        if (!_removedTools.empty() && !QuorvexTest::contains(_removedTools, tool)) {
            options.insert(options.end(), {"--bind", simulator + ":" + tool});
        }
    }
    for (auto const& replaced : _replacedTools) {
        options.insert(options.end(), {"--bind", replaced.second + ":" + replaced.first});
    }
    options.insert(options.end(), {"--bind", _console.directory() + ":" + _console.directory()});
    return options;
}

std::vector<std::string> FaultRun::_resultFolders() const {
    std::vector<std::string> options;
    if (!QuorvexTest::contains(_sandboxOptions, "--no-vpd-dir")) {
        options.insert(options.end(), {"--vpd", _vpdFolder.path()});
    }
    if (!QuorvexTest::contains(_sandboxOptions, "--no-trace-dir")) {
        options.insert(options.end(), {"--trace", _traceFolder.path()});
    }
    return options;
}

std::vector<std::string> FaultRun::_command(std::string const& identity) const {
    std::vector<std::string> command{"/bin/sh",
                                     "-c",
                                     gc_CommandHead + _toolCopying() + _prelude + gc_CommandTail,
                                     "fault",
                                     file(gc_TmpListing),
                                     file(gc_QuorvexListing)};
    if (_measurePeakMemory) {
        command.insert(command.end(),
                       {"/usr/bin/time", "-q", "-f", "%M", "-o", file(gc_PeakMemory)});
    }
    command.insert(command.end(), {"timeout", "--kill-after=5", std::to_string(gc_TimeLimit),
                                   _toolPath(), "-c", identity});
    return command;
}

// The shell line that copies the tool to its folder, or nothing.
std::string FaultRun::_toolCopying() const {
    if (_toolCopyFolder.empty()) {
        return "";
    }
    return "cp '" + std::string(QUORVEX_SURVEY_TOOL) + "' '" + _toolCopyFolder + "/' || exit 125\n";
}

std::string FaultRun::_toolPath() const {
    if (_toolCopyFolder.empty()) {
        return QUORVEX_SURVEY_TOOL;
    }
    return _toolCopyFolder + "/" + fs::path(QUORVEX_SURVEY_TOOL).filename().string();
}

std::vector<std::string> FaultRun::_readListing(std::string const& name) const {
    return QuorvexTest::fileExists(file(name))
               ? QuorvexTest::linesOf(QuorvexTest::readFile(file(name)))
               : std::vector<std::string>{};
}
