#pragma once
// One end-to-end scenario folder (scenarios/<name>/) and the folders of one
// run of it: the survey tool run inside tools/sandbox against the scenario's
// simulated console, and the check of everything the run leaves behind
// against the folder's expected texts:
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

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

class EndToEndScenario {
public:
    // The names of the scenario folders, sorted.
    static std::vector<std::string> list();
    // The scenario name as a test name ("-" becomes "_").
    static std::string testName(::testing::TestParamInfo<std::string> const& info);

    explicit EndToEndScenario(std::string const& name);
    EndToEndScenario(EndToEndScenario const&) = delete;
    EndToEndScenario& operator=(EndToEndScenario const&) = delete;

    // A file in a folder of this run that the sandboxed run may write to.
    std::string probeFile(std::string const& name) const;

    // Runs tool (the survey tool's path, possibly behind a wrapper command)
    // with the scenario's arguments in a sandbox of its own; the exit status
    // is 77 when no sandbox can be made.
    QuorvexTest::CommandResult run(std::vector<std::string> const& tool);

    // Compares the run's result and the files it left with the expected texts.
    void expectExpectedOutcome(QuorvexTest::CommandResult const& result) const;

private:
    std::string _scenarioFile(std::string const& name) const;
    std::string _consoleScenario() const;
    void _placeEarlierFiles() const;
    std::vector<std::string> _sandboxOptions() const;
    std::vector<std::string> _command(std::vector<std::string> const& tool) const;
    void _expectVPDFolder() const;
    void _expectTrace() const;
    void _expectCalls() const;
    std::vector<std::string> _leftInTmp() const;

    std::string _name;
    QuorvexTest::TemporaryDirectory _vpdFolder;
    QuorvexTest::TemporaryDirectory _traceFolder;
    QuorvexTest::TemporaryDirectory _probeFolder;
    long _first = 0;
    long _last = 0;
};
