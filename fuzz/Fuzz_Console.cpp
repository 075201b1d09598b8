#include "Fuzz_Console.h"

#include "Fuzz_Utility.h"

#include <dlfcn.h>

#include <fstream>

namespace Fuzz_Console {

namespace {

// The shell command runner appends " > <stdout file> 2> <stderr file>";
// the file names are made by mkstemp and hold no blanks.
constexpr char gc_StdoutRedirection[] = " > ";
constexpr char gc_StderrRedirection[] = " 2> ";
constexpr char const* gc_ListingTools[] = {"/opt/lsvtc/bin/lsvtc", "/opt/vtc/bin/lspartition"};

struct Console {
    std::string output;
    std::vector<std::string> commands;
};

Console& _u_get_Console() {
    static Console console;
    return console;
}

bool _u_is_ListingTool(std::string const& command) {
    for (char const* tool : gc_ListingTools) {
        if (command.rfind(tool, 0) == 0) {
            return true;
        }
    }
    return false;
}

int _u_run_RealShell(char const* command) {
    using System_Function = int (*)(char const*);
    auto const real = reinterpret_cast<System_Function>(dlsym(RTLD_NEXT, "system"));
    Fuzz_Utility::u_require(real != nullptr, "the C library's system() is found");
    return real(command);
}

// Splits a full command line into the command and its standard-output file;
// false when the line does not end in the runner's two redirections.
bool _u_split_Redirections(std::string const& fullCommand, std::string& command,
                           std::string& stdoutFile) {
    std::string::size_type const stderrAt = fullCommand.rfind(gc_StderrRedirection);
    if (stderrAt == std::string::npos) {
        return false;
    }
    std::string::size_type const stdoutAt = fullCommand.rfind(gc_StdoutRedirection, stderrAt);
    if (stdoutAt == std::string::npos) {
        return false;
    }
    command = fullCommand.substr(0, stdoutAt);
    std::string::size_type const fileAt = stdoutAt + sizeof gc_StdoutRedirection - 1;
    stdoutFile = fullCommand.substr(fileAt, stderrAt - fileAt);
    return true;
}

} // namespace

void u_set_Output(std::string const& output) {
    _u_get_Console().output = output;
}

std::vector<std::string> const& u_get_Commands() {
    return _u_get_Console().commands;
}

void u_clear_Commands() {
    _u_get_Console().commands.clear();
}

} // namespace Fuzz_Console

// Replaces the C library's function for the whole fuzz target.
extern "C" int system(char const* fullCommand) {
    if (fullCommand == nullptr) {
        return Fuzz_Console::_u_run_RealShell(fullCommand);
    }
    // Fuzzed text reaches only the listing tools' command lines, and those
    // never go to a real shell.
    if (!Fuzz_Console::_u_is_ListingTool(fullCommand)) {
        return Fuzz_Console::_u_run_RealShell(fullCommand);
    }
    std::string command;
    std::string stdoutFile;
    Fuzz_Utility::u_require(Fuzz_Console::_u_split_Redirections(fullCommand, command, stdoutFile),
                            "a listing command line ends in its two redirections", fullCommand);
    Fuzz_Console::_u_get_Console().commands.push_back(command);
    std::ofstream file(stdoutFile, std::ios::binary | std::ios::trunc);
    Fuzz_Utility::u_require(file.is_open(), "the standard-output file can be written", stdoutFile);
    std::string const& output = Fuzz_Console::_u_get_Console().output;
    file.write(output.data(), static_cast<std::streamsize>(output.size()));
    return 0;
}
