#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace Utility {

// One command line run through the system shell with its standard output and
// standard error captured in temporary files and read back as lines. The run
// and its results are written to the shared trace.
class ShellCommand {
public:
    using Lines = std::vector<std::string>;
    using const_iterator = Lines::const_iterator;

    // Where the temporary files are made. Constant arrays, so they are ready
    // before any other unit's start-up code runs.
    static constexpr char ms_Default_Directory[] = "/tmp";
    static constexpr char ms_Default_BaseFileName[] = "ShellCommand";

    explicit ShellCommand(std::string const& command);
    // No caller copies a command; a copy would carry neither command nor results.
    ShellCommand(ShellCommand const&) = delete;
    ShellCommand& operator=(ShellCommand const&) = delete;
    ~ShellCommand() = default;

    // Appends text to the command line exactly as given (no blank inserted).
    // Meant to be used before execute().
    void append_Command(std::string const& text);

    // Runs the command and returns its exit status, or -1 when it did not run
    // (already run once, or the temporary files could not be made).
    int execute();

    int get_ReturnCode() const;
    bool wasExecuted() const;

    Lines const& get_stdout() const;
    Lines const& get_stderr() const;
    const_iterator stdout_begin() const;
    const_iterator stdout_end() const;
    const_iterator stderr_begin() const;
    const_iterator stderr_end() const;

    // Sets the flag and returns its previous value.
    bool set_ExecuteOnlyOnce(bool const& executeOnlyOnce);

    // Accepted and without effect: the temporary files always use the
    // directory and base name copied at construction.
    // Kept for the console's readers: see docs/compatibility.md#temporary-file-setters
    void set_Temporary_Directory(std::string const& directory);
    void set_Temporary_BaseFileName(std::string const& baseFileName);
    static void set_Default_Directory(std::string const& directory);
    static void set_Default_BaseFileName(std::string const& baseFileName);

    // Appends the lines of a file to lines and returns their number afterwards.
    // Every read appends an entry, so a file ending in a line end gives a
    // trailing empty entry and an empty file gives one empty entry. A line is
    // cut at its first NUL byte and at 65533 characters; a longer line ends
    // the reading. An unreadable file leaves lines untouched and gives 0.
    static unsigned int _readOutput(std::string const& fileName, Lines& lines);

private:
    std::string _command;
    bool _executed{false};
    bool _executeOnlyOnce{true};
    std::string _temporaryDirectory;
    std::string _temporaryBaseFileName;
    std::int32_t _returnCode{0};
    Lines _stdoutLines;
    Lines _stderrLines;
};

} // namespace Utility
