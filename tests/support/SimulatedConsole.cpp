#include "SimulatedConsole.h"

#include "TestConstants.h"

#include <cstdlib>
#include <sstream>

namespace QuorvexTest {

namespace {

constexpr char gc_ScenarioVariable[] = "PYLON_SIM_SCENARIO";
constexpr char gc_LogVariable[] = "PYLON_SIM_LOG";

// Undoes the log's escapes: "\\" -> "\", "\t" -> TAB, "\n" -> line feed.
std::string _unescape(std::string const& field) {
    std::string text;
    for (std::size_t i = 0; i < field.size(); ++i) {
        if (field[i] != '\\' || i + 1 == field.size()) {
            text += field[i];
            continue;
        }
        char const next = field[++i];
        text += next == 't' ? '\t' : next == 'n' ? '\n' : next;
    }
    return text;
}

Invocation _parseLogLine(std::string const& line) {
    Invocation invocation;
    std::size_t start = 0;
    while (true) {
        std::size_t const tab = line.find('\t', start);
        invocation.push_back(_unescape(line.substr(start, tab - start)));
        if (tab == std::string::npos) {
            return invocation;
        }
        start = tab + 1;
    }
}

} // namespace

std::string simulatorPath() {
    return QUORVEX_SIMULATOR;
}

std::string shippedScenario(std::string const& fileName) {
    return sourceRoot() + "/sim/scenarios/" + fileName;
}

SimulatedConsole::SimulatedConsole(std::string const& scenarioText)
    : _scenarioPath(_directory.file("scenario.scn")), _logPath(_directory.file("invocations.log")) {
    writeFile(_scenarioPath, scenarioText);
    _activate();
}

SimulatedConsole::SimulatedConsole(ScenarioFile const& scenario)
    : _scenarioPath(scenario.path), _logPath(_directory.file("invocations.log")) {
    _activate();
}

void SimulatedConsole::_activate() const {
    ::setenv(gc_ScenarioVariable, _scenarioPath.c_str(), 1);
    ::setenv(gc_LogVariable, _logPath.c_str(), 1);
}

SimulatedConsole::~SimulatedConsole() {
    ::unsetenv(gc_ScenarioVariable);
    ::unsetenv(gc_LogVariable);
}

std::string const& SimulatedConsole::directory() const {
    return _directory.path();
}

std::string const& SimulatedConsole::scenarioPath() const {
    return _scenarioPath;
}

std::string const& SimulatedConsole::logPath() const {
    return _logPath;
}

std::string SimulatedConsole::logText() const {
    return fileExists(_logPath) ? readFile(_logPath) : std::string();
}

std::vector<Invocation> SimulatedConsole::invocations() const {
    return parseInvocationLog(logText());
}

std::vector<std::string> activeSimulatorFiles() {
    std::vector<std::string> files;
    for (char const* variable : {gc_ScenarioVariable, gc_LogVariable}) {
        char const* path = std::getenv(variable);
        if (path != nullptr && *path != '\0') {
            files.emplace_back(path);
        }
    }
    return files;
}

std::vector<Invocation> parseInvocationLog(std::string const& text) {
    std::vector<Invocation> invocations;
    std::istringstream lines(text);
    std::string line;
    while (std::getline(lines, line)) {
        invocations.push_back(_parseLogLine(line));
    }
    return invocations;
}

} // namespace QuorvexTest
