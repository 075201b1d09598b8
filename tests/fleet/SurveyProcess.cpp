#include "SurveyProcess.h"

#include "ChildProcess.h"
#include "FailingSystemCalls.h"

#include <cerrno>
#include <chrono>
#include <csignal>
#include <fcntl.h>
#include <stdexcept>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

namespace FleetTest {

namespace {

constexpr auto gc_PollPause = std::chrono::milliseconds(20);

int statusOf(int waitStatus) {
    return WIFSIGNALED(waitStatus) ? 128 + WTERMSIG(waitStatus) : WEXITSTATUS(waitStatus);
}

void limitFileSize(std::optional<rlim_t> const& fileSizeLimit) {
    if (!fileSizeLimit) {
        return;
    }
    std::signal(SIGXFSZ, SIG_IGN);
    rlimit const limit{*fileSizeLimit, *fileSizeLimit};
    if (::setrlimit(RLIMIT_FSIZE, &limit) != 0) {
        ::_exit(125);
    }
}

[[noreturn]] void execute(std::vector<std::string> const& argv, std::string const& stdoutPath,
                          std::string const& stderrPath, std::optional<rlim_t> fileSizeLimit,
                          std::vector<long> const& failingCalls) {
    int const input = ::open("/dev/null", O_RDONLY);
    int const output = ::open(stdoutPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0644);
    int const error = ::open(stderrPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0644);
    if (input < 0 || output < 0 || error < 0 || ::dup2(input, 0) < 0 || ::dup2(output, 1) < 0 ||
        ::dup2(error, 2) < 0) {
        ::_exit(126);
    }
    limitFileSize(fileSizeLimit);
    if (!failingCalls.empty() && !QuorvexTest::failSystemCalls(failingCalls, EIO).empty()) {
        ::_exit(125);
    }
    std::vector<char*> arguments = QuorvexTest::argumentPointers(argv);
    ::execv(arguments[0], arguments.data());
    ::_exit(127);
}

} // namespace

double monotonicSeconds() {
    return std::chrono::duration<double>(std::chrono::steady_clock::now().time_since_epoch())
        .count();
}

SurveyProcess::SurveyProcess(std::vector<std::string> const& argv, std::string const& stdoutPath,
                             std::string const& stderrPath, std::optional<rlim_t> fileSizeLimit,
                             std::vector<long> const& failingCalls) {
    _started = monotonicSeconds();
    _pid = ::fork();
    if (_pid < 0) {
        throw std::runtime_error("cannot start " + argv.front());
    }
    if (_pid == 0) {
        execute(argv, stdoutPath, stderrPath, fileSizeLimit, failingCalls);
    }
}

pid_t SurveyProcess::pid() const {
    return _pid;
}

SurveyProcess::~SurveyProcess() {
    if (_pid > 0) {
        ::kill(_pid, SIGKILL);
        ::waitpid(_pid, nullptr, 0);
    }
}

void SurveyProcess::signal(int signalNumber) const {
    if (_pid > 0) {
        ::kill(_pid, signalNumber);
    }
}

int SurveyProcess::waitForExit(double boundSeconds) {
    while (_pid > 0) {
        int waitStatus = 0;
        if (::waitpid(_pid, &waitStatus, WNOHANG) == _pid) {
            _ended = monotonicSeconds();
            _pid = -1;
            return statusOf(waitStatus);
        }
        if (monotonicSeconds() - _started > boundSeconds) {
            ::kill(_pid, SIGKILL);
            ::waitpid(_pid, nullptr, 0);
            _ended = monotonicSeconds();
            _pid = -1;
            return -1;
        }
        std::this_thread::sleep_for(gc_PollPause);
    }
    return -1;
}

double SurveyProcess::secondsTaken() const {
    return _ended - _started;
}

} // namespace FleetTest
