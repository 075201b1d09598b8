// quorvex-survey under faults at random moments: its parent or a worker
// killed, signals during the machine listing, the survey, the final writes
// and the moment an action ends, actions answering right at the time limit,
// helpers left running, a closed standard output, a full VPD folder. Each
// case runs QUORVEX_FAULT_RUNS times (see FaultTimings.h) inside the
// sandbox, and every run ends with the same checks: nothing of the run still
// running, no temporary file left, the exit status the manual page gives,
// and a summary, status lines and documents that tell one story.

#include "FaultTimings.h"
#include "FleetTools.h"
#include "MarkedSurvey.h"
#include "QuorvexTest.h"
#include "RecordChecks.h"
#include "SummaryFile.h"
#include "SurveyProcess.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <csignal>
#include <cstring>
#include <filesystem>
#include <iterator>
#include <optional>
#include <set>
#include <sys/mount.h>
#include <thread>

namespace {

using FleetFaultTest::FaultTimings;
using FleetFaultTest::MarkedSurvey;
using FleetTest::gc_Answer;
using FleetTest::gc_Identity;
using FleetTest::listing;
using QuorvexTest::SimulatedConsole;

constexpr char gc_Hang[] = "child-delay 3600\ndelay 3600\n";
// A machine the console lists no partition of.
constexpr char gc_Unlisted[] = "9999-XYZ_99ZZZZZ";
// How long a run may take before the test calls it hung and kills it.
constexpr double gc_HungRun = 20.0;
// The bound within which nothing of an ended run may still run.
constexpr double gc_NothingLeftWithin = 1.0;
// Slack on a time limit for a loaded machine.
constexpr double gc_Margin = 3.0;

std::string fetchAnswer(double delaySeconds = 0.0) {
    return "[getFileFromPartition *]\ndelay " + std::to_string(delaySeconds) + "\n" + gc_Answer +
           "document-nolf " + FleetFaultTest::gc_FetchedDocument + "\n";
}

// A client run of one partition that answers after the delay.
std::string clientRun(int id, double delaySeconds, std::string const& extra = "") {
    return "[runCmdOnPartition " + std::to_string(id) + "]\ndelay " + std::to_string(delaySeconds) +
           "\n" + extra + gc_Answer;
}

std::string signalName(int signalNumber) {
    return signalNumber == SIGINT ? "SIGINT" : "SIGTERM";
}

// Counts the calls of one remote action the console has received.
std::size_t callsOf(SimulatedConsole const& console, std::string const& action) {
    std::size_t calls = 0;
    for (QuorvexTest::Invocation const& call : console.invocations()) {
        calls += std::count_if(call.begin(), call.end(), [&action](std::string const& argument) {
            return argument.find("ZOR.ServiceEvent::::" + action) != std::string::npos;
        });
    }
    return calls;
}

bool waitForCalls(SimulatedConsole const& console, std::string const& action, std::size_t count) {
    double const until = FleetTest::monotonicSeconds() + gc_HungRun;
    while (FleetTest::monotonicSeconds() < until) {
        if (callsOf(console, action) >= count) {
            return true;
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    return false;
}

// Waits (up to the bound of a hung run) until the console's tool has been
// called: the run is then past its start, its signal handling in place.
bool waitForTool(SimulatedConsole const& console, std::string const& tool) {
    double const until = FleetTest::monotonicSeconds() + gc_HungRun;
    while (FleetTest::monotonicSeconds() < until) {
        std::vector<QuorvexTest::Invocation> const calls = console.invocations();
        if (std::any_of(calls.begin(), calls.end(), [&tool](QuorvexTest::Invocation const& call) {
                return !call.empty() && call.front() == tool;
            })) {
            return true;
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    return false;
}

// Waits (up to the bound of a hung run) until the run has no worker left:
// every unit has ended, and what remains is writing the results.
void waitForNoWorker(MarkedSurvey const& survey) {
    double const until = FleetTest::monotonicSeconds() + gc_HungRun;
    while (!survey.children().empty() && FleetTest::monotonicSeconds() < until) {
        std::this_thread::sleep_for(std::chrono::milliseconds(1));
    }
}

void pause(double seconds) {
    std::this_thread::sleep_for(std::chrono::duration<double>(std::max(seconds, 0.0)));
}

// One run of a case: fresh result folders, a console, quorvex-survey started
// with a summary in a work folder, and the checks every run ends with.
class FaultRun {
public:
    // The files the run writes besides its results: a summary, and a report
    // when asked.
    enum class Files { Summary, SummaryAndReport };

    FaultRun(std::string const& scenario, std::vector<std::string> const& options,
             MarkedSurvey::Output output = MarkedSurvey::Output::File, Files files = Files::Summary)
        : _console(withFreshFolders(scenario)), _arguments(arguments(options, files)),
          _survey(_arguments, _work.file("stdout"), _work.file("stderr"), output) {}

    SimulatedConsole const& console() const { return _console; }
    MarkedSurvey& survey() { return _survey; }
    std::string summaryPath() const { return _work.file("summary.json"); }
    std::string workFolder() const { return _work.path(); }
    std::string standardError() const { return QuorvexTest::readFile(_work.file("stderr")); }

    int waitForExit() {
        _status = _survey.waitForExit(gc_HungRun);
        return _status;
    }

    // Sends the signal, noting whether it came before the run's last files
    // (its summary, and its report's page when it writes a report) were in
    // place: one missing both before and after the signal was sent, so that
    // files put in place in between count as coming first.
    void sendSignal(int signalNumber) {
        bool const missingBefore = !lastFilesInPlace();
        _signalReached = _survey.signal(signalNumber);
        _signalBeforeTheLastFile = missingBefore && !lastFilesInPlace();
        _signal = signalNumber;
    }

    // Where the run writes its report, when it writes one.
    std::string reportFolder() const { return _work.file("report"); }

    // A signal that reached the run before its last file was in place ends
    // it with 128 + the signal; one that came later may find it finished
    // (the signals held), and then the run ends with its overall code.
    void expectSignalCounted() const {
        bool const mustCount = _signalReached && _signalBeforeTheLastFile;
        bool const finished = _status == 0 || _status == 4 || _status == 8;
        EXPECT_TRUE(_status == 128 + _signal || (!mustCount && finished))
            << "exit status " << _status << " after " << signalName(_signal)
            << (_signalReached ? " reached the run" : " came after the run had ended")
            << (_signalBeforeTheLastFile ? " before" : " after")
            << " its last files were in place\n"
            << standardError();
    }

    void expectNothingLeft() const {
        EXPECT_EQ(_survey.processesLeft(gc_NothingLeftWithin), std::vector<std::string>{})
            << "processes of the run still running " << gc_NothingLeftWithin << " s after it ended";
        EXPECT_EQ(FleetFaultTest::temporaryFilesLeft(_work.path()), std::vector<std::string>{});
    }

    // The summary is valid, agrees with the exit status, and each
    // partition's records agree with each other.
    void expectOneStory() const {
        EXPECT_EQ(FleetTest::SummaryFile(summaryPath()).validationProblems(), "");
        EXPECT_EQ(FleetFaultTest::exitStatusProblems(summaryPath(), _status),
                  std::vector<std::string>{});
        EXPECT_EQ(FleetFaultTest::recordProblems(summaryPath()), std::vector<std::string>{});
    }

    void expectEndedCleanly() const {
        expectNothingLeft();
        expectOneStory();
    }

private:
    bool lastFilesInPlace() const {
        bool const writesReport =
            std::find(_arguments.begin(), _arguments.end(), "--report") != _arguments.end();
        return QuorvexTest::fileExists(summaryPath()) &&
               (!writesReport || QuorvexTest::fileExists(reportFolder() + "/index.html"));
    }

    // The scenario, once the result folders and /tmp are as a fresh console
    // has them, whatever an earlier run left behind.
    static std::string const& withFreshFolders(std::string const& scenario) {
        QuorvexTest::clearFolder(QuorvexTest::gc_VPD_Folder);
        QuorvexTest::clearFolder(QuorvexTest::gc_TraceFolder);
        for (std::string const& name : QuorvexTest::listFolder("/tmp")) {
            if (name.rfind("ShellCommand.", 0) == 0) {
                std::filesystem::remove("/tmp/" + name);
            }
        }
        return scenario;
    }

    std::vector<std::string> arguments(std::vector<std::string> const& options, Files files) const {
        std::vector<std::string> argv{FleetTest::consoleWideTool(), "--summary",
                                      _work.file("summary.json")};
        if (files == Files::SummaryAndReport) {
            argv.insert(argv.end(), {"--report", reportFolder()});
        }
        argv.insert(argv.end(), options.begin(), options.end());
        return argv;
    }

    QuorvexTest::TemporaryDirectory const _work;
    SimulatedConsole const _console;
    std::vector<std::string> const _arguments;
    MarkedSurvey _survey;
    int _status = -1;
    int _signal = 0;
    bool _signalReached = false;
    bool _signalBeforeTheLastFile = false;
};

// Runs the case the configured number of times, each run named in failures
// together with how to replay it.
template <typename Case> void repeat(Case const& runOnce) {
    FaultTimings timings;
    for (int run = 1; run <= FaultTimings::runsPerCase(); ++run) {
        SCOPED_TRACE("run " + std::to_string(run) + "; replay: " + timings.replayHint());
        runOnce(timings);
        if (::testing::Test::HasFatalFailure()) {
            return;
        }
    }
}

// The temporary files a run killed with SIGKILL leaves. Its lock file stays
// (the lock itself ends with the process), as documented: the next run takes
// it over.
std::vector<std::string> leftByAKilledRun(FaultRun const& run) {
    std::vector<std::string> left = FleetFaultTest::temporaryFilesLeft(run.workFolder());
    left.erase(std::remove(left.begin(), left.end(),
                           std::string(QuorvexTest::gc_VPD_Folder) + "/.quorvex-survey.lock"),
               left.end());
    return left;
}

TEST(FleetFault, ParentKilledAtARandomMomentLeavesNothingOneSecondLater) {
    repeat([](FaultTimings& timings) {
        int const partitions = timings.wholeBetween(2, 6);
        std::string scenario = listing(partitions) + "[runCmdOnPartition 1]\n" + gc_Hang;
        for (int id = 2; id <= partitions; ++id) {
            scenario += clientRun(id, timings.between(0.0, 2.0), "child-delay 3600\n");
        }
        FaultRun run(scenario + fetchAnswer(),
                     {"-t", "0", "-j", std::to_string(timings.wholeBetween(1, 4)), gc_Identity});
        pause(timings.between(0.05, 1.5));
        EXPECT_TRUE(run.survey().signal(SIGKILL));
        EXPECT_EQ(run.waitForExit(), 128 + SIGKILL);
        EXPECT_EQ(run.survey().processesLeft(gc_NothingLeftWithin), std::vector<std::string>{})
            << "processes of the run still running one second after its parent was killed";
        // A unit that ended just before the kill had handed its trace piece
        // to the run, which never took it: the next run removes it, and the
        // lock file, before it runs anything.
        MarkedSurvey next({FleetTest::consoleWideTool(), "-t", "1", gc_Unlisted},
                          run.workFolder() + "/next-stdout", run.workFolder() + "/next-stderr");
        EXPECT_EQ(next.waitForExit(gc_HungRun), 8);
        EXPECT_EQ(FleetFaultTest::temporaryFilesLeft(run.workFolder()), std::vector<std::string>{})
            << "temporary files after the next run";
    });
}

// An action that stopped itself makes the worker's group an orphaned one
// with a stopped member when the parent dies: the kernel hangs the group up,
// and the worker must still end what it started and remove its files.
TEST(FleetFault, ParentKilledWhileAnActionStoppedItselfLeavesNothing) {
    repeat([](FaultTimings& timings) {
        FaultRun run(listing(1) +
                         "[runCmdOnPartition 1]\ndaemon-delay 3600\nmisbehave stop-self\n" +
                         gc_Hang + fetchAnswer(),
                     {"-t", "0", gc_Identity});
        ASSERT_TRUE(waitForCalls(run.console(), "runCmdOnPartition", 1));
        pause(timings.between(0.3, 1.0));
        EXPECT_TRUE(run.survey().signal(SIGKILL));
        EXPECT_EQ(run.waitForExit(), 128 + SIGKILL);
        EXPECT_EQ(run.survey().processesLeft(gc_NothingLeftWithin), std::vector<std::string>{})
            << "processes of the run still running one second after its parent was killed";
        std::vector<std::string> const inTmp = QuorvexTest::listFolder("/tmp");
        std::vector<std::string> shellFiles;
        std::copy_if(inTmp.begin(), inTmp.end(), std::back_inserter(shellFiles),
                     [](std::string const& name) { return name.rfind("ShellCommand.", 0) == 0; });
        EXPECT_EQ(shellFiles, std::vector<std::string>{}) << "the action's output files";
        EXPECT_EQ(leftByAKilledRun(run), std::vector<std::string>{})
            << "trace pieces and other temporary files";
    });
}

TEST(FleetFault, WorkerKilledMidActionIsRecordedAsWorkerDied) {
    repeat([](FaultTimings& timings) {
        std::string scenario = listing(3);
        for (int id = 1; id <= 3; ++id) {
            scenario += clientRun(id, timings.between(1.0, 2.0), "child-delay 3600\n");
        }
        FaultRun run(scenario + fetchAnswer(), {"-t", "0", "-j", "3", gc_Identity});
        ASSERT_TRUE(waitForCalls(run.console(), "runCmdOnPartition", 3));
        pause(timings.between(0.0, 0.5));
        std::vector<pid_t> const workers = run.survey().children();
        ASSERT_EQ(workers.size(), 3u) << "one worker per partition in flight";
        pid_t const victim = workers[static_cast<std::size_t>(timings.wholeBetween(0, 2))];
        EXPECT_EQ(::kill(victim, SIGKILL), 0);
        EXPECT_EQ(run.waitForExit(), 4) << run.standardError();
        run.expectEndedCleanly();
        std::vector<std::string> outcomes = FleetTest::SummaryFile(run.summaryPath()).outcomes();
        std::sort(outcomes.begin(), outcomes.end());
        EXPECT_EQ(outcomes, (std::vector<std::string>{"surveyed", "surveyed", "worker_died"}));
    });
}

TEST(FleetFault, SignalWhileTheResultsAreWrittenEndsTheRunAsDocumented) {
    repeat([](FaultTimings& timings) {
        int const partitions = timings.wholeBetween(10, 30);
        int const signalNumber = timings.wholeBetween(0, 1) == 0 ? SIGINT : SIGTERM;
        // A report makes the writing after the survey last long enough for
        // the signal to meet it.
        FaultRun run(listing(partitions) + "[runCmdOnPartition *]\n" + gc_Answer + fetchAnswer(),
                     {"-t", "5", "-j", "8", gc_Identity}, MarkedSurvey::Output::File,
                     FaultRun::Files::SummaryAndReport);
        ASSERT_TRUE(waitForCalls(run.console(), "getFileFromPartition",
                                 static_cast<std::size_t>(partitions)));
        waitForNoWorker(run.survey());
        pause(timings.between(0.0, 0.03));
        run.sendSignal(signalNumber);
        run.waitForExit();
        run.expectSignalCounted();
        run.expectEndedCleanly();
    });
}

TEST(FleetFault, SignalDuringASlowMachineListingEndsTheRun) {
    repeat([](FaultTimings& timings) {
        int const signalNumber = timings.wholeBetween(0, 1) == 0 ? SIGINT : SIGTERM;
        double const listingTakes = timings.between(1.0, 2.0);
        FaultRun run("[lsvtc]\ndelay " + std::to_string(listingTakes) +
                         "\nstdout 0:" + gc_Identity + ";\n" + listing(2) +
                         "[runCmdOnPartition *]\n" + gc_Answer + fetchAnswer(),
                     {"-t", "5", "--all"});
        // Before the listing runs the run may not yet handle signals at all,
        // as documented; from the listing on it must.
        ASSERT_TRUE(waitForTool(run.console(), "lsvtc"));
        pause(timings.between(0.0, listingTakes - 0.6));
        EXPECT_TRUE(run.survey().signal(signalNumber));
        EXPECT_EQ(run.waitForExit(), 128 + signalNumber) << run.standardError();
        run.expectEndedCleanly();
    });
}

TEST(FleetFault, MachineListingHangingPastTheLimitIsStopped) {
    repeat([](FaultTimings& timings) {
        int const limit = timings.wholeBetween(1, 2);
        FaultRun run("[lsvtc]\nchild-delay 3600\ndelay " +
                         std::to_string(limit + timings.between(0.5, 60.0)) + "\n" + listing(2),
                     {"-t", std::to_string(limit), "--all"});
        double const started = FleetTest::monotonicSeconds();
        // A console that could not list its machines is unavailable, not empty.
        EXPECT_EQ(run.waitForExit(), 69) << run.standardError();
        EXPECT_EQ(run.standardError(),
                  "quorvex-survey: cannot list the managed machines: /opt/lsvtc/bin/lsvtc -t0: "
                  "stopped after the time limit of " +
                      std::to_string(limit) + " s\n");
        EXPECT_LE(FleetTest::monotonicSeconds() - started, limit + 1.0 + gc_Margin);
        run.expectEndedCleanly();
    });
}

TEST(FleetFault, HelpersThatActionsLeaveRunningEndWithTheRun) {
    repeat([](FaultTimings& timings) {
        int const partitions = timings.wholeBetween(1, 4);
        std::string scenario = listing(partitions);
        for (int id = 1; id <= partitions; ++id) {
            std::string const helper =
                timings.wholeBetween(0, 1) == 0 ? "child-delay 3600\n" : "daemon-delay 3600\n";
            scenario += clientRun(id, timings.between(0.0, 0.3), helper);
        }
        FaultRun run(scenario + fetchAnswer(), {"-t", "0", "-j", "2", gc_Identity});
        EXPECT_EQ(run.waitForExit(), 0) << run.standardError();
        run.expectEndedCleanly();
    });
}

// The open descriptors of a process: the names in /proc/<pid>/fd.
std::set<std::string> descriptorsOf(pid_t pid) {
    std::set<std::string> found;
    std::error_code ignored;
    std::string const folder = "/proc/" + std::to_string(pid) + "/fd";
    for (auto const& entry : std::filesystem::directory_iterator(folder, ignored)) {
        found.insert(entry.path().filename().string() + " -> " +
                     std::filesystem::read_symlink(entry.path(), ignored).string());
    }
    return found;
}

bool isStandardDescriptor(std::string const& entry) {
    return entry.rfind("0 ", 0) == 0 || entry.rfind("1 ", 0) == 0 || entry.rfind("2 ", 0) == 0;
}

TEST(FleetFault, RemoteActionsInheritOnlyTheStandardDescriptors) {
    repeat([](FaultTimings& timings) {
        int const partitions = timings.wholeBetween(1, 4);
        std::string scenario = listing(partitions);
        for (int id = 1; id <= partitions; ++id) {
            scenario += clientRun(id, 1.5 + timings.between(0.0, 0.5));
        }
        FaultRun run(scenario + fetchAnswer(),
                     {"-t", "0", "-j", std::to_string(partitions), gc_Identity});
        ASSERT_TRUE(
            waitForCalls(run.console(), "runCmdOnPartition", static_cast<std::size_t>(partitions)));
        pause(timings.between(0.1, 0.5));
        for (pid_t const pid : run.survey().descendants()) {
            std::string const command =
                QuorvexTest::readFile("/proc/" + std::to_string(pid) + "/cmdline");
            if (command.rfind("/usr/bin/runact-api", 0) != 0) {
                continue;
            }
            std::set<std::string> inherited = descriptorsOf(pid);
            for (auto it = inherited.begin(); it != inherited.end();) {
                it = isStandardDescriptor(*it) ? inherited.erase(it) : std::next(it);
            }
            EXPECT_EQ(inherited, std::set<std::string>{}) << "descriptors of remote action " << pid;
        }
        EXPECT_EQ(run.waitForExit(), 0) << run.standardError();
        run.expectEndedCleanly();
    });
}

// The machine listing's worker opens its trace late: its action must not
// hold it either.
TEST(FleetFault, MachineListingActionInheritsOnlyTheStandardDescriptors) {
    repeat([](FaultTimings& timings) {
        FaultRun run("[lsvtc]\ndelay " + std::to_string(1.5 + timings.between(0.0, 0.5)) + "\n",
                     {"-t", "0", "--all"});
        std::optional<pid_t> listing;
        for (int look = 0; look < 100 && !listing; ++look) {
            pause(0.02);
            for (pid_t const pid : run.survey().descendants()) {
                if (QuorvexTest::readFile("/proc/" + std::to_string(pid) + "/cmdline")
                        .rfind("/opt/lsvtc/bin/lsvtc", 0) == 0) {
                    listing = pid;
                }
            }
        }
        ASSERT_TRUE(listing.has_value()) << "the machine listing never ran";
        std::set<std::string> inherited = descriptorsOf(*listing);
        for (auto it = inherited.begin(); it != inherited.end();) {
            it = isStandardDescriptor(*it) ? inherited.erase(it) : std::next(it);
        }
        EXPECT_EQ(inherited, std::set<std::string>{}) << "descriptors of the machine listing";
        EXPECT_EQ(run.waitForExit(), 8) << run.standardError();
        run.expectEndedCleanly();
    });
}

TEST(FleetFault, SignalAsAnActionEndsKeepsEveryRecordConsistent) {
    repeat([](FaultTimings& timings) {
        int const partitions = timings.wholeBetween(2, 4);
        int const signalNumber = timings.wholeBetween(0, 1) == 0 ? SIGINT : SIGTERM;
        double const clientTakes = timings.between(0.8, 1.2);
        double const fetchTakes = timings.between(0.0, 0.2);
        std::string scenario = listing(partitions);
        for (int id = 1; id <= partitions; ++id) {
            scenario += clientRun(id, clientTakes);
        }
        FaultRun run(scenario + fetchAnswer(fetchTakes),
                     {"-t", "0", "-j", std::to_string(partitions), gc_Identity});
        ASSERT_TRUE(
            waitForCalls(run.console(), "runCmdOnPartition", static_cast<std::size_t>(partitions)));
        pause(clientTakes + fetchTakes + timings.between(-0.1, 0.1));
        run.sendSignal(signalNumber);
        run.waitForExit();
        run.expectSignalCounted();
        run.expectEndedCleanly();
    });
}

TEST(FleetFault, ActionAnsweringRightAtTheLimitHasOneStory) {
    repeat([](FaultTimings& timings) {
        // Eight answers at once: each run has several chances to meet the
        // moment the limit falls.
        int const partitions = 8;
        std::string scenario = listing(partitions);
        for (int id = 1; id <= partitions; ++id) {
            scenario += clientRun(id, timings.between(0.97, 1.03));
        }
        FaultRun run(scenario + fetchAnswer(), {"-t", "1", "-j", "8", gc_Identity});
        int const status = run.waitForExit();
        EXPECT_TRUE(status == 0 || status == 4 || status == 8) << "exit status " << status;
        run.expectEndedCleanly();
    });
}

TEST(FleetFault, HangupEndsTheRunLikeSigterm) {
    repeat([](FaultTimings& timings) {
        FaultRun run(listing(3) + "[runCmdOnPartition 1]\n" + gc_Answer +
                         "[runCmdOnPartition *]\n" + gc_Hang + fetchAnswer(),
                     {"-t", "0", "-j", "2", gc_Identity});
        ASSERT_TRUE(waitForCalls(run.console(), "runCmdOnPartition", 3));
        pause(timings.between(0.0, 0.5));
        EXPECT_TRUE(run.survey().signal(SIGHUP));
        EXPECT_EQ(run.waitForExit(), 128 + SIGHUP) << run.standardError();
        run.expectEndedCleanly();
    });
}

TEST(FleetFault, ClosedStandardOutputEndsTheRunLikeSigpipe) {
    repeat([](FaultTimings& timings) {
        int const partitions = timings.wholeBetween(1, 5);
        std::string scenario = listing(partitions);
        for (int id = 1; id <= partitions; ++id) {
            scenario += clientRun(id, timings.between(0.0, 0.3));
        }
        FaultRun run(scenario + fetchAnswer(), {"-t", "0", "-j", "2", gc_Identity},
                     MarkedSurvey::Output::ClosedPipe);
        EXPECT_EQ(run.waitForExit(), 128 + SIGPIPE) << run.standardError();
        run.expectEndedCleanly();
    });
}

// A small file system over the VPD folder for as long as the object lives.
class SmallVpdFolder {
public:
    explicit SmallVpdFolder(std::string const& size) {
        std::string const options = "size=" + size;
        if (::mount("quorvex-full", QuorvexTest::gc_VPD_Folder, "tmpfs", 0, options.c_str()) != 0) {
            _problem = std::string("cannot mount a small tmpfs on ") + QuorvexTest::gc_VPD_Folder +
                       ": " + std::strerror(errno);
        }
    }
    ~SmallVpdFolder() {
        if (_problem.empty()) {
            ::umount2(QuorvexTest::gc_VPD_Folder, MNT_DETACH);
        }
    }
    SmallVpdFolder(SmallVpdFolder const&) = delete;
    SmallVpdFolder& operator=(SmallVpdFolder const&) = delete;

    std::string const& problem() const { return _problem; }

private:
    std::string _problem;
};

TEST(FleetFault, FullVpdFolderIsNamedOnStandardErrorWithExit73) {
    repeat([](FaultTimings& timings) {
        SmallVpdFolder const folder("16k");
        ASSERT_EQ(folder.problem(), "");
        int const partitions = timings.wholeBetween(4, 8);
        std::string scenario = listing(partitions) + "[runCmdOnPartition *]\n" + gc_Answer;
        std::string const bulk(static_cast<std::size_t>(timings.wholeBetween(3000, 9000)), 'x');
        scenario += "[getFileFromPartition *]\n" + std::string(gc_Answer) + "document " + bulk +
                    "\ndocument-nolf " + FleetFaultTest::gc_FetchedDocument + "\n";
        FaultRun run(scenario, {"-t", "0", "-j", "2", gc_Identity});
        EXPECT_EQ(run.waitForExit(), 73)
            << "the VPD folder holds:\n"
            << QuorvexTest::runCommand({"/bin/ls", "-l", QuorvexTest::gc_VPD_Folder}).stdoutText;
        std::string const error = run.standardError();
        EXPECT_NE(error.find(std::string(QuorvexTest::gc_VPD_Folder) + "/"), std::string::npos)
            << "no file of the full folder named on standard error:\n"
            << error;
        EXPECT_NE(error.find(std::strerror(ENOSPC)), std::string::npos) << error;
        run.expectNothingLeft();
        EXPECT_EQ(FleetTest::SummaryFile(run.summaryPath()).validationProblems(), "");
    });
}

// Cases that held before the faults above were found, kept so that they go
// on holding: a hung action that daemonises a helper is stopped within the
// limit with everything it started.
TEST(FleetFault, HungActionThatDaemonisesIsStoppedWithinTheLimit) {
    repeat([](FaultTimings& timings) {
        int const partitions = timings.wholeBetween(1, 3);
        FaultRun run(listing(partitions) + "[runCmdOnPartition *]\ndaemon-delay 3600\n" + gc_Hang +
                         fetchAnswer(),
                     {"-t", "1", "-j", "3", gc_Identity});
        double const started = FleetTest::monotonicSeconds();
        EXPECT_EQ(run.waitForExit(), 8) << run.standardError();
        EXPECT_LE(FleetTest::monotonicSeconds() - started, 1.0 + 1.0 + gc_Margin);
        run.expectEndedCleanly();
    });
}

// SIGINT or SIGTERM at any moment of the survey, at any width, once or
// twice (a double Ctrl-C): the first signal decides the exit status.
TEST(FleetFault, SignalDuringTheSurveyAtAnyWidthEndsTheRun) {
    repeat([](FaultTimings& timings) {
        int const partitions = timings.wholeBetween(10, 70);
        int const signalNumber = timings.wholeBetween(0, 1) == 0 ? SIGINT : SIGTERM;
        std::string const jobs = std::vector<std::string>{
            "1", "8", "64"}[static_cast<std::size_t>(timings.wholeBetween(0, 2))];
        std::string scenario = listing(partitions);
        for (int id = 1; id <= partitions; ++id) {
            scenario += clientRun(id, timings.between(0.0, 0.5));
        }
        FaultRun run(scenario + fetchAnswer(), {"-t", "0", "-j", jobs, gc_Identity});
        ASSERT_TRUE(waitForCalls(run.console(), "runCmdOnPartition", 1));
        pause(timings.between(0.0, 1.0));
        run.sendSignal(signalNumber);
        if (timings.wholeBetween(0, 1) == 1) {
            pause(timings.between(0.0, 0.2));
            run.survey().signal(signalNumber);
        }
        run.waitForExit();
        SCOPED_TRACE("at -j " + jobs);
        run.expectSignalCounted();
        run.expectEndedCleanly();
    });
}

// Hung actions that resist being stopped: they ignore the signals, close
// their standard output, rename themselves, fork without end or stop
// themselves, alone or together.
TEST(FleetFault, HungActionsThatMisbehaveAreStoppedWithinTheLimit) {
    std::vector<std::string> const misbehaviours{"ignore-signals", "close-stdout", "rename",
                                                 "fork-storm", "stop-self"};
    repeat([&misbehaviours](FaultTimings& timings) {
        int const partitions = timings.wholeBetween(1, 3);
        std::string scenario = listing(partitions);
        for (int id = 1; id <= partitions; ++id) {
            scenario += "[runCmdOnPartition " + std::to_string(id) + "]\n" + gc_Hang;
            for (std::string const& misbehaviour : misbehaviours) {
                if (timings.wholeBetween(0, 1) == 1) {
                    scenario += "misbehave " + misbehaviour + "\n";
                }
            }
        }
        FaultRun run(scenario + fetchAnswer(), {"-t", "1", "-j", "3", gc_Identity});
        double const started = FleetTest::monotonicSeconds();
        EXPECT_EQ(run.waitForExit(), 8) << run.standardError();
        EXPECT_LE(FleetTest::monotonicSeconds() - started, 1.0 + 1.0 + gc_Margin);
        run.expectEndedCleanly();
    });
}

} // namespace
