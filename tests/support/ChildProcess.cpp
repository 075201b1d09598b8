#include "ChildProcess.h"

#include "TemporaryFiles.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <iostream>
#include <iterator>
#include <stdexcept>
#include <sys/wait.h>
#include <unistd.h>

namespace QuorvexTest {

namespace {

constexpr int gc_RedirectFailed = 126;
constexpr int gc_CannotRun = 127;

// Replaces the child's descriptor fd by the file at path.
void _redirect(int fd, std::string const& path, int flags) {
    int const opened = ::open(path.c_str(), flags, 0600);
    if (opened < 0 || ::dup2(opened, fd) < 0) {
        ::_exit(gc_RedirectFailed);
    }
    ::close(opened);
}

void _redirectOutput(int fd, std::string const& path) {
    _redirect(fd, path, O_WRONLY | O_CREAT | O_TRUNC);
}

[[noreturn]] void _execChild(std::vector<std::string> const& argv) {
    _redirect(STDIN_FILENO, "/dev/null", O_RDONLY);
    std::vector<char*> args = argumentPointers(argv);
    ::execvp(args[0], args.data());
    std::string const message = "cannot run " + argv[0] + ": " + std::strerror(errno) + "\n";
    ssize_t const ignored = ::write(STDERR_FILENO, message.data(), message.size());
    static_cast<void>(ignored);
    ::_exit(gc_CannotRun);
}

// The child's exit code, 128 + the signal that ended it, or -1.
int _waitFor(pid_t child) {
    int status = 0;
    while (::waitpid(child, &status, 0) < 0) {
        if (errno != EINTR) {
            return -1;
        }
    }
    if (WIFEXITED(status)) {
        return WEXITSTATUS(status);
    }
    return WIFSIGNALED(status) ? 128 + WTERMSIG(status) : -1;
}

// Forks a child whose standard output and error go to files, runs
// inChild there (which must not return) and collects what it printed.
CommandResult _runCaptured(std::function<void()> const& inChild) {
    TemporaryDirectory const captured;
    std::string const outPath = captured.file("stdout");
    std::string const errPath = captured.file("stderr");
    std::cout.flush();
    std::cerr.flush();
    pid_t const child = ::fork();
    if (child < 0) {
        throw std::runtime_error(std::string("fork failed: ") + std::strerror(errno));
    }
    if (child == 0) {
        _redirectOutput(STDOUT_FILENO, outPath);
        _redirectOutput(STDERR_FILENO, errPath);
        inChild();
        ::_exit(gc_CannotRun);
    }
    CommandResult result;
    result.exitStatus = _waitFor(child);
    result.stdoutText = readFile(outPath);
    result.stderrText = readFile(errPath);
    return result;
}

} // namespace

std::vector<char*> argumentPointers(std::vector<std::string> const& argv) {
    std::vector<char*> pointers;
    pointers.reserve(argv.size() + 1);
    std::transform(argv.begin(), argv.end(), std::back_inserter(pointers),
                   [](std::string const& argument) { return const_cast<char*>(argument.c_str()); });
    pointers.push_back(nullptr);
    return pointers;
}

CommandResult runCommand(std::vector<std::string> const& argv) {
    if (argv.empty()) {
        throw std::invalid_argument("runCommand needs a program");
    }
    return _runCaptured([&argv]() { _execChild(argv); });
}

CommandResult runShell(std::string const& commandLine) {
    return runCommand({"/bin/sh", "-c", commandLine});
}

CommandResult runInChild(std::function<int()> const& work) {
    return _runCaptured([&work]() {
        int const result = work();
        std::cout.flush();
        std::cerr.flush();
        ::_exit(result);
    });
}

void runInFreshProcess(std::function<int()> const& work) {
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    EXPECT_EXIT(std::exit(work()), ::testing::ExitedWithCode(0), "");
}

} // namespace QuorvexTest
