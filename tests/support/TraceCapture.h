#pragma once
// What the shared trace records while a test runs. The trace is process-wide:
// its file is opened once, by the first trace object given a name, and a trace
// object that wrote before that stays mute; so tests either open the trace of
// their process before anything runs (TraceRecorder) or trace in a child.

#include "ChildProcess.h"

#include <functional>
#include <string>
#include <vector>

namespace QuorvexTest {

// The trace text this process writes from construction on, with the
// generated temporary file names of the shell runner masked. The first
// recorder of a process opens the trace on a temporary file that stays open
// until the process ends.
class TraceRecorder {
public:
    TraceRecorder();

    std::string text() const;

private:
    std::string::size_type _start;
};

// The block the shell runner traces for one run of commandLine, its temporary
// file names masked; the output texts are the captured lines as printed, each
// with its line end.
std::string expectedTraceBlock(std::string const& commandLine, int exitCode,
                               std::string const& printedStdout, std::string const& printedStderr);

// Runs work in a freshly started copy of the test program whose trace file is
// traceName in the trace folder, and returns the command lines traced there,
// their temporary file names masked.
std::vector<std::string> tracedCommandLines(std::string const& traceName,
                                            std::function<void()> const& work);

// runInChild, with the child's shared trace file opened on tracePath first
// and flushed after work.
CommandResult runTracedInChild(std::string const& tracePath, std::function<int()> const& work);

} // namespace QuorvexTest
