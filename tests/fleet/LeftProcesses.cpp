#include "LeftProcesses.h"

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <sstream>
#include <unistd.h>

namespace FleetTest {

namespace {

// The NUL-separated entries of /proc/<pid>/environ or cmdline; empty when the
// process is gone or not readable.
std::vector<std::string> entriesOf(std::filesystem::path const& file) {
    std::ifstream in(file, std::ios::binary);
    std::string const text((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
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
