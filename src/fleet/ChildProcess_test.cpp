#include "fleet/ChildProcess.h"

#include "fleet/ProcessTree.h"

#include "QuorvexTest.h"
#include "utility/TemporaryFile.h"

#include <gtest/gtest.h>

#include <poll.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <cstdlib>
#include <thread>

namespace {

using fleet::ChildProcess;

// A bound on work that must not hang: a wait on a worker left stopped would
// never end, and SIGALRM ends the process that runs the work instead.
constexpr unsigned int gc_HangSeconds = 20;

std::string sleepLong() {
    std::system("sleep 300");
    return "went on";
}

TEST(ChildProcess, StopNoteLeftByTheParentIsReadInTheChild) {
    // The child waits until the parent has left the note, then reports it.
    ChildProcess worker([] {
        while (ChildProcess::stopNote().empty()) {
            std::this_thread::sleep_for(std::chrono::milliseconds(5));
        }
        return ChildProcess::stopNote();
    });
    ASSERT_TRUE(worker.isStarted());
    worker.setStopNote("Stopped by the time limit of 2 s after 2.0 s.");
    EXPECT_EQ(QuorvexTest::readResultToEnd(worker),
              "Stopped by the time limit of 2 s after 2.0 s.");
}

TEST(ChildProcess, NoNoteOutsideAChild) {
    EXPECT_EQ(ChildProcess::stopNote(), "");
}

TEST(ChildProcess, ChildRunsInAProcessGroupOfItsOwn) {
    ChildProcess worker([] { return std::to_string(getpgrp()) + " " + std::to_string(getpid()); });
    ASSERT_TRUE(worker.isStarted());
    std::string const text = QuorvexTest::readResultToEnd(worker);
    std::string const pid = std::to_string(worker.pid());
    EXPECT_EQ(text, pid + " " + pid);
}

TEST(ChildProcess, StartedChildHasNoStartFailure) {
    ChildProcess worker([] { return std::string(); });
    EXPECT_TRUE(worker.isStarted());
    EXPECT_EQ(worker.startFailure(), std::nullopt);
}

TEST(ChildProcess, ChildWithoutAResultPipeSaysWhichOperationFailedAndWhy) {
    std::optional<std::string> failure;
    bool started = true;
    {
        QuorvexTest::NoFreeDescriptors const exhausted;
        ChildProcess const worker([] { return std::string(); });
        started = worker.isStarted();
        failure = worker.startFailure();
    }
    EXPECT_FALSE(started);
    EXPECT_EQ(failure, std::optional<std::string>("cannot create the result pipe: Too many open "
                                                  "files"));
}

TEST(ChildProcess, ResultIsHandedOverOnce) {
    ChildProcess worker([] { return std::string("done"); });
    ASSERT_TRUE(worker.isStarted());
    EXPECT_EQ(QuorvexTest::readResultToEnd(worker), "done");
    EXPECT_EQ(worker.takeResult(), "done");
    EXPECT_EQ(worker.result(), "");
}

TEST(ChildProcess, StoppedChildGoesOnToItsEndOnceResumed) {
    ChildProcess worker([] {
        std::this_thread::sleep_for(std::chrono::milliseconds(200));
        return std::string("went on");
    });
    ASSERT_TRUE(worker.stop());
    EXPECT_TRUE(worker.isStopped());
    worker.resume();
    EXPECT_FALSE(worker.isStopped());
    EXPECT_EQ(QuorvexTest::readResultToEnd(worker), "went on");
}

TEST(ChildProcess, ChildThatEndedIsReapedInsteadOfStopped) {
    ChildProcess worker([] { return std::string("done"); });
    QuorvexTest::readResultToEnd(worker);
    while (!fleet::hasEnded(worker.pid())) {
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    EXPECT_FALSE(worker.stop());
    EXPECT_FALSE(worker.isStopped());
    EXPECT_TRUE(worker.isReaped());
}

TEST(ChildProcess, StoppingAStoppedChildAgainReturnsAtOnce) {
    QuorvexTest::CommandResult const result = QuorvexTest::runInChild([] {
        alarm(gc_HangSeconds);
        ChildProcess worker(&sleepLong);
        bool const stopped = worker.stop() && worker.stop() && worker.isStopped();
        worker.killAndReap();
        return stopped ? 0 : 1;
    });
    EXPECT_EQ(result.exitStatus, 0) << "1: not stopped; 142: the second stop hung";
}

TEST(ChildProcess, StoppedChildIsKilledAndReapedWithEverythingItStarted) {
    QuorvexTest::CommandResult const result = QuorvexTest::runInChild([] {
        alarm(gc_HangSeconds);
        ChildProcess worker(&sleepLong);
        while (fleet::descendantsOf(worker.pid()).empty()) {
            std::this_thread::sleep_for(std::chrono::milliseconds(10));
        }
        std::vector<pid_t> const started = fleet::descendantsOf(worker.pid());
        if (!worker.stop()) {
            return 1;
        }
        worker.killAndReap();
        if (!std::all_of(started.begin(), started.end(), &fleet::hasEnded)) {
            return 2;
        }
        return worker.isReaped() && !worker.isStopped() ? 0 : 3;
    });
    EXPECT_EQ(result.exitStatus, 0)
        << "1: not stopped; 2: a process it started is left; 3: not reaped; 142: the kill hung";
}

bool exists(std::string const& path) {
    struct stat status {};
    return ::stat(path.c_str(), &status) == 0;
}

// The worker makes two files as a command does, removes the first and puts
// a file of its own (not a temporary file) under that name, then hangs.
std::string makeFilesAndHang(std::string const& prefix) {
    Utility::TemporaryFile first(prefix);
    Utility::TemporaryFile const second(prefix);
    std::string const firstName = first.get_ActualFileName();
    first.remove();
    QuorvexTest::writeFile(firstName, "not a temporary file");
    QuorvexTest::writeFile(prefix + ".names", firstName + "\n" + second.get_ActualFileName());
    pause();
    return "";
}

TEST(ChildProcess, KilledChildsTemporaryFilesAreRemovedOnceReapedAndNothingElse) {
    QuorvexTest::TemporaryDirectory const folder;
    std::string const prefix = folder.file("ShellCommand");
    ChildProcess worker([&prefix] { return makeFilesAndHang(prefix); });
    ASSERT_TRUE(worker.isStarted());
    auto const deadline = std::chrono::steady_clock::now() + std::chrono::seconds(20);
    while (!exists(prefix + ".names") && std::chrono::steady_clock::now() < deadline) {
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    std::vector<std::string> const names =
        QuorvexTest::linesOf(QuorvexTest::readFile(prefix + ".names"));
    ASSERT_EQ(names.size(), 2U);
    ASSERT_TRUE(exists(names[1]));
    kill(worker.pid(), SIGKILL);
    while (!worker.reap()) {
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    EXPECT_FALSE(exists(names[1])) << "the temporary file the killed child left";
    EXPECT_EQ(QuorvexTest::readFile(names[0]), "not a temporary file");
    ASSERT_TRUE(worker.waitStatus().has_value());
    EXPECT_TRUE(WIFSIGNALED(*worker.waitStatus()));
    EXPECT_EQ(WTERMSIG(*worker.waitStatus()), SIGKILL);
}

// The child leaves a sleep running, orphaned, and reports its PID.
TEST(ChildProcess, ChildEndsWhatItStartedBeforeItEnds) {
    QuorvexTest::TemporaryDirectory const folder;
    std::string const pidFile = folder.file("sleep.pid");
    ChildProcess worker([&pidFile] {
        std::system(("(sleep 300 & echo $! > " + pidFile + ")").c_str());
        return QuorvexTest::readFile(pidFile);
    });
    ASSERT_TRUE(worker.isStarted());
    std::string const sleeper = QuorvexTest::readResultToEnd(worker);
    ASSERT_FALSE(sleeper.empty());
    while (!worker.reap()) {
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    EXPECT_EQ(worker.waitStatus(), std::optional<int>(0));
    EXPECT_TRUE(fleet::hasEnded(std::stoi(sleeper))) << sleeper;
}

// A child whose parent is gone ends with the sleep it started: run in a
// middle process that this test kills, the child being its child.
TEST(ChildProcess, ChildEndsWithEverythingItStartedWhenItsParentIsGone) {
    int ends[2];
    ASSERT_EQ(pipe(ends), 0);
    pid_t const middle = fork();
    ASSERT_GE(middle, 0);
    if (middle == 0) {
        ChildProcess worker([] { return sleepLong(); });
        pid_t const pids[2] = {worker.pid(), 0};
        [[maybe_unused]] ssize_t const sent = write(ends[1], pids, sizeof pids);
        pause();
        _exit(0);
    }
    close(ends[1]);
    pid_t pids[2] = {0, 0};
    ASSERT_EQ(read(ends[0], pids, sizeof pids), static_cast<ssize_t>(sizeof pids));
    close(ends[0]);
    pid_t const worker = pids[0];
    auto const deadline = std::chrono::steady_clock::now() + std::chrono::seconds(20);
    std::vector<pid_t> tree = fleet::descendantsOf(worker);
    while (tree.empty() && std::chrono::steady_clock::now() < deadline) {
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
        tree = fleet::descendantsOf(worker);
    }
    ASSERT_FALSE(tree.empty());
    kill(middle, SIGKILL);
    waitpid(middle, nullptr, 0);
    tree.push_back(worker);
    for (pid_t pid : tree) {
        while (!fleet::hasEnded(pid) && std::chrono::steady_clock::now() < deadline) {
            std::this_thread::sleep_for(std::chrono::milliseconds(10));
        }
        EXPECT_TRUE(fleet::hasEnded(pid)) << pid;
    }
    waitpid(worker, nullptr, WNOHANG);
}

} // namespace
