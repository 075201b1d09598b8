#pragma once
// One run of the built survey tool in a sandbox of its own (tools/sandbox)
// with a fault injected: result folders missing or read-only, /tmp read-only
// or full, a console tool missing or replaced by a script that prints huge
// output. The console tools are the simulator (pylon-sim) answering from the
// scenario given at construction, unless removed or replaced.
//
// The run is bounded in time: a tool still running after gc_TimeLimit seconds
// is killed and the exit status is 124. After the tool, the names left in
// /tmp and in /var/adm/quorvex are recorded.

#include "QuorvexTest.h"

#include <map>
#include <string>
#include <vector>

class FaultRun {
public:
    static constexpr int gc_TimeLimit = 120;
    static constexpr int gc_TimedOut = 124;

    // True when the run had its sandbox; otherwise the current test is
    // marked skipped with the reason.
    static bool ranInSandbox(QuorvexTest::CommandResult const& result);

    explicit FaultRun(std::string const& scenarioText);
    explicit FaultRun(QuorvexTest::ScenarioFile const& scenario);
    FaultRun(FaultRun const&) = delete;
    FaultRun& operator=(FaultRun const&) = delete;

    // A file in this run's own folder, which the sandboxed run sees at the
    // same path.
    std::string file(std::string const& name) const;

    // The console tool at toolPath is left out: the simulator plays only the
    // other tools, and nothing lies at toolPath unless the host has it.
    void removeTool(std::string const& toolPath);
    // The console tool at toolPath is the executable shell script text.
    void replaceTool(std::string const& toolPath, std::string const& script);
    // Further tools/sandbox options, such as "--readonly-tmp".
    void addSandboxOptions(std::vector<std::string> const& options);
    // Shell commands run inside the sandbox just before the tool.
    void setPrelude(std::string const& shellText);
    // The tool is copied into folder inside the sandbox before the prelude
    // and run from there, so that a prelude mounting a new /tmp does not hide
    // it when the build tree lies under /tmp.
    void runToolCopiedTo(std::string const& folder);
    // Measure the peak resident set size of the tool and the commands it
    // runs (the largest of them) with /usr/bin/time.
    void measurePeakMemory();

    // Runs the tool with "-c" and the identity.
    QuorvexTest::CommandResult run(std::string const& identity);

    // The result folders as the run left them (bound from this process).
    std::string const& vpdFolder() const;
    std::vector<std::string> vpdFiles() const;
    // A file of the VPD folder with the run's time stamps written as
    // 1700000000000.
    std::string vpdFile(std::string const& name) const;
    // The trace file with temporary file names normalised; whether there is one.
    bool hasTrace() const;
    std::string trace() const;
    // The console's invocation log (only calls of the simulator).
    std::string calls() const;
    // Names left in /tmp besides this run's folder, and those in /var/adm/quorvex.
    std::vector<std::string> leftInTmp() const;
    std::vector<std::string> quorvexFolders() const;
    // Peak resident set size in KiB, after measurePeakMemory().
    long peakMemoryKiB() const;

private:
    std::vector<std::string> _toolPlacement() const;
    std::vector<std::string> _resultFolders() const;
    std::vector<std::string> _command(std::string const& identity) const;
    std::string _toolCopying() const;
    std::string _toolPath() const;
    std::vector<std::string> _readListing(std::string const& name) const;

    QuorvexTest::SimulatedConsole _console;
    QuorvexTest::TemporaryDirectory _vpdFolder;
    QuorvexTest::TemporaryDirectory _traceFolder;
    std::vector<std::string> _removedTools;
    std::map<std::string, std::string> _replacedTools;
    std::vector<std::string> _sandboxOptions;
    std::string _prelude;
    std::string _toolCopyFolder;
    bool _measurePeakMemory = false;
    long _first = 0;
    long _last = 0;
};
