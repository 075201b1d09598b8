#include "TraceCapture.h"

#include "Normalise.h"
#include "TemporaryFiles.h"
#include "TestConstants.h"

#include "utility/Trace.h"

#include <sstream>

namespace QuorvexTest {

namespace {

constexpr char gc_CommandHeader[] = "****** ShellCommand::execute ******";

std::string const& _processTraceFileName() {
    static TemporaryDirectory const directory;
    static std::string const fileName = directory.file("process.Trace");
    static ::Utility::Trace const trace(fileName);
    return fileName;
}

// The line after every command header of a trace text.
std::vector<std::string> _commandLines(std::string const& traceText) {
    std::istringstream lines(traceText);
    std::vector<std::string> commandLines;
    std::string line;
    while (std::getline(lines, line)) {
        if (line == gc_CommandHeader && std::getline(lines, line)) {
            commandLines.push_back(line);
        }
    }
    return commandLines;
}

} // namespace

TraceRecorder::TraceRecorder() : _start(readFile(_processTraceFileName()).size()) {}

std::string TraceRecorder::text() const {
    return normaliseTemporaryNames(readFile(_processTraceFileName()).substr(_start));
}

std::string expectedTraceBlock(std::string const& commandLine, int exitCode,
                               std::string const& printedStdout, std::string const& printedStderr) {
    return "\n" + std::string(gc_CommandHeader) + "\n" + commandLine +
           " > /tmp/ShellCommand.XXXXXX 2> /tmp/ShellCommand.XXXXXX\nRC = " +
           std::to_string(exitCode) + "\nSTDOUT\n" + printedStdout + "STDERR\n" + printedStderr +
           "\n\n";
}

std::vector<std::string> tracedCommandLines(std::string const& traceName,
                                            std::function<void()> const& work) {
    std::string const path = std::string(gc_TraceFolder) + "/" + traceName;
    runInFreshProcess([&path, &work]() {
        ::Utility::Trace const trace(path);
        work();
        return 0;
    });
    return _commandLines(normaliseTemporaryNames(readFile(path)));
}

CommandResult runTracedInChild(std::string const& tracePath, std::function<int()> const& work) {
    return runInChild([&tracePath, &work]() {
        ::Utility::Trace trace(tracePath);
        int const result = work();
        trace.flush();
        return result;
    });
}

} // namespace QuorvexTest
