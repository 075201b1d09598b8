#include "fleet/ChildProcess.h"

#include "fleet/ProcessTree.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <poll.h>
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

} // namespace
