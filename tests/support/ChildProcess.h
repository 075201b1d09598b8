#pragma once
// Commands and code run in child processes, with what they print captured.

#include <functional>
#include <string>
#include <vector>

namespace QuorvexTest {

struct CommandResult {
    int exitStatus = -1;    // exit code, or 128 + signal number
    std::string stdoutText; // exact bytes
    std::string stderrText; // exact bytes
};

// argv as the null-ended array of the exec functions; the pointers point
// into argv, which must outlive the array.
std::vector<char*> argumentPointers(std::vector<std::string> const& argv);

// Runs argv[0] (searched in PATH when it has no "/") with the given
// arguments, stdin from /dev/null, and waits for it.
CommandResult runCommand(std::vector<std::string> const& argv);
// runCommand({"/bin/sh", "-c", commandLine})
CommandResult runShell(std::string const& commandLine);

// Runs work in a forked copy of this process, which shares what the test set
// up so far (its temporary folders, its simulated console) while its own
// process-wide state (the shared trace, the standard streams) leaves this
// process untouched. The child ends with work's result once its standard
// streams are flushed; the result holds it and what the child printed.
CommandResult runInChild(std::function<int()> const& work);

// Runs work in a freshly started copy of the test program, where process-wide
// state that a forked copy would inherit (a trace object that failed, the time
// zone, signal settings) starts clean. The copy runs the current test again up
// to this call, so files both sides need belong in scratchDirectory(). work
// returns the copy's exit status: 0 for success; on failure it should say why
// on standard error. A status other than 0 fails the test.
void runInFreshProcess(std::function<int()> const& work);

} // namespace QuorvexTest
