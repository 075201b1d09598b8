#include "LeftProcesses.h"

#include "utility/FileText.h"
#include "utility/SystemError.h"
#include "utility/TextChecks.h"

#include <algorithm>
#include <filesystem>
#include <iterator>
#include <sstream>
#include <unistd.h>

namespace FleetTest {

namespace {

// The bytes of a /proc file; none when the process is gone or ends while
// it is read.
std::string readProcFile(std::filesystem::path const& file) {
    try {
        return util::readWholeFile(file.string());
    } catch (util::SystemError const&) {
        return "";
    }
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

} // namespace

std::vector<int> childrenOf(int pid) {
    std::vector<int> children;
    std::string const path =
        "/proc/" + std::to_string(pid) + "/task/" + std::to_string(pid) + "/children";
    std::istringstream list(readProcFile(path));
    int child = 0;
    while (list >> child) {
        children.push_back(child);
    }
    return children;
}

std::vector<int> descriptorsOf(int pid) {
    std::vector<int> descriptors;
    std::error_code ignored;
    std::filesystem::path const folder = "/proc/" + std::to_string(pid) + "/fd";
    std::filesystem::directory_iterator const entries(folder, ignored);
    std::transform(std::filesystem::begin(entries), std::filesystem::end(entries),
                   std::back_inserter(descriptors),
                   [](auto const& entry) { return std::stoi(entry.path().filename().string()); });
    std::sort(descriptors.begin(), descriptors.end());
    return descriptors;
}

std::vector<std::string> processesOfConsole(std::string const& logPath) {
    std::string const setting = "PYLON_SIM_LOG=" + logPath;
    std::string const self = std::to_string(::getpid());
    std::vector<std::string> found;
    std::error_code ignored;
    for (auto const& entry : std::filesystem::directory_iterator("/proc", ignored)) {
        std::string const pid = entry.path().filename().string();
        if (!util::isDigits(pid) || pid == self) {
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
