#pragma once

#include "relay/RELAY_Test_Utility.h"
#include "utility/Trace.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <regex>
#include <string>
#include <vector>

namespace Quorvex::RELAY {

// The trace of this test process, opened on a temporary file before the first
// command runs: a trace object that wrote while no file was open stays mute.
inline std::string const& u_get_TestTraceFileName() {
    static QuorvexTest::TemporaryDirectory const directory;
    static std::string const fileName = directory.file("relay.Trace");
    static ::Utility::Trace trace(fileName);
    return fileName;
}

// The trace text written since construction, with the generated temporary
// file names of the shell runner replaced by ShellCommand.XXXXXX.
class TestTraceRecorder {
public:
    TestTraceRecorder() : _start(QuorvexTest::readFile(u_get_TestTraceFileName()).size()) {}

    std::string get_Text() const {
        static std::regex const temporaryName("/tmp/ShellCommand\\.[A-Za-z0-9]{6}");
        std::string const text = QuorvexTest::readFile(u_get_TestTraceFileName()).substr(_start);
        return std::regex_replace(text, temporaryName, "/tmp/ShellCommand.XXXXXX");
    }

private:
    std::string::size_type _start;
};

// The block the shell runner traces for one run of commandLine; the output
// texts are the captured lines as printed, each with its line end.
inline std::string u_expected_TraceBlock(std::string const& commandLine, int exitCode,
                                         std::string const& printedStdout,
                                         std::string const& printedStderr) {
    return "\n****** ShellCommand::execute ******\n" + commandLine +
           " > /tmp/ShellCommand.XXXXXX 2> /tmp/ShellCommand.XXXXXX\nRC = " +
           std::to_string(exitCode) + "\nSTDOUT\n" + printedStdout + "STDERR\n" + printedStderr +
           "\n\n";
}

// A run against the simulated console: the trace is open before anything
// runs, and every test reads only what it caused.
class RemoteActionRun : public ::testing::Test {
protected:
    TestTraceRecorder _trace;
};

} // namespace Quorvex::RELAY
