#include "fleet/ProcessTree.h"

#include "utility/FileText.h"
#include "utility/SystemError.h"

#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <csignal>
#include <ctime>
#include <filesystem>
#include <sstream>
#include <thread>

namespace fleet {

namespace {

// A tree of processes that keeps forking is still killed within this many rounds.
constexpr int gc_KillRounds = 1000;
constexpr auto gc_PauseBetweenRounds = std::chrono::milliseconds(1);

std::string procPath(pid_t pid, char const* name) {
    return "/proc/" + std::to_string(pid) + "/" + name;
}

std::vector<std::string> threadsOf(pid_t pid) {
    std::vector<std::string> threads;
    std::error_code error;
    for (std::filesystem::directory_iterator entry(procPath(pid, "task"), error), end;
         !error && entry != end; entry.increment(error)) {
        threads.push_back(entry->path().filename().string());
    }
    return threads;
}

// The fields of /proc/<pid>/stat after the command name; nullopt when gone.
std::optional<std::string> statFields(pid_t pid) {
    std::string const stat = util::readWholeFileOrEmpty(procPath(pid, "stat"));
    // The command name in parentheses may hold blanks and parentheses itself.
    std::size_t const end = stat.rfind(')');
    if (end == std::string::npos || end + 2 > stat.size()) {
        return std::nullopt;
    }
    return stat.substr(end + 2);
}

} // namespace

double secondsSinceBoot() {
    timespec now{};
    clock_gettime(CLOCK_BOOTTIME, &now);
    return static_cast<double>(now.tv_sec) + static_cast<double>(now.tv_nsec) / 1e9;
}

std::vector<pid_t> childrenOf(pid_t pid) {
    std::vector<pid_t> children;
    for (auto const& thread : threadsOf(pid)) {
        std::istringstream list(
            util::readWholeFileOrEmpty(procPath(pid, "task/") + thread + "/children"));
        pid_t child = 0;
        while (list >> child) {
            children.push_back(child);
        }
    }
    return children;
}

std::vector<pid_t> descendantsOf(pid_t pid) {
    std::vector<pid_t> found = childrenOf(pid);
    for (std::size_t i = 0; i < found.size(); ++i) {
        std::vector<pid_t> const grandchildren = childrenOf(found[i]);
        found.insert(found.end(), grandchildren.begin(), grandchildren.end());
    }
    return found;
}

std::string commandLineOf(pid_t pid) {
    std::string text = util::readWholeFileOrEmpty(procPath(pid, "cmdline"));
    std::replace(text.begin(), text.end(), '\0', ' ');
    return text;
}

std::optional<double> ageOf(pid_t pid) {
    std::optional<std::string> const fields = statFields(pid);
    if (!fields) {
        return std::nullopt;
    }
    // After the name: state is field 3, start time (clock ticks after boot) field 22.
    std::istringstream stream(*fields);
    std::string field;
    for (int index = 3; index < 22 && stream >> field; ++index) {
    }
    unsigned long long startTicks = 0;
    if (!(stream >> startTicks)) {
        return std::nullopt;
    }
    double const started =
        static_cast<double>(startTicks) / static_cast<double>(sysconf(_SC_CLK_TCK));
    double const age = secondsSinceBoot() - started;
    return age < 0 ? 0.0 : age;
}

bool hasEnded(pid_t pid) {
    std::optional<std::string> const fields = statFields(pid);
    return !fields || fields->empty() || (*fields)[0] == 'Z' || (*fields)[0] == 'X';
}

ChildStop stopChild(pid_t child) {
    ChildStop stop;
    if (kill(child, SIGSTOP) != 0) {
        stop.error = errno;
        return stop;
    }
    while (true) {
        pid_t const result = waitpid(child, &stop.waitStatus, WUNTRACED);
        if (result == child) {
            stop.state =
                WIFSTOPPED(stop.waitStatus) ? ChildStop::State::Stopped : ChildStop::State::Ended;
            return stop;
        }
        if (result < 0 && errno != EINTR) {
            stop.error = errno;
            return stop;
        }
    }
}

std::size_t killDescendants(pid_t root) {
    std::size_t signalsSent = 0;
    for (int round = 0; round < gc_KillRounds; ++round) {
        bool anyAlive = false;
        for (pid_t pid : descendantsOf(root)) {
            if (!hasEnded(pid)) {
                anyAlive = true;
                kill(pid, SIGKILL);
                ++signalsSent;
            }
        }
        if (!anyAlive) {
            break;
        }
        std::this_thread::sleep_for(gc_PauseBetweenRounds);
    }
    return signalsSent;
}

} // namespace fleet
