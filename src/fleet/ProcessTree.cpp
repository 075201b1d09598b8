#include "fleet/ProcessTree.h"

#include "utility/FileText.h"
#include "utility/SystemError.h"

#include <sys/wait.h>
// The C library of Debian 12 (2.36) declares these without C linkage for C++.
extern "C" {
#include <sys/pidfd.h>
}
#include <unistd.h>

#include <algorithm>
#include <array>
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

// A process below root together with its parent when it was listed.
struct Link {
    pid_t parent = 0;
    pid_t pid = 0;
};

std::vector<Link> linksBelow(pid_t root) {
    std::vector<Link> found{{0, root}};
    for (std::size_t i = 0; i < found.size(); ++i) {
        for (pid_t child : childrenOf(found[i].pid)) {
            found.push_back({found[i].pid, child});
        }
    }
    // The root itself is not below the root.
    found.erase(found.begin());
    return found;
}

// The state letter of /proc/<pid>/stat: 'R', 'S', 'D', 'T', 'Z'...; 'X' when gone.
char stateOf(pid_t pid) {
    std::optional<std::string> const fields = statFields(pid);
    return fields && !fields->empty() ? (*fields)[0] : 'X';
}

std::optional<pid_t> parentOf(pid_t pid) {
    std::optional<std::string> const fields = statFields(pid);
    std::istringstream stream(fields.value_or(""));
    char state = 0;
    pid_t parent = 0;
    if (!(stream >> state >> parent)) {
        return std::nullopt;
    }
    return parent;
}

bool isStoppedState(char state) {
    return state == 'T' || state == 't';
}

bool hasEndedState(char state) {
    return state == 'Z' || state == 'X';
}

// One round of the freeze: true when every process found was already
// stopped or ended.
bool freezeRound(pid_t root) {
    bool allStill = true;
    for (Link const& link : linksBelow(root)) {
        char const state = stateOf(link.pid);
        if (!isStoppedState(state) && !hasEndedState(state)) {
            allStill = false;
            signalChildOf(link.parent, link.pid, SIGSTOP);
        }
    }
    return allStill;
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
    std::vector<Link> const links = linksBelow(pid);
    std::vector<pid_t> found(links.size());
    std::transform(links.begin(), links.end(), found.begin(),
                   [](Link const& link) { return link.pid; });
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
    return hasEndedState(stateOf(pid));
}

// The descriptor is opened first and the parent checked after: if pid is
// still the parent's child then, the descriptor refers to that child.
bool signalChildOf(pid_t parent, pid_t pid, int signalNumber) {
    int const descriptor = pidfd_open(pid, 0);
    if (descriptor < 0) {
        return false;
    }
    bool const sent =
        parentOf(pid) == parent && pidfd_send_signal(descriptor, signalNumber, nullptr, 0) == 0;
    close(descriptor);
    return sent;
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

// Frozen first, so that nothing forks meanwhile, then killed children
// before parents: a parent killed first would leave its live children to a
// subreaper above root, or to init, out of reach of the next round.
std::size_t killDescendants(pid_t root) {
    freezeDescendants(root);
    std::size_t signalsSent = 0;
    for (int round = 0; round < gc_KillRounds; ++round) {
        bool anyAlive = false;
        std::vector<Link> const links = linksBelow(root);
        for (auto link = links.rbegin(); link != links.rend(); ++link) {
            if (!hasEnded(link->pid)) {
                anyAlive = true;
                signalsSent += signalChildOf(link->parent, link->pid, SIGKILL) ? 1 : 0;
            }
        }
        if (!anyAlive) {
            break;
        }
        std::this_thread::sleep_for(gc_PauseBetweenRounds);
    }
    return signalsSent;
}

void freezeDescendants(pid_t root) {
    for (int round = 0; round < gc_KillRounds && !freezeRound(root); ++round) {
        std::this_thread::sleep_for(gc_PauseBetweenRounds);
    }
}

void thawDescendants(pid_t root) {
    for (Link const& link : linksBelow(root)) {
        if (isStoppedState(stateOf(link.pid))) {
            signalChildOf(link.parent, link.pid, SIGCONT);
        }
    }
}

// Each child is a child of the caller until reaped: its PID cannot be reused
// meanwhile.
std::size_t endChildrenExcept(std::vector<pid_t> const& kept) {
    std::size_t ended = 0;
    for (pid_t child : childrenOf(getpid())) {
        if (std::find(kept.begin(), kept.end(), child) != kept.end()) {
            continue;
        }
        kill(child, SIGSTOP);
        killDescendants(child);
        kill(child, SIGKILL);
        while (waitpid(child, nullptr, 0) < 0 && errno == EINTR) {
        }
        ++ended;
    }
    return ended;
}

} // namespace fleet
