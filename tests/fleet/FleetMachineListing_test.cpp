// The console's list of managed machines (--all) when its listing hangs: an
// interruption and the time limit each stop the listing with everything it
// started, and the run ends at once with no machines, writing nothing but
// its summary; past the time limit the listing has failed (exit 69).

#include "FleetTools.h"
#include "LeftProcesses.h"
#include "QuorvexTest.h"
#include "SummaryFile.h"
#include "SurveyProcess.h"

#include <gtest/gtest.h>

#include <csignal>
#include <thread>

namespace {

using FleetTest::SurveyProcess;
using QuorvexTest::SimulatedConsole;

// The listing waits an hour and leaves a helper waiting an hour.
constexpr char gc_HungListing[] = "[lsvtc]\nchild-delay 3600\ndelay 3600\n";
// Generous: a run that hangs never ends within it.
constexpr double gc_Margin = 3.0;

class FleetMachineListing : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(QuorvexTest::isInsideSandbox());
        QuorvexTest::clearFolder(QuorvexTest::gc_VPD_Folder);
        QuorvexTest::clearFolder(QuorvexTest::gc_TraceFolder);
    }

    // quorvex-survey --all with these options; its output goes to files in _work.
    SurveyProcess _startSurvey(std::vector<std::string> const& options) const {
        std::vector<std::string> argv{FleetTest::consoleWideTool(), "--all", "--summary",
                                      _work.file("summary.json")};
        argv.insert(argv.end(), options.begin(), options.end());
        return SurveyProcess(argv, _work.file("stdout"), _work.file("stderr"));
    }

    // The run wrote nothing but its summary (and errors, one line each) and
    // left no process running.
    void _expectNothingWrittenOrLeft(SimulatedConsole const& console,
                                     std::string const& errors = "") const {
        EXPECT_EQ(QuorvexTest::readFile(_work.file("stdout")), "");
        EXPECT_EQ(QuorvexTest::readFile(_work.file("stderr")), errors);
        EXPECT_TRUE(QuorvexTest::listFolder(QuorvexTest::gc_VPD_Folder).empty());
        EXPECT_TRUE(QuorvexTest::listFolder(QuorvexTest::gc_TraceFolder).empty());
        EXPECT_EQ(FleetTest::processesOfConsole(console.logPath()), std::vector<std::string>{})
            << "processes of the stopped listing left running";
    }

    QuorvexTest::TemporaryDirectory _work;
};

// Waits until the console has received the machine listing.
bool waitForListing(SimulatedConsole const& console) {
    double const until = FleetTest::monotonicSeconds() + 30.0;
    while (FleetTest::monotonicSeconds() < until) {
        if (console.logText().rfind("lsvtc", 0) == 0) {
            return true;
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(50));
    }
    return false;
}

TEST_F(FleetMachineListing, SigtermDuringAHungListingEndsTheRunPromptly) {
    SimulatedConsole const console(gc_HungListing);
    SurveyProcess survey = _startSurvey({});
    ASSERT_TRUE(waitForListing(console)) << "the machines were never listed";
    std::this_thread::sleep_for(std::chrono::milliseconds(200));
    double const signalled = FleetTest::monotonicSeconds();
    survey.signal(SIGTERM);
    EXPECT_EQ(survey.waitForExit(30.0), 128 + SIGTERM) << "-1: the run hung and was killed";
    EXPECT_LE(FleetTest::monotonicSeconds() - signalled, gc_Margin);
    _expectNothingWrittenOrLeft(console);

    FleetTest::SummaryFile const summary(_work.file("summary.json"));
    EXPECT_EQ(summary.validationProblems(), "");
    EXPECT_EQ(summary.field("/interrupted"), "\"SIGTERM\"");
    EXPECT_EQ(summary.field("/exit_status"), std::to_string(128 + SIGTERM));
}

TEST_F(FleetMachineListing, ListingHungPastTheTimeLimitIsStoppedAndTheRunFailsWith69) {
    SimulatedConsole const console(gc_HungListing);
    SurveyProcess survey = _startSurvey({"-t", "1"});
    int const status = survey.waitForExit(30.0);
    EXPECT_EQ(status, 69) << "-1: the run hung and was killed";
    EXPECT_LE(survey.secondsTaken(), 1.0 + 1.0 + gc_Margin) << "the run waited for the listing";
    _expectNothingWrittenOrLeft(console, "quorvex-survey: cannot list the managed machines: "
                                         "/opt/lsvtc/bin/lsvtc -t0: stopped after the time "
                                         "limit of 1 s\n");

    FleetTest::SummaryFile const summary(_work.file("summary.json"));
    EXPECT_EQ(summary.validationProblems(), "");
    EXPECT_EQ(summary.field("/interrupted"), "null");
    EXPECT_EQ(summary.field("/listing_failure"),
              R"({"command":"/opt/lsvtc/bin/lsvtc -t0","exit_status":null,)"
              R"("message":"stopped after the time limit of 1 s"})");
}

} // namespace
