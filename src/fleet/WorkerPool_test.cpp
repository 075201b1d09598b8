#include "fleet/WorkerPool.h"

#include "fleet/ProcessTree.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <thread>

namespace {

using fleet::TimeLimits;
using fleet::UnitKind;
using fleet::WorkerEvent;
using fleet::WorkerPool;

constexpr int gc_NoWake = -1;
// Bounds of waits that end long before unless something is wrong.
constexpr auto gc_Bound = std::chrono::seconds(20);
constexpr unsigned int gc_HangSeconds = 20;

// Waits until the pool reports an event of this kind; what it reported
// until then, that event last (none when the bound passed).
std::vector<WorkerEvent> waitFor(WorkerPool& pool, WorkerEvent::Kind kind,
                                 TimeLimits const* limits = nullptr) {
    std::vector<WorkerEvent> seen;
    auto const deadline = std::chrono::steady_clock::now() + gc_Bound;
    while (std::chrono::steady_clock::now() < deadline) {
        std::vector<WorkerEvent> events = pool.waitForEvents();
        if (limits != nullptr) {
            std::vector<WorkerEvent> const stopped = pool.stopDueActions(*limits);
            events.insert(events.end(), stopped.begin(), stopped.end());
        }
        for (auto& event : events) {
            seen.push_back(event);
            if (event.kind == kind) {
                return seen;
            }
        }
    }
    return seen;
}

// Waits until a process below this one runs the command: a process that
// system() has just forked shows this program's command line until its exec.
bool waitForCommand(std::string const& text) {
    auto const deadline = std::chrono::steady_clock::now() + gc_Bound;
    while (std::chrono::steady_clock::now() < deadline) {
        std::vector<pid_t> const below = fleet::descendantsOf(getpid());
        if (std::any_of(below.begin(), below.end(), [&text](pid_t pid) {
                return fleet::commandLineOf(pid).find(text) != std::string::npos;
            })) {
            return true;
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    return false;
}

// A remote action as the survey runs it: a command whose name is the
// console's remote action tool (here a link to sleep).
std::string sleepForever() {
    pause();
    return "woke";
}

class RemoteAction {
public:
    RemoteAction() { symlink("/bin/sleep", _folder.file("runact-api").c_str()); }
    std::string command() const { return _folder.file("runact-api") + " 300"; }

private:
    QuorvexTest::TemporaryDirectory _folder;
};

TEST(WorkerPool, EndedWorkerIsReportedOnceWithItsTagAndResult) {
    WorkerPool pool(gc_NoWake);
    ASSERT_EQ(pool.start(7, UnitKind::Survey, [] { return std::string("result of 7"); }),
              std::nullopt);
    ASSERT_EQ(pool.start(9, UnitKind::Survey, [] { return std::string("result of 9"); }),
              std::nullopt);
    std::vector<WorkerEvent> ended;
    auto const deadline = std::chrono::steady_clock::now() + gc_Bound;
    while (pool.size() > 0 && std::chrono::steady_clock::now() < deadline) {
        std::vector<WorkerEvent> const events = pool.waitForEvents();
        ended.insert(ended.end(), events.begin(), events.end());
    }
    ASSERT_EQ(ended.size(), 2U);
    for (auto const& event : ended) {
        EXPECT_EQ(event.kind, WorkerEvent::Kind::Ended);
        EXPECT_EQ(event.text, "result of " + std::to_string(event.tag));
    }
    EXPECT_NE(ended[0].tag, ended[1].tag);
}

TEST(WorkerPool, KilledWorkerIsReportedEndedWithItsWaitStatusAndNoResult) {
    WorkerPool pool(gc_NoWake);
    ASSERT_EQ(pool.start(3, UnitKind::Survey, [] { return sleepForever(); }), std::nullopt);
    std::vector<pid_t> const workers = fleet::childrenOf(getpid());
    ASSERT_EQ(workers.size(), 1U);
    ASSERT_EQ(kill(workers.front(), SIGKILL), 0);
    std::vector<WorkerEvent> const events = waitFor(pool, WorkerEvent::Kind::Ended);
    ASSERT_EQ(events.size(), 1U);
    EXPECT_EQ(events[0].tag, 3U);
    EXPECT_EQ(events[0].text, "");
    ASSERT_TRUE(events[0].waitStatus.has_value());
    EXPECT_TRUE(WIFSIGNALED(*events[0].waitStatus));
    EXPECT_EQ(WTERMSIG(*events[0].waitStatus), SIGKILL);
}

TEST(WorkerPool, WorkerThatCannotStartIsNotKeptAndSaysWhy) {
    WorkerPool pool(gc_NoWake);
    std::optional<std::string> failure;
    {
        QuorvexTest::NoFreeDescriptors const exhausted;
        failure = pool.start(1, UnitKind::Survey, [] { return std::string(); });
    }
    EXPECT_EQ(failure, std::optional<std::string>("cannot create the result pipe: Too many "
                                                  "open files"));
    EXPECT_EQ(pool.size(), 0U);
}

TEST(WorkerPool, ActionOfAYoungUnitIsLeftAloneUnderTheTimeLimit) {
    WorkerPool pool(gc_NoWake);
    ASSERT_EQ(pool.start(1, UnitKind::PartitionListing,
                         [] { return std::to_string(std::system("sleep 1")); }),
              std::nullopt);
    TimeLimits const limits(300);
    std::vector<WorkerEvent> const events = waitFor(pool, WorkerEvent::Kind::Ended, &limits);
    ASSERT_EQ(events.size(), 1U) << "an action was stopped";
    EXPECT_EQ(events[0].text, "0");
}

// Starts body as the pool's one worker, interrupts the run once a process
// below this one runs command, and returns what the pool reported up to the
// worker's end.
std::vector<WorkerEvent> interruptWhileRunning(UnitKind kind, fleet::ChildProcess::Body const& body,
                                               std::string const& command, TimeLimits& limits) {
    WorkerPool pool(gc_NoWake);
    if (pool.start(4, kind, body) || !waitForCommand(command)) {
        return {};
    }
    limits.interrupt(SIGTERM);
    return waitFor(pool, WorkerEvent::Kind::Ended, &limits);
}

TEST(WorkerPool, InterruptionStopsAListingsActionAndTheWorkerGoesOn) {
    TimeLimits limits(0);
    std::vector<WorkerEvent> const events = interruptWhileRunning(
        UnitKind::PartitionListing,
        [] { return "went on " + std::to_string(std::system("sleep 300")); }, "sleep 300", limits);
    ASSERT_GE(events.size(), 2U);
    EXPECT_EQ(events[0].kind, WorkerEvent::Kind::ActionStopped);
    EXPECT_EQ(events[0].tag, 4U);
    EXPECT_NE(events[0].text.find("sleep 300"), std::string::npos) << events[0].text;
    EXPECT_GE(events[0].seconds, 0.0);
    EXPECT_EQ(events.back().kind, WorkerEvent::Kind::Ended);
    EXPECT_EQ(events.back().text.rfind("went on ", 0), 0U) << events.back().text;
}

// The action ends (exit 7) as soon as it sees its worker stopped: the pool
// may freeze it before or after that. Either way one story: a stop is
// reported exactly when the action was killed (SIGKILL, status 9), never
// beside an action that ended on its own (status 7 << 8).
TEST(WorkerPool, ActionEndingAsItsWorkerIsStoppedIsReportedStoppedOnlyWhenKilled) {
    TimeLimits limits(0);
    std::string const command =
        "while read -r line < /proc/$PPID/stat; do set -- $line; [ \"$3\" = T ] && exit 7; done";
    std::vector<WorkerEvent> const events = interruptWhileRunning(
        UnitKind::PartitionListing,
        [command] { return std::to_string(std::system(command.c_str())); }, "while read", limits);
    ASSERT_FALSE(events.empty());
    ASSERT_EQ(events.back().kind, WorkerEvent::Kind::Ended);
    bool const reportedStopped = events.front().kind == WorkerEvent::Kind::ActionStopped;
    EXPECT_EQ(events.back().text, reportedStopped ? "9" : std::to_string(7 << 8));
}

TEST(WorkerPool, StoppedSurveyActionLeavesTheNoteOfItsAgeForTheWorker) {
    RemoteAction const action;
    std::string const command = action.command();
    TimeLimits limits(0);
    std::vector<WorkerEvent> const events = interruptWhileRunning(
        UnitKind::Survey,
        [command] {
            std::system(command.c_str());
            return fleet::ChildProcess::stopNote();
        },
        "runact-api 300", limits);
    ASSERT_GE(events.size(), 2U);
    WorkerEvent const& stopped = events.front();
    ASSERT_EQ(stopped.kind, WorkerEvent::Kind::ActionStopped);
    EXPECT_NE(stopped.text.find("runact-api 300"), std::string::npos) << stopped.text;
    EXPECT_EQ(events.back().text, limits.stopNote(UnitKind::Survey, stopped.seconds));
    EXPECT_EQ(events.back().text.rfind("Stopped by SIGTERM after ", 0), 0U);
}

TEST(WorkerPool, StoppedMachineListingIsEndedWithoutGoingOnOrHanging) {
    QuorvexTest::CommandResult const result = QuorvexTest::runInChild([] {
        alarm(gc_HangSeconds);
        {
            WorkerPool pool(gc_NoWake);
            if (pool.start(0, UnitKind::MachineListing, [] {
                    std::system("sleep 300");
                    return std::string("went on");
                })) {
                return 1;
            }
            if (!waitForCommand("sleep 300")) {
                return 1;
            }
            TimeLimits limits(0);
            limits.interrupt(SIGTERM);
            std::vector<WorkerEvent> const events =
                waitFor(pool, WorkerEvent::Kind::ActionStopped, &limits);
            if (events.size() != 1 || events[0].kind != WorkerEvent::Kind::ActionStopped) {
                return 2;
            }
            std::this_thread::sleep_for(std::chrono::milliseconds(200));
            if (!pool.waitForEvents().empty() || !pool.stopDueActions(limits).empty()) {
                return 3;
            }
        }
        return 0;
    });
    EXPECT_EQ(result.exitStatus, 0)
        << "1: not started; 2: not stopped; 3: went on or stopped twice; 142: ending it hung";
}

} // namespace
