#include "utility/ShellCommand.h"

#include "utility/TemporaryFile.h"
#include "utility/Trace.h"
#include "utility/Utility__ShellCommand.h"

#include <cstdlib>
#include <fstream>
#include <ostream>

namespace Utility {

namespace {

// One line of captured output is read with this buffer size, terminator
// included: at most 65533 characters of text.
constexpr std::streamsize gc_LineBufferSize = 65534;

// This unit's trace. Made on first use, so no other unit's start-up code can
// reach it before it exists; it writes into the file that main opens.
Trace& u_get_Trace() {
    static Trace trace("");
    return trace;
}

void u_trace_Start(std::string const& fullCommand) {
    u_get_Trace() << std::endl
                  << "****** ShellCommand::execute ******\n"
                  << fullCommand << std::endl;
}

void u_trace_Output(char const* title, ShellCommand::Lines const& lines) {
    u_get_Trace() << title << std::endl;
    Utility__ShellCommand::_u_PrintText(u_get_Trace(), lines, "");
}

void u_trace_End() {
    u_get_Trace() << "\n" << std::endl;
}

} // namespace

ShellCommand::ShellCommand(std::string const& command)
    : _command(command), _temporaryDirectory(ms_Default_Directory),
      _temporaryBaseFileName(ms_Default_BaseFileName), _stdoutLines(), _stderrLines() {}

void ShellCommand::append_Command(std::string const& text) {
    _command += text;
}

int ShellCommand::execute() {
    if (_executeOnlyOnce && _executed) {
        return -1;
    }
    std::string const prefix = _temporaryDirectory + "/" + _temporaryBaseFileName;
    TemporaryFile stdoutFile(prefix);
    TemporaryFile stderrFile(prefix);
    if (!stdoutFile.isValid() || !stderrFile.isValid()) {
        // A file that was made stays on disk.
        _executed = false;
        _returnCode = 0;
        return -1;
    }
    // The command text goes to the shell as given, nothing quoted. Kept for the console's scripts:
    // see docs/compatibility.md#no-escaping-command-line
    std::string const fullCommand = _command + " > " + stdoutFile.get_ActualFileName() + " 2> " +
                                    stderrFile.get_ActualFileName();
    u_trace_Start(fullCommand);

    // The exit status sits in the second byte; a failure of system itself
    // (-1) stays -1 because the shift keeps the sign.
    // A command killed by a signal reads 0. Kept for the console's readers: see
    // docs/compatibility.md#killed-command-exit-0
    int const rawResult = std::system(fullCommand.c_str());
    _returnCode = rawResult >> 8;
    _executed = true;
    u_get_Trace() << "RC = " << _returnCode << std::endl;

    _readOutput(stdoutFile.get_ActualFileName(), _stdoutLines);
    u_trace_Output("STDOUT", _stdoutLines);
    _readOutput(stderrFile.get_ActualFileName(), _stderrLines);
    u_trace_Output("STDERR", _stderrLines);
    u_trace_End();

    stdoutFile.remove();
    stderrFile.remove();
    return _returnCode;
}

int ShellCommand::get_ReturnCode() const {
    return _returnCode;
}

bool ShellCommand::wasExecuted() const {
    return _executed;
}

ShellCommand::Lines const& ShellCommand::get_stdout() const {
    return _stdoutLines;
}

ShellCommand::Lines const& ShellCommand::get_stderr() const {
    return _stderrLines;
}

ShellCommand::const_iterator ShellCommand::stdout_begin() const {
    return _stdoutLines.begin();
}

ShellCommand::const_iterator ShellCommand::stdout_end() const {
    return _stdoutLines.end();
}

ShellCommand::const_iterator ShellCommand::stderr_begin() const {
    return _stderrLines.begin();
}

ShellCommand::const_iterator ShellCommand::stderr_end() const {
    return _stderrLines.end();
}

bool ShellCommand::set_ExecuteOnlyOnce(bool const& executeOnlyOnce) {
    bool const previous = _executeOnlyOnce;
    _executeOnlyOnce = executeOnlyOnce;
    return previous;
}

// The four setters have no effect. Kept for the console's readers: see
// docs/compatibility.md#temporary-file-setters
void ShellCommand::set_Temporary_Directory(std::string const&) {}

void ShellCommand::set_Temporary_BaseFileName(std::string const&) {}

void ShellCommand::set_Default_Directory(std::string const&) {}

void ShellCommand::set_Default_BaseFileName(std::string const&) {}

unsigned int ShellCommand::_readOutput(std::string const& fileName, Lines& lines) {
    std::ifstream file(fileName.c_str());
    if (!file.is_open()) {
        return 0;
    }
    std::vector<char> buffer(gc_LineBufferSize);
    // The read that meets the end of the file still appends an entry.
    // Kept for the trace's readers: see docs/compatibility.md#captured-lines
    while (!file.eof()) {
        buffer[0] = '\0';
        file.getline(buffer.data(), gc_LineBufferSize);
        // Taken as a C string: a NUL byte ends the line's text.
        lines.push_back(buffer.data());
        // A full buffer without a line end leaves the stream failed but not
        // at its end; the text read so far is kept and reading stops.
        if (file.fail() && !file.eof()) {
            break;
        }
    }
    file.close();
    return static_cast<unsigned int>(lines.size());
}

} // namespace Utility
