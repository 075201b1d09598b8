#include "fleet/ProcessTree.h"

#include "fleet/ChildProcess.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <poll.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <iterator>
#include <thread>

namespace {

using fleet::ChildProcess;

// A child that runs a shell leaving three sleeping processes: one orphaned
// at once (adopted by the child), two under the shell. The child reports
// the shell's end and goes on, as a survey goes on after a stopped action.
std::string runSleepingTree() {
    int const status = std::system("(sleep 300 &); sleep 300 & sleep 300; wait");
    return "survived " + std::to_string(status);
}

std::string sleepLongForTree() {
    std::system("sleep 300");
    return "went on";
}

std::vector<pid_t> liveDescendants(pid_t root) {
    std::vector<pid_t> const all = fleet::descendantsOf(root);
    std::vector<pid_t> live;
    std::copy_if(all.begin(), all.end(), std::back_inserter(live),
                 [](pid_t pid) { return !fleet::hasEnded(pid); });
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
    std::string line = fleet::commandLineOf(pid);
    while (line.find(text) == std::string::npos && std::chrono::steady_clock::now() < deadline) {
        std::this_thread::sleep_for(std::chrono::milliseconds(20));
        line = fleet::commandLineOf(pid);
    }
    return line;
}

TEST(ProcessTree, TreeOfSleepingShellsIsKilledAndTheWorkerGoesOn) {
    ChildProcess worker(&runSleepingTree);
    ASSERT_TRUE(worker.isStarted());
    // The shell, its two sleeps and the adopted orphan.
    std::vector<pid_t> const tree = waitForLiveDescendants(worker.pid(), 4);
    ASSERT_GE(tree.size(), 4U);

    ASSERT_TRUE(worker.stop());
    EXPECT_GT(fleet::killDescendants(worker.pid()), 0U);
    for (pid_t pid : tree) {
        EXPECT_TRUE(fleet::hasEnded(pid)) << pid;
    }
    worker.resume();

    EXPECT_EQ(QuorvexTest::readResultToEnd(worker).rfind("survived ", 0), 0U) << worker.result();
    while (!worker.reap()) {
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    for (pid_t pid : tree) {
        EXPECT_TRUE(fleet::hasEnded(pid)) << pid;
    }
}

TEST(ProcessTree, KillingWithoutDescendantsSendsNothing) {
    ChildProcess worker([] { return std::string("done"); });
    ASSERT_TRUE(worker.isStarted());
    EXPECT_EQ(QuorvexTest::readResultToEnd(worker), "done");
    EXPECT_EQ(fleet::killDescendants(worker.pid()), 0U);
}

TEST(ProcessTree, ChildIsListedWithItsAgeAndCommandLine) {
    ChildProcess worker([] {
        std::system("exec sleep 300");
        return std::string();
    });
    ASSERT_TRUE(worker.isStarted());
    auto const children = fleet::childrenOf(getpid());
    EXPECT_NE(std::find(children.begin(), children.end(), worker.pid()), children.end());
    // The shell's own process becomes the sleep once it has run exec.
    std::vector<pid_t> const sleeper = waitForLiveDescendants(worker.pid(), 1);
    ASSERT_FALSE(sleeper.empty());
    EXPECT_NE(waitForCommandLine(sleeper.front(), "sleep 300").find("sleep 300"),
              std::string::npos);
    auto const age = fleet::ageOf(sleeper.front());
    ASSERT_TRUE(age.has_value());
    EXPECT_GE(*age, 0.0);
    EXPECT_LT(*age, 60.0);
    worker.killAndReap();
    kill(sleeper.front(), SIGKILL);
}

TEST(ProcessTree, StoppingAChildThatEndedReapsItAndGivesItsExitStatus) {
    pid_t const child = fork();
    ASSERT_GE(child, 0);
    if (child == 0) {
        _exit(3);
    }
    while (!fleet::hasEnded(child)) {
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    fleet::ChildStop const stop = fleet::stopChild(child);
    EXPECT_EQ(stop.state, fleet::ChildStop::State::Ended);
    ASSERT_TRUE(WIFEXITED(stop.waitStatus));
    EXPECT_EQ(WEXITSTATUS(stop.waitStatus), 3);
    EXPECT_EQ(waitpid(child, nullptr, WNOHANG), -1) << "the child was not reaped";
}

TEST(ProcessTree, StoppingALiveChildLeavesItStopped) {
    pid_t const child = fork();
    ASSERT_GE(child, 0);
    if (child == 0) {
        pause();
        _exit(0);
    }
    fleet::ChildStop const stop = fleet::stopChild(child);
    EXPECT_EQ(stop.state, fleet::ChildStop::State::Stopped);
    EXPECT_TRUE(WIFSTOPPED(stop.waitStatus));
    kill(child, SIGKILL);
    waitpid(child, nullptr, 0);
}

TEST(ProcessTree, StoppingAProcessThatIsNoChildSaysItIsGoneWithErrno) {
    fleet::ChildStop const stop = fleet::stopChild(0x7ffffff0);
    EXPECT_EQ(stop.state, fleet::ChildStop::State::Gone);
    EXPECT_EQ(stop.error, ESRCH);
}

TEST(ProcessTree, ProcessThatIsGoneHasEndedAndNoAge) {
    EXPECT_TRUE(fleet::hasEnded(0x7ffffff0));
    EXPECT_FALSE(fleet::ageOf(0x7ffffff0).has_value());
    EXPECT_EQ(fleet::commandLineOf(0x7ffffff0), "");
    EXPECT_TRUE(fleet::childrenOf(0x7ffffff0).empty());
}

// The state letter of /proc/<pid>/stat.
char stateOf(pid_t pid) {
    std::string const stat = QuorvexTest::readFile("/proc/" + std::to_string(pid) + "/stat");
    std::size_t const end = stat.rfind(')');
    return end == std::string::npos || end + 2 >= stat.size() ? 'X' : stat[end + 2];
}

TEST(ProcessTree, FrozenTreeIsStoppedThroughoutUntilThawed) {
    ChildProcess worker(&runSleepingTree);
    ASSERT_TRUE(worker.isStarted());
    std::vector<pid_t> const tree = waitForLiveDescendants(worker.pid(), 4);
    ASSERT_GE(tree.size(), 4U);
    ASSERT_TRUE(worker.stop());
    fleet::freezeDescendants(worker.pid());
    for (pid_t pid : tree) {
        EXPECT_EQ(stateOf(pid), 'T') << pid;
    }
    fleet::thawDescendants(worker.pid());
    for (pid_t pid : tree) {
        EXPECT_NE(stateOf(pid), 'T') << pid;
    }
    worker.killAndReap();
}

TEST(ProcessTree, SignalReachesOnlyAChildOfTheGivenParent) {
    pid_t const child = fork();
    ASSERT_GE(child, 0);
    if (child == 0) {
        pause();
        _exit(0);
    }
    EXPECT_FALSE(fleet::signalChildOf(getppid(), child, SIGKILL)) << "not the parent";
    EXPECT_FALSE(fleet::hasEnded(child));
    EXPECT_TRUE(fleet::signalChildOf(getpid(), child, SIGKILL));
    int status = 0;
    ASSERT_EQ(waitpid(child, &status, 0), child);
    EXPECT_TRUE(WIFSIGNALED(status));
    EXPECT_FALSE(fleet::signalChildOf(getpid(), 0x7ffffff0, SIGKILL)) << "no such process";
}

TEST(ProcessTree, ChildrenNotKeptAreEndedWithWhatTheyStartedAndReaped) {
    ChildProcess kept([] { return sleepLongForTree(); });
    pid_t const other = fork();
    ASSERT_GE(other, 0);
    if (other == 0) {
        std::system("sleep 300");
        _exit(0);
    }
    std::vector<pid_t> const below = waitForLiveDescendants(other, 1);
    ASSERT_FALSE(below.empty());
    EXPECT_EQ(fleet::endChildrenExcept({kept.pid()}), 1U);
    EXPECT_EQ(waitpid(other, nullptr, WNOHANG), -1) << "reaped";
    for (pid_t pid : below) {
        EXPECT_TRUE(fleet::hasEnded(pid)) << pid;
    }
    EXPECT_FALSE(fleet::hasEnded(kept.pid()));
    kept.killAndReap();
}

} // namespace
