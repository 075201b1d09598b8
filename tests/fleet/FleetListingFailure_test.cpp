// A console that cannot list its machines is an error (exit 69, one line
// naming the command, its exit status and the console's first error line,
// the summary's listing_failure), never a console without machines; a
// machine the console does not know keeps the tool's status file and is
// marked listing_failed with the console's message in the summary and the
// report.

#include "FleetTools.h"
#include "QuorvexTest.h"
#include "SummaryFile.h"

#include <gtest/gtest.h>

#include <algorithm>

namespace {

using QuorvexTest::CommandResult;
using QuorvexTest::SimulatedConsole;

constexpr char gc_MachineListingFailed[] = "quorvex-survey: cannot list the managed machines: ";

class FleetListingFailure : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(QuorvexTest::isInsideSandbox());
        QuorvexTest::clearFolder(QuorvexTest::gc_VPD_Folder);
        QuorvexTest::clearFolder(QuorvexTest::gc_TraceFolder);
    }

    std::vector<std::string> _survey(std::vector<std::string> const& arguments) const {
        std::vector<std::string> argv{
            FleetTest::consoleWideTool(), "-q",       "--summary",
            _work.file("summary.json"),   "--report", _work.file("report")};
        argv.insert(argv.end(), arguments.begin(), arguments.end());
        return argv;
    }

    // The run ended with 69, wrote its summary and report, and nothing else.
    void _expectUnavailable(CommandResult const& result, std::string const& failure) const {
        EXPECT_EQ(result.exitStatus, 69);
        EXPECT_EQ(result.stdoutText, "");
        EXPECT_EQ(result.stderrText, gc_MachineListingFailed + failure + "\n");
        EXPECT_TRUE(QuorvexTest::listFolder(QuorvexTest::gc_VPD_Folder).empty());
        FleetTest::SummaryFile const summary(_work.file("summary.json"));
        EXPECT_EQ(summary.validationProblems(), "");
        EXPECT_EQ(summary.field("/exit_status"), "69");
        EXPECT_EQ(summary.field("/machines"), "[]");
        // The report's copy of the summary tells the same exit status.
        EXPECT_EQ(FleetTest::SummaryFile(_work.file("report/summary.json")).field("/exit_status"),
                  "69");
        EXPECT_NE(QuorvexTest::readFile(_work.file("report/partitions.csv"))
                      .find(",listing_failed,,,,,,,/opt/lsvtc/bin/lsvtc -t0"),
                  std::string::npos);
    }

    QuorvexTest::TemporaryDirectory _work;
};

TEST_F(FleetListingFailure, AFailingMachineListingEndsWith69WithTheConsolesFirstErrorLine) {
    SimulatedConsole const console("[lsvtc]\nstdout \nstderr lsvtc: console busy\n"
                                   "stderr second line\nexit 5\n");
    CommandResult const result = QuorvexTest::runCommand(_survey({"--all"}));
    _expectUnavailable(result,
                       "/opt/lsvtc/bin/lsvtc -t0 exited with status 5: lsvtc: console busy");
    FleetTest::SummaryFile const summary(_work.file("summary.json"));
    EXPECT_EQ(summary.field("/listing_failure"),
              R"({"command":"/opt/lsvtc/bin/lsvtc -t0","exit_status":5,)"
              R"("message":"lsvtc: console busy"})");
}

TEST_F(FleetListingFailure, ABadScenarioOfTheConsoleEndsWith69WithItsMessage) {
    SimulatedConsole const console("[lsvtc]\nno-such-key 1\n");
    CommandResult const result = QuorvexTest::runCommand(_survey({"--all"}));
    EXPECT_EQ(result.exitStatus, 69);
    EXPECT_EQ(result.stderrText.rfind(std::string(gc_MachineListingFailed) +
                                          "/opt/lsvtc/bin/lsvtc -t0 exited with status 97: "
                                          "pylon-sim: bad scenario: ",
                                      0),
              0U)
        << result.stderrText;
}

// The tool's status file and streams stay; only the summary and the report
// say what the console answered.
TEST_F(FleetListingFailure, AnIdentityTheConsoleDoesNotKnowIsListingFailedWithTheConsolesText) {
    SimulatedConsole const console(
        QuorvexTest::ScenarioFile{QuorvexTest::shippedScenario("demo.scn")});
    std::string const status =
        QuorvexTest::gc_VPD_Folder + std::string("/quorvexPYLON_VPD_Survey_ClientPartition_");
    CommandResult const tool =
        QuorvexTest::runCommand({FleetTest::oneMachineTool(), "-c", "9119-MHE_21ABCDX"});
    std::string const toolStatus = QuorvexTest::readFile(status + "9119-MHE_21ABCDX.status");
    CommandResult const result = QuorvexTest::runCommand(_survey({"9119-MHE_21ABCDX", "foo"}));
    EXPECT_EQ(result.exitStatus, 8);
    EXPECT_EQ(toolStatus, "No ACTIVE Partition Found.\n");
    EXPECT_EQ(QuorvexTest::readFile(status + "9119-MHE_21ABCDX.status"), toolStatus);
    EXPECT_EQ(QuorvexTest::readFile(status + "foo.status"), toolStatus);
    EXPECT_EQ(result.stderrText, tool.stderrText + tool.stderrText);

    FleetTest::SummaryFile const summary(_work.file("summary.json"));
    EXPECT_EQ(summary.validationProblems(), "");
    EXPECT_EQ(summary.field("/machines/0/listing_failure"),
              R"({"command":"/opt/vtc/bin/lspartition -ix -c 9119-MHE_21ABCDX",)"
              R"("exit_status":1,"message":"lspartition: managed system not found"})");
    // "foo" goes to the console as the one-machine tool sends it.
    EXPECT_EQ(summary.field("/machines/1/listing_failure/message"),
              "\"lspartition: managed system not found\"");
    // The two listings run side by side, in either order.
    std::vector<QuorvexTest::Invocation> const calls = console.invocations();
    EXPECT_NE(std::find(calls.begin(), calls.end(),
                        QuorvexTest::Invocation{"lspartition", "-ix", "-c", "fooERROR_fooERROR"}),
              calls.end());
    std::string const csv = QuorvexTest::readFile(_work.file("report/partitions.csv"));
    EXPECT_NE(csv.find("9119-MHE_21ABCDX,8,,,,,listing_failed,,,,,,,/opt/vtc/bin/lspartition -ix "
                       "-c 9119-MHE_21ABCDX exited with status 1: lspartition: managed system "
                       "not found,,\r\n"),
              std::string::npos)
        << csv;
    EXPECT_NE(QuorvexTest::readFile(_work.file("report/index.html"))
                  .find("<b>listing failed</b>: /opt/vtc/bin/lspartition -ix -c "
                        "9119-MHE_21ABCDX exited with status 1: lspartition: managed system "
                        "not found"),
              std::string::npos);
}

// What the console answered about each identity is what the operator reads
// at the end of the run.
TEST_F(FleetListingFailure, RecapOfUnknownIdentitiesSaysListingFailedWithTheConsolesText) {
    SimulatedConsole const console(
        QuorvexTest::ScenarioFile{QuorvexTest::shippedScenario("demo.scn")});
    CommandResult const result =
        QuorvexTest::runCommand(_survey({"--recap", "9119-MHE_21ABCDX", "foo"}));
    EXPECT_EQ(result.exitStatus, 8);
    EXPECT_NE(result.stderrText.find("\n  failed, by reason:\n"
                                     "    2 listing failed: lspartition: managed system not "
                                     "found (exit status 1)\n"
                                     "      9119-MHE_21ABCDX, foo\n"),
              std::string::npos)
        << result.stderrText;
}

// A machine the console could not list is not surveyed: beside one whose
// every partition was surveyed the run exits 4, as its summary says.
TEST_F(FleetListingFailure, RunWithAnUnknownIdentityBesideASurveyedMachineExits4) {
    SimulatedConsole const console(
        "[lspartition 1234-ABC_10ABCDE]\nstdout 1,10.1.1.11,3,host1,Zeph,7.2;\n"
        "[lspartition *]\nstderr lspartition: managed system not found\nexit 1\n"
        "[runCmdOnPartition *]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
        "[getFileFromPartition *]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
        "document-nolf <fetched/>\n");
    CommandResult const result =
        QuorvexTest::runCommand(_survey({"1234-ABC_10ABCDE", "9119-MHE_21ABCDX"}));
    EXPECT_EQ(result.exitStatus, 4) << result.stderrText;
    FleetTest::SummaryFile const summary(_work.file("summary.json"));
    EXPECT_EQ(summary.field("/machines/0/return_code"), "\"0\"");
    EXPECT_EQ(summary.field("/machines/1/return_code"), "\"8\"");
    EXPECT_EQ(summary.field("/return_code"), "\"4\"");
}

} // namespace
