// Runs one shell command that would leave a marker file and reports what the
// runner saw, so a test can start it under a /tmp of its choosing (for
// example a read-only one) and compare the report byte for byte.
//
// Usage: quorvex_utility_probe MARKER_FOLDER
// Report lines: execute, wasExecuted, returnCode, stdout and stderr line
// counts, whether the marker exists, the host name, and the number of
// "ShellCommand." files left in the temporary folder.

#include "utility/ShellCommand.h"
#include "utility/Trace.h"

#include <algorithm>
#include <filesystem>
#include <iostream>
#include <string>

namespace {

int countLeftTemporaryFiles() {
    std::string const prefix = std::string(Utility::ShellCommand::ms_Default_BaseFileName) + ".";
    std::error_code error;
    std::filesystem::directory_iterator const entries(Utility::ShellCommand::ms_Default_Directory,
                                                      error);
    return static_cast<int>(std::count_if(
        begin(entries), end(entries), [&prefix](std::filesystem::directory_entry const& entry) {
            return entry.path().filename().string().rfind(prefix, 0) == 0;
        }));
}

} // namespace

int main(int argc, char** argv) {
    if (argc != 2) {
        std::cerr << "usage: " << argv[0] << " MARKER_FOLDER" << std::endl;
        return 2;
    }
    std::string const marker = std::string(argv[1]) + "/marker";
    Utility::ShellCommand command("touch " + marker);
    int const result = command.execute();
    std::error_code error;
    std::cout << "execute " << result << "\n"
              << "wasExecuted " << command.wasExecuted() << "\n"
              << "returnCode " << command.get_ReturnCode() << "\n"
              << "stdout " << command.get_stdout().size() << "\n"
              << "stderr " << command.get_stderr().size() << "\n"
              << "marker " << (std::filesystem::exists(marker, error) ? "present" : "absent")
              << "\n"
              << "host " << Utility::get_HostName() << "\n"
              << "left " << countLeftTemporaryFiles() << std::endl;
    return 0;
}
