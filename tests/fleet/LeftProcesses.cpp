#include "LeftProcesses.h"

#include <algorithm>
#include <fcntl.h>
#include <filesystem>
#include <sstream>
#include <unistd.h>

namespace FleetTest {

namespace {

// The bytes of a /proc file; what could be read when the process ends while
// it is read (read() then fails, which a file stream would throw for).
std::string readProcFile(std::filesystem::path const& file) {
    std::string text;
    int const descriptor = ::open(file.c_str(), O_RDONLY);
    if (descriptor < 0) {
        return text;
    }
    char buffer[4096];
    ssize_t count = 0;
    while ((count = ::read(descriptor, buffer, sizeof buffer)) > 0) {
        text.append(buffer, static_cast<std::size_t>(count));
    }
    ::close(descriptor);
    return text;
}

// The NUL-separated entries of /proc/<pid>/environ or cmdline; none when the
// process is gone or not readable.
std::vector<std::string> entriesOf(std::filesystem::path const& file) {
    std::string const text = readProcFile(file);
    std::vector<std::string> entries;
    std::istringstream stream(text);
    std::string entry;
    while (std::getline(stream, entry, '\0')) {
        entries.push_back(entry);
    }
    return entries;
}

std::string commandLineOf(std::filesystem::path const& process) {
    std::string line;
    for (std::string const& argument : entriesOf(process / "cmdline")) {
        line += (line.empty() ? "" : " ") + argument;
    }
    return line;
}

bool isNumber(std::string const& name) {
    return !name.empty() &&
           std::all_of(name.begin(), name.end(), [](char c) { return c >= '0' && c <= '9'; });
}

} // namespace

std::vector<std::string> processesOfConsole(std::string const& logPath) {
    std::string const setting = "PYLON_SIM_LOG=" + logPath;
    std::string const self = std::to_string(::getpid());
    std::vector<std::string> found;
    std::error_code ignored;
    for (auto const& entry : std::filesystem::directory_iterator("/proc", ignored)) {
        std::string const pid = entry.path().filename().string();
        if (!isNumber(pid) || pid == self) {
            continue;
        }
        std::vector<std::string> const environment = entriesOf(entry.path() / "environ");
        if (std::find(environment.begin(), environment.end(), setting) != environment.end()) {
            found.push_back(pid + " " + commandLineOf(entry.path()));
        }
    }
    return found;
}

} // namespace FleetTest
