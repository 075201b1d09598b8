#include "utility/ShellCommand.h"

#include "utility/StringUtility.h"
#include "utility/TemporaryFile.h"
#include "utility/Trace.h"
#include "utility/Utility__ShellCommand.h"

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <ostream>
#include <unistd.h>
#include <utility>

namespace Utility {

namespace {

// One line of captured output is read with this buffer size, terminator
// included: at most 65533 characters of text.
constexpr std::size_t gc_LineBufferSize = 65534;
constexpr std::size_t gc_LineLimit = gc_LineBufferSize - 1;
// Bytes taken from an output file per read: no buffer is sized for the
// longest line, and a huge output is never held whole.
constexpr std::size_t gc_ReadBlockSize = 8192;

// This unit's trace. Made on first use, so no other unit's start-up code can
// reach it before it exists; it writes into the file that main opens.
Trace& u_get_Trace() {
    static Trace trace("");
    return trace;
}

// Flushed before the command runs, so a command that hangs shows in the trace.
void u_trace_Start(std::string const& fullCommand) {
    u_get_Trace() << "\n****** ShellCommand::execute ******\n" << fullCommand << std::endl;
}

// The title comes with its line end: one write to the trace.
void u_trace_Output(char const* titleLine, ShellCommand::Lines const& lines) {
    u_get_Trace() << titleLine;
    Utility__ShellCommand::_u_PrintText(u_get_Trace(), lines, "");
}

void u_trace_End() {
    u_get_Trace() << "\n\n" << std::flush;
}

// The line being read: its text ends at the first NUL byte, but every byte
// up to the line end counts against the line limit.
struct PendingLine {
    std::string text;
    std::size_t length{0};
    bool textEnded{false};
};

void u_take_Bytes(PendingLine& line, char const* bytes, std::size_t count) {
    line.length += count;
    if (line.textEnded) {
        return;
    }
    auto const* const nul = static_cast<char const*>(std::memchr(bytes, '\0', count));
    line.textEnded = nul != nullptr;
    line.text.append(bytes, line.textEnded ? static_cast<std::size_t>(nul - bytes) : count);
}

// A read error ends the file like its end does.
std::size_t u_read_Block(int descriptor, char* block, std::size_t size) {
    ssize_t got = 0;
    do {
        got = ::read(descriptor, block, size);
    } while (got < 0 && errno == EINTR);
    return got < 0 ? 0 : static_cast<std::size_t>(got);
}

// Appends the file's lines. The read that meets the end of the file still
// appends an entry; a line over the limit is cut there and ends the reading.
void u_read_Lines(int descriptor, ShellCommand::Lines& lines) {
    char block[gc_ReadBlockSize];
    PendingLine line;
    for (;;) {
        std::size_t const got = u_read_Block(descriptor, block, sizeof block);
        if (got == 0) {
            lines.push_back(std::move(line.text));
            return;
        }
        char const* next = block;
        char const* const end = block + got;
        while (next != end) {
            auto const* const lineEnd = static_cast<char const*>(
                std::memchr(next, '\n', static_cast<std::size_t>(end - next)));
            auto const available = static_cast<std::size_t>((lineEnd ? lineEnd : end) - next);
            std::size_t const room = gc_LineLimit - line.length;
            if (available > room) {
                u_take_Bytes(line, next, room);
                lines.push_back(std::move(line.text));
                return;
            }
            u_take_Bytes(line, next, available);
            if (lineEnd == nullptr) {
                break;
            }
            lines.push_back(std::move(line.text));
            line = PendingLine();
            next = lineEnd + 1;
        }
    }
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
    std::string const prefix =
        StringUtility::concatenate({_temporaryDirectory, "/", _temporaryBaseFileName});
    TemporaryFile stdoutFile(prefix);
    TemporaryFile stderrFile(prefix);
    if (!stdoutFile.isValid() || !stderrFile.isValid()) {
        // A file that was made stays on disk.
        _executed = false;
        _returnCode = 0;
        return -1;
    }
    std::string const& stdoutName = stdoutFile._get_ActualFileName();
    std::string const& stderrName = stderrFile._get_ActualFileName();
    // The command text goes to the shell as given, nothing quoted. Kept for the console's scripts:
    // see docs/compatibility.md#no-escaping-command-line
    std::string const fullCommand =
        StringUtility::concatenate({_command, " > ", stdoutName, " 2> ", stderrName});
    u_trace_Start(fullCommand);

    // The exit status sits in the second byte; a failure of system itself
    // (-1) stays -1 because the shift keeps the sign.
    // A command killed by a signal reads 0. Kept for the console's readers: see
    // docs/compatibility.md#killed-command-exit-0
    int const rawResult = std::system(fullCommand.c_str());
    _returnCode = rawResult >> 8;
    _executed = true;
    u_get_Trace() << "RC = " << _returnCode << '\n';

    _readOutput(stdoutName, _stdoutLines);
    u_trace_Output("STDOUT\n", _stdoutLines);
    _readOutput(stderrName, _stderrLines);
    u_trace_Output("STDERR\n", _stderrLines);
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
    int const descriptor = ::open(fileName.c_str(), O_RDONLY | O_CLOEXEC);
    if (descriptor < 0) {
        return 0;
    }
    // The read that meets the end of the file still appends an entry.
    // Kept for the trace's readers: see docs/compatibility.md#captured-lines
    u_read_Lines(descriptor, lines);
    ::close(descriptor);
    return static_cast<unsigned int>(lines.size());
}

} // namespace Utility
