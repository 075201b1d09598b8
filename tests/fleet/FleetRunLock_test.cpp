// One run per result folder: a second run while the first holds the lock
// says who holds it and exits 75 before any console command, or with --wait
// waits for the first to end; a report folder keeps the previous report.

#include "FleetTools.h"
#include "QuorvexTest.h"
#include "SurveyProcess.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <csignal>
#include <functional>
#include <iterator>
#include <thread>

namespace {

using FleetTest::SurveyProcess;
using QuorvexTest::CommandResult;
using QuorvexTest::SimulatedConsole;

// The partition listing of 1-A_B hangs, holding the first run; --all lists
// no machine, so a run that gets the lock ends at once.
constexpr char gc_HangingConsole[] = "[lsvtc]\nexit 0\n"
                                     "[lspartition 1-A_B]\ndelay 3600\n";
constexpr char gc_LockFile[] = "/var/adm/quorvex/VPD/.quorvex-survey.lock";

// Waits, within a bound, until text holds what.
bool waitForText(std::function<std::string()> const& text, std::string const& what) {
    double const until = FleetTest::monotonicSeconds() + 30.0;
    while (FleetTest::monotonicSeconds() < until) {
        if (text().find(what) != std::string::npos) {
            return true;
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(50));
    }
    return false;
}

// A file the run under test may not have made yet reads as empty.
std::string textSoFar(std::string const& path) {
    return QuorvexTest::fileExists(path) ? QuorvexTest::readFile(path) : std::string();
}

class FleetRunLock : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(QuorvexTest::isInsideSandbox());
        QuorvexTest::clearFolder(QuorvexTest::gc_VPD_Folder);
        QuorvexTest::clearFolder(QuorvexTest::gc_TraceFolder);
    }

    // The first run, which hangs in the listing of 1-A_B once it holds the lock.
    SurveyProcess _first() const {
        return SurveyProcess({FleetTest::consoleWideTool(), "-q", "1-A_B"}, _work.file("stdout1"),
                             _work.file("stderr1"));
    }

    QuorvexTest::TemporaryDirectory _work;
};

TEST_F(FleetRunLock, ASecondRunNamesTheFirstAndExits75WithoutCallingTheConsole) {
    SimulatedConsole const console(gc_HangingConsole);
    SurveyProcess first = _first();
    ASSERT_TRUE(waitForText([&console] { return console.logText(); }, "lspartition"));
    std::string const holder = "PID " + std::to_string(first.pid()) + ", started ";
    EXPECT_EQ(QuorvexTest::readFile(gc_LockFile).rfind(holder, 0), 0U);

    CommandResult const second = QuorvexTest::runCommand({FleetTest::consoleWideTool(), "--all"});
    EXPECT_EQ(second.exitStatus, 75);
    EXPECT_EQ(second.stdoutText, "");
    std::string const expected =
        "quorvex-survey: another run uses the result folder /var/adm/quorvex/VPD: " + holder;
    EXPECT_EQ(second.stderrText.rfind(expected, 0), 0U) << second.stderrText;
    EXPECT_NE(second.stderrText.find(" (lock file /var/adm/quorvex/VPD/.quorvex-survey.lock); "
                                     "try again later, or use --wait\n"),
              std::string::npos)
        << second.stderrText;
    EXPECT_EQ(console.invocations().size(), 1U) << "the second run called the console";

    first.signal(SIGTERM);
    EXPECT_EQ(first.waitForExit(30.0), 128 + SIGTERM);
    EXPECT_FALSE(QuorvexTest::fileExists(gc_LockFile)) << "the folder keeps the lock file";
}

TEST_F(FleetRunLock, WithWaitASecondRunGoesOnOnceTheFirstHasEnded) {
    SimulatedConsole const console(gc_HangingConsole);
    SurveyProcess first = _first();
    ASSERT_TRUE(waitForText([&console] { return console.logText(); }, "lspartition"));
    SurveyProcess second({FleetTest::consoleWideTool(), "--all", "--wait"}, _work.file("stdout2"),
                         _work.file("stderr2"));
    ASSERT_TRUE(waitForText([this] { return textSoFar(_work.file("stderr2")); },
                            "quorvex-survey: waiting for the run that uses /var/adm/quorvex/VPD "
                            "(PID " +
                                std::to_string(first.pid()) + ", started "));
    EXPECT_EQ(console.invocations().size(), 1U) << "the waiting run called the console";

    first.signal(SIGTERM);
    EXPECT_EQ(first.waitForExit(30.0), 128 + SIGTERM);
    EXPECT_EQ(second.waitForExit(30.0), 8) << "-1: the waiting run never went on";
    EXPECT_EQ(console.invocations().back(), (QuorvexTest::Invocation{"lsvtc", "-t0"}));
}

TEST_F(FleetRunLock, ASignalEndsTheWait) {
    SimulatedConsole const console(gc_HangingConsole);
    SurveyProcess first = _first();
    ASSERT_TRUE(waitForText([&console] { return console.logText(); }, "lspartition"));
    SurveyProcess second({FleetTest::consoleWideTool(), "--all", "--wait"}, _work.file("stdout2"),
                         _work.file("stderr2"));
    ASSERT_TRUE(
        waitForText([this] { return textSoFar(_work.file("stderr2")); }, "waiting for the run"));
    second.signal(SIGINT);
    EXPECT_EQ(second.waitForExit(30.0), 128 + SIGINT);
    EXPECT_EQ(console.invocations().size(), 1U) << "the interrupted wait called the console";
    EXPECT_TRUE(QuorvexTest::fileExists(gc_LockFile))
        << "the waiting run removed the holder's lock";

    // Ended as a run ends, with every process it started.
    first.signal(SIGTERM);
    EXPECT_EQ(first.waitForExit(30.0), 128 + SIGTERM);
}

TEST_F(FleetRunLock, ASecondReportIntoTheSameFolderKeepsTheFirst) {
    SimulatedConsole const console("[lsvtc]\nstdout 0:1-A_B;\n[lspartition *]\nexit 0\n");
    std::vector<std::string> const survey{FleetTest::consoleWideTool(), "--all", "--report",
                                          _work.file("report")};
    ASSERT_EQ(QuorvexTest::runCommand(survey).exitStatus, 8);
    std::string const firstPage = QuorvexTest::readFile(_work.file("report/index.html"));
    ASSERT_EQ(QuorvexTest::runCommand(survey).exitStatus, 8);
    std::vector<std::string> const names = QuorvexTest::listFolder(_work.file("report"));
    std::vector<std::string> kept;
    std::copy_if(names.begin(), names.end(), std::back_inserter(kept),
                 [](std::string const& name) { return name.rfind("index-", 0) == 0; });
    ASSERT_EQ(kept.size(), 1U);
    EXPECT_EQ(QuorvexTest::readFile(_work.file("report/" + kept.front())), firstPage);
    // Three files of each report, and the documents' folder.
    EXPECT_EQ(QuorvexTest::listFolder(_work.file("report")).size(), 7U);
}

} // namespace
