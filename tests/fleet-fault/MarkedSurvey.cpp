#include "MarkedSurvey.h"

#include "ChildProcess.h"
#include "SurveyProcess.h"

#include "utility/FileText.h"
#include "utility/SystemError.h"
#include "utility/TextChecks.h"

#include <algorithm>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <fcntl.h>
#include <filesystem>
#include <sstream>
#include <stdexcept>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

namespace FleetFaultTest {

namespace {

constexpr char gc_MarkerVariable[] = "QUORVEX_FAULT_RUN";
constexpr auto gc_PollPause = std::chrono::milliseconds(20);
// Rounds of killing: a process of the run may start another while it is killed.
constexpr int gc_KillRounds = 20;

// What /proc/<pid>/stat says of a process: its state, parent, group, session.
struct ProcessStat {
    char state = '?';
    pid_t parent = 0;
    pid_t group = 0;
    pid_t session = 0;
};

// The bytes of a /proc file; none when the process is gone.
std::string procText(std::string const& path) {
    try {
        return util::readWholeFile(path);
    } catch (util::SystemError const&) {
        return "";
    }
}

// The fields after the command name, which may hold blanks and parentheses.
bool readStat(pid_t pid, ProcessStat& stat) {
    std::string const text = procText("/proc/" + std::to_string(pid) + "/stat");
    std::size_t const nameEnd = text.rfind(')');
    if (nameEnd == std::string::npos) {
        return false;
    }
    std::istringstream fields(text.substr(nameEnd + 1));
    return static_cast<bool>(fields >> stat.state >> stat.parent >> stat.group >> stat.session);
}

bool hasEntry(pid_t pid, std::string const& file, std::string const& entry) {
    std::string const text = procText("/proc/" + std::to_string(pid) + "/" + file);
    std::size_t at = 0;
    while (at < text.size()) {
        std::size_t const end = std::min(text.find('\0', at), text.size());
        if (text.compare(at, end - at, entry) == 0) {
            return true;
        }
        at = end + 1;
    }
    return false;
}

std::string commandLineOf(pid_t pid) {
    std::string line = procText("/proc/" + std::to_string(pid) + "/cmdline");
    std::replace(line.begin(), line.end(), '\0', ' ');
    return line;
}

std::vector<pid_t> livePids() {
    std::vector<pid_t> pids;
    std::error_code ignored;
    for (auto const& entry : std::filesystem::directory_iterator("/proc", ignored)) {
        std::string const name = entry.path().filename().string();
        if (util::isDigits(name)) {
            pids.push_back(static_cast<pid_t>(std::stol(name)));
        }
    }
    return pids;
}

// Orphans this process adopted as a subreaper would stay as zombies.
void reapAdoptedOrphans(pid_t keep) {
    for (pid_t const pid : livePids()) {
        ProcessStat stat;
        if (pid != keep && readStat(pid, stat) && stat.parent == ::getpid() && stat.state == 'Z') {
            ::waitpid(pid, nullptr, WNOHANG);
        }
    }
}

[[noreturn]] void execute(std::vector<std::string> const& argv, std::string const& marker,
                          int output, std::string const& stderrPath) {
    ::setsid();
    ::setenv(gc_MarkerVariable, marker.c_str(), 1);
    int const input = ::open("/dev/null", O_RDONLY);
    int const error = ::open(stderrPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0644);
    if (input < 0 || output < 0 || error < 0 || ::dup2(input, 0) < 0 || ::dup2(output, 1) < 0 ||
        ::dup2(error, 2) < 0) {
        ::_exit(126);
    }
    // The run inherits only the standard descriptors, as from a shell, so
    // that any other descriptor its actions hold is one it opened itself.
    ::close_range(3, ~0U, 0);
    // And the signal dispositions and mask of a program started from a
    // terminal, whatever the test's own are.
    for (int const signalNumber : {SIGINT, SIGTERM, SIGHUP, SIGPIPE}) {
        std::signal(signalNumber, SIG_DFL);
    }
    sigset_t none;
    sigemptyset(&none);
    ::sigprocmask(SIG_SETMASK, &none, nullptr);
    std::vector<char*> arguments = QuorvexTest::argumentPointers(argv);
    ::execv(arguments[0], arguments.data());
    ::_exit(127);
}

// Unique to each run of this process: its PID and a count.
std::string nextMarker() {
    static int s_runs = 0;
    return std::to_string(::getpid()) + "-" + std::to_string(++s_runs);
}

int statusOf(int waitStatus) {
    return WIFSIGNALED(waitStatus) ? 128 + WTERMSIG(waitStatus) : WEXITSTATUS(waitStatus);
}

} // namespace

MarkedSurvey::MarkedSurvey(std::vector<std::string> const& argv, std::string const& stdoutPath,
                           std::string const& stderrPath, Output output)
    : _marker(nextMarker()) {
    int ends[2] = {-1, -1};
    if (output == Output::ClosedPipe
            ? ::pipe(ends) != 0
            : (ends[1] = ::open(stdoutPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0644)) < 0) {
        throw std::runtime_error("cannot make the standard output of " + argv.front());
    }
    if (ends[0] >= 0) {
        ::close(ends[0]);
    }
    _pid = ::fork();
    if (_pid == 0) {
        execute(argv, _marker, ends[1], stderrPath);
    }
    ::close(ends[1]);
    if (_pid < 0) {
        throw std::runtime_error("cannot start " + argv.front());
    }
}

MarkedSurvey::~MarkedSurvey() {
    killLeftProcesses();
    if (_pid > 0 && !_reaped) {
        ::kill(_pid, SIGKILL);
        ::waitpid(_pid, nullptr, 0);
    }
    reapAdoptedOrphans(-1);
}

pid_t MarkedSurvey::pid() const {
    return _pid;
}

bool MarkedSurvey::signal(int signalNumber) const {
    ProcessStat stat;
    if (_reaped || !readStat(_pid, stat) || stat.state == 'Z') {
        return false;
    }
    return ::kill(_pid, signalNumber) == 0;
}

int MarkedSurvey::waitForExit(double boundSeconds) {
    double const until = FleetTest::monotonicSeconds() + boundSeconds;
    while (!_reaped) {
        int waitStatus = 0;
        if (::waitpid(_pid, &waitStatus, WNOHANG) == _pid) {
            _reaped = true;
            return statusOf(waitStatus);
        }
        if (FleetTest::monotonicSeconds() > until) {
            ::kill(_pid, SIGKILL);
            ::waitpid(_pid, nullptr, 0);
            _reaped = true;
            return -1;
        }
        std::this_thread::sleep_for(gc_PollPause);
    }
    return -1;
}

std::vector<pid_t> MarkedSurvey::children() const {
    std::vector<pid_t> found;
    for (pid_t const process : livePids()) {
        ProcessStat stat;
        if (readStat(process, stat) && stat.parent == _pid && stat.state != 'Z') {
            found.push_back(process);
        }
    }
    return found;
}

std::vector<pid_t> MarkedSurvey::descendants() const {
    std::string const marker = std::string(gc_MarkerVariable) + "=" + _marker;
    std::vector<pid_t> found;
    for (pid_t const process : livePids()) {
        ProcessStat stat;
        if (process == _pid || !readStat(process, stat) || stat.state == 'Z') {
            continue;
        }
        if (stat.group == _pid || stat.session == _pid || hasEntry(process, "environ", marker)) {
            found.push_back(process);
        }
    }
    return found;
}

std::vector<std::string> MarkedSurvey::processesLeft(double boundSeconds) const {
    double const until = FleetTest::monotonicSeconds() + boundSeconds;
    std::vector<pid_t> left = descendants();
    while (!left.empty() && FleetTest::monotonicSeconds() < until) {
        std::this_thread::sleep_for(gc_PollPause);
        reapAdoptedOrphans(_reaped ? -1 : _pid);
        left = descendants();
    }
    std::vector<std::string> described;
    for (pid_t const process : left) {
        ProcessStat stat;
        readStat(process, stat);
        described.push_back(std::to_string(process) + " (" + stat.state + ") " +
                            commandLineOf(process));
    }
    return described;
}

void MarkedSurvey::killLeftProcesses() const {
    for (int round = 0; round < gc_KillRounds; ++round) {
        std::vector<pid_t> const left = descendants();
        if (left.empty()) {
            return;
        }
        for (pid_t const process : left) {
            ::kill(process, SIGKILL);
        }
        std::this_thread::sleep_for(gc_PollPause);
        reapAdoptedOrphans(_reaped ? -1 : _pid);
    }
}

} // namespace FleetFaultTest
