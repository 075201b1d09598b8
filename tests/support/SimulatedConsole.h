#pragma once
// The simulated console (pylon-sim) that a sandboxed test talks to through
// the console's fixed tool paths.

#include "TemporaryFiles.h"

#include <string>
#include <vector>

namespace QuorvexTest {

// Absolute path of the simulator binary.
std::string simulatorPath();
// Absolute path of a scenario shipped in sim/scenarios/.
std::string shippedScenario(std::string const& fileName);

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

// The scenario file and invocation log the simulator is pointed at now,
// those that are set.
std::vector<std::string> activeSimulatorFiles();

// Decodes an invocation log text (see sim/README.md).
std::vector<Invocation> parseInvocationLog(std::string const& text);

} // namespace QuorvexTest
