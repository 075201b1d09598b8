#include "fleet/ProcessTree.h"

#include "fleet/ChildProcess.h"

#include <gtest/gtest.h>

#include <poll.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <iterator>
#include <thread>

namespace {

using Fleet::ChildProcess;
using Fleet::ProcessTree;

// A child that runs a shell leaving three sleeping processes: one orphaned
// at once (adopted by the child), two under the shell. The child reports
// the shell's end and goes on, as a survey goes on after a stopped action.
std::string runSleepingTree() {
    int const status = std::system("(sleep 300 &); sleep 300 & sleep 300; wait");
    return "survived " + std::to_string(status);
}

std::vector<pid_t> liveDescendants(pid_t root) {
    std::vector<pid_t> const all = ProcessTree::descendantsOf(root);
    std::vector<pid_t> live;
    std::copy_if(all.begin(), all.end(), std::back_inserter(live),
                 [](pid_t pid) { return !ProcessTree::hasEnded(pid); });
    return live;
}

std::vector<pid_t> waitForLiveDescendants(pid_t root, std::size_t count) {
    auto const deadline = std::chrono::steady_clock::now() + std::chrono::seconds(20);
    std::vector<pid_t> live = liveDescendants(root);
    while (live.size() < count && std::chrono::steady_clock::now() < deadline) {
        std::this_thread::sleep_for(std::chrono::milliseconds(20));
        live = liveDescendants(root);
    }
    return live;
}

// The command line of pid once it holds text: a process just started by
// system() shows its parent's command line until its exec has run.
std::string waitForCommandLine(pid_t pid, std::string const& text) {
    auto const deadline = std::chrono::steady_clock::now() + std::chrono::seconds(20);
    std::string line = ProcessTree::commandLineOf(pid);
    while (line.find(text) == std::string::npos && std::chrono::steady_clock::now() < deadline) {
        std::this_thread::sleep_for(std::chrono::milliseconds(20));
        line = ProcessTree::commandLineOf(pid);
    }
    return line;
}

std::string readToEnd(ChildProcess& child) {
    while (child.readAvailable()) {
        pollfd descriptor{child.resultDescriptor(), POLLIN, 0};
        poll(&descriptor, 1, 1000);
    }
    return child.result();
}

TEST(ProcessTree, TreeOfSleepingShellsIsKilledAndTheWorkerGoesOn) {
    ChildProcess worker(&runSleepingTree);
    ASSERT_TRUE(worker.isStarted());
    // The shell, its two sleeps and the adopted orphan.
    std::vector<pid_t> const tree = waitForLiveDescendants(worker.pid(), 4);
    ASSERT_GE(tree.size(), 4U);

    int status = 0;
    ASSERT_TRUE(ProcessTree::stopChild(worker.pid(), status));
    EXPECT_GT(ProcessTree::killDescendants(worker.pid()), 0U);
    for (pid_t pid : tree) {
        EXPECT_TRUE(ProcessTree::hasEnded(pid)) << pid;
    }
    kill(worker.pid(), SIGCONT);

    EXPECT_EQ(readToEnd(worker).rfind("survived ", 0), 0U) << worker.result();
    while (!worker.reap()) {
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    for (pid_t pid : tree) {
        EXPECT_TRUE(ProcessTree::hasEnded(pid)) << pid;
    }
}

TEST(ProcessTree, KillingWithoutDescendantsSendsNothing) {
    ChildProcess worker([] { return std::string("done"); });
    ASSERT_TRUE(worker.isStarted());
    EXPECT_EQ(readToEnd(worker), "done");
    EXPECT_EQ(ProcessTree::killDescendants(worker.pid()), 0U);
}

TEST(ProcessTree, ChildIsListedWithItsAgeAndCommandLine) {
    ChildProcess worker([] {
        std::system("exec sleep 300");
        return std::string();
    });
    ASSERT_TRUE(worker.isStarted());
    auto const children = ProcessTree::childrenOf(getpid());
    EXPECT_NE(std::find(children.begin(), children.end(), worker.pid()), children.end());
    // The shell's own process becomes the sleep once it has run exec.
    std::vector<pid_t> const sleeper = waitForLiveDescendants(worker.pid(), 1);
    ASSERT_FALSE(sleeper.empty());
    EXPECT_NE(waitForCommandLine(sleeper.front(), "sleep 300").find("sleep 300"),
              std::string::npos);
    auto const age = ProcessTree::ageOf(sleeper.front());
    ASSERT_TRUE(age.has_value());
    EXPECT_GE(*age, 0.0);
    EXPECT_LT(*age, 60.0);
    worker.killAndReap();
    kill(sleeper.front(), SIGKILL);
}

TEST(ProcessTree, StoppingAChildThatEndedGivesItsStatus) {
    ChildProcess worker([] { return std::string(); });
    ASSERT_TRUE(worker.isStarted());
    readToEnd(worker);
    std::this_thread::sleep_for(std::chrono::milliseconds(100));
    int status = -1;
    EXPECT_FALSE(ProcessTree::stopChild(worker.pid(), status));
    worker.markReaped();
}

TEST(ProcessTree, ProcessThatIsGoneHasEndedAndNoAge) {
    EXPECT_TRUE(ProcessTree::hasEnded(0x7ffffff0));
    EXPECT_FALSE(ProcessTree::ageOf(0x7ffffff0).has_value());
    EXPECT_EQ(ProcessTree::commandLineOf(0x7ffffff0), "");
    EXPECT_TRUE(ProcessTree::childrenOf(0x7ffffff0).empty());
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
    EXPECT_EQ(readToEnd(worker), "Stopped by the time limit of 2 s after 2.0 s.");
}

TEST(ChildProcess, NoNoteOutsideAChild) {
    EXPECT_EQ(ChildProcess::stopNote(), "");
}

TEST(ChildProcess, ChildRunsInAProcessGroupOfItsOwn) {
    ChildProcess worker([] { return std::to_string(getpgrp()) + " " + std::to_string(getpid()); });
    ASSERT_TRUE(worker.isStarted());
    std::string const text = readToEnd(worker);
    std::string const pid = std::to_string(worker.pid());
    EXPECT_EQ(text, pid + " " + pid);
}

} // namespace
