#pragma once
// Helpers shared by the tests: temporary folders, exact file contents, child
// commands with captured output, and the simulated console (pylon-sim) that a
// sandboxed test talks to through the fixed console tool paths.
//
// Tests registered with quorvex_add_gtest(... SANDBOX) run inside
// tools/sandbox: the console tools are the simulator, /var/adm/quorvex/VPD and
// /var/adm/quorvex/Trace are fresh empty folders and /tmp is private.

#include <string>
#include <vector>

namespace QuorvexTest {

// Absolute paths of the source tree, the sandbox runner, the simulator binary
// and a scenario shipped in sim/scenarios/.
std::string sourceRoot();
std::string sandboxPath();
std::string simulatorPath();
std::string shippedScenario(std::string const& fileName);

// True inside the namespace made by tools/sandbox for the test main.
bool isInsideSandbox();

// The sandbox binds the folders a command needs that lie under /tmp (this
// checkout, the working folder) into its private /tmp. These are the names
// such folders have directly in /tmp, empty when the checkout is elsewhere.
std::vector<std::string> namesKeptInTmp();
// names without those kept in /tmp by the sandbox.
std::vector<std::string> withoutNamesKeptInTmp(std::vector<std::string> names);

// A fresh folder under $TMPDIR (or /tmp), removed with all its content when
// the object goes away.
class TemporaryDirectory {
public:
    TemporaryDirectory();
    ~TemporaryDirectory();
    TemporaryDirectory(TemporaryDirectory const&) = delete;
    TemporaryDirectory& operator=(TemporaryDirectory const&) = delete;

    std::string const& path() const;
    // path() + "/" + name
    std::string file(std::string const& name) const;

private:
    std::string _path;
};

// The exact bytes of a file; throws std::runtime_error when it cannot be read.
std::string readFile(std::string const& path);
// Creates or truncates the file and writes the text as it is; throws
// std::runtime_error on failure.
void writeFile(std::string const& path, std::string const& text);
bool fileExists(std::string const& path);

struct CommandResult {
    int exitStatus = -1;    // exit code, or 128 + signal number
    std::string stdoutText; // exact bytes
    std::string stderrText; // exact bytes
};

// Runs argv[0] (searched in PATH when it has no "/") with the given
// arguments, stdin from /dev/null, and waits for it.
CommandResult runCommand(std::vector<std::string> const& argv);
// runCommand({"/bin/sh", "-c", commandLine})
CommandResult runShell(std::string const& commandLine);
// Runs a command in a sandbox of its own, with the simulator installed and
// extra sandbox options such as "--readonly-tmp" (see tools/sandbox --help).
// Works on the host and, nested, inside a sandboxed test; the folders of the
// current scenario and invocation log (see SimulatedConsole) are bound into
// the new sandbox at the same paths.
CommandResult runInSandbox(std::vector<std::string> const& sandboxOptions,
                           std::vector<std::string> const& command);

// Names an existing scenario file, such as shippedScenario("demo.scn").
struct ScenarioFile {
    std::string path;
};

// One call of a console tool as the simulator logged it: the tool's base name
// followed by every argument it received.
using Invocation = std::vector<std::string>;

// Points the simulator at a scenario and a fresh, empty invocation log for as
// long as the object lives, by setting PYLON_SIM_SCENARIO and PYLON_SIM_LOG in
// this process (children inherit them). The scenario format is described in
// sim/README.md; "document-file" paths are relative to the scenario file,
// which for a scenario text lies in directory().
class SimulatedConsole {
public:
    // Writes the scenario text into a temporary file.
    explicit SimulatedConsole(std::string const& scenarioText);
    // Uses an existing scenario file as it is.
    explicit SimulatedConsole(ScenarioFile const& scenario);
    ~SimulatedConsole();
    SimulatedConsole(SimulatedConsole const&) = delete;
    SimulatedConsole& operator=(SimulatedConsole const&) = delete;

    std::string const& directory() const;
    std::string const& scenarioPath() const;
    std::string const& logPath() const;

    // The raw log: one line per call, arguments after TABs, escaped.
    std::string logText() const;
    // The log decoded, in call order; empty when nothing was called.
    std::vector<Invocation> invocations() const;

private:
    void _activate() const;

    TemporaryDirectory _directory;
    std::string _scenarioPath;
    std::string _logPath;
};

// Decodes an invocation log text (see sim/README.md).
std::vector<Invocation> parseInvocationLog(std::string const& text);

} // namespace QuorvexTest
