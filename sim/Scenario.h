#pragma once
// The scenario of the simulated console: how each console tool answers.
// The file format is described in sim/README.md.

#include <map>
#include <optional>
#include <set>
#include <string>

namespace PylonSim {

// One answer of a console tool.
struct Response {
    std::string stdoutText;
    std::string stderrText;
    int exitCode = 0;
    // Seconds to wait before answering; unset takes the scenario's default.
    std::optional<double> delay;
    // Seconds a child process that the tool starts and leaves behind waits
    // before it ends; unset: no such child.
    std::optional<double> childDelay;
    // Seconds a daemonised helper waits before it ends: started in a session
    // of its own through a second fork, so that it is no child of the tool
    // and survives the tool's process group; unset: no such helper.
    std::optional<double> daemonDelay;
    // Ways the tool misbehaves before it waits, as hung console actions do:
    // "ignore-signals" (SIGINT, SIGTERM and SIGHUP ignored), "close-stdout",
    // "rename" (another process name), "fork-storm" (a chain of processes
    // that keeps forking), "stop-self" (stops itself with SIGSTOP).
    std::set<std::string> misbehaviours;
    // The client document that getFileFromPartition places; unset: none.
    std::optional<std::string> document;
};

// A scenario file that cannot be used; carries the line it was found on
// (0 when the file itself cannot be read).
struct ScenarioError {
    std::string fileName;
    unsigned long line = 0;
    std::string problem;

    // "<file>:<line>: <problem>", or "<file>: <problem>" without a line.
    std::string describe() const;
};

class Scenario {
public:
    // The empty scenario: every tool prints nothing and exits 0.
    Scenario() = default;

    // Reads and checks a whole scenario file; throws ScenarioError.
    static Scenario load(std::string const& fileName);

    // The answer of a section such as "lspartition 1234-ABC_10ABCDE", else of
    // the tool's default section ("lspartition *"), else the empty answer.
    Response find(std::string const& tool, std::string const& name) const;

    // Delay of every answer whose section sets none.
    double get_DefaultDelay() const;

private:
    friend class ScenarioParser;

    void _insert(std::string const& tool, std::string const& name, Response const& response);
    bool _contains(std::string const& tool, std::string const& name) const;

    double _defaultDelay = 0.0;
    std::map<std::string, Response> _sections;
};

} // namespace PylonSim
