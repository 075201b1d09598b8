// Runs quorvex-survey as a whole inside the sandbox of this test program,
// beside the single-machine tool where their outputs must agree.

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

using QuorvexTest::CommandResult;

constexpr char const* gc_VPD_Folder = QuorvexTest::gc_VPD_Folder;
constexpr char const* gc_Trace_Folder = QuorvexTest::gc_TraceFolder;
constexpr char gc_Machine[] = "9119-MHE_21ABCDE";
constexpr char gc_StatusFile[] =
    "/var/adm/quorvex/VPD/quorvexPYLON_VPD_Survey_ClientPartition_9119-MHE_21ABCDE.status";
constexpr char gc_Console[] =
    "[lspartition *]\n"
    "stdout 1,10.1.1.11,3,host1,Zeph,7.1;2,10.1.1.12,3,host2,Zeph,7.2;3,10.1.1.13,1,host3,Zeph,7;\n"
    "[runCmdOnPartition *]\n"
    "stdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
    "[getFileFromPartition *]\n"
    "stdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
    "document-nolf <fetched/>\n";
// Partition 2's client run hangs and leaves a helper process behind.
constexpr char gc_HangingClient[] = "[runCmdOnPartition 2]\n"
                                    "stdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
                                    "delay 60\n"
                                    "child-delay 120\n";

CommandResult runSurvey(std::vector<std::string> const& arguments) {
    std::vector<std::string> command{QUORVEX_SURVEY_PROGRAM};
    command.insert(command.end(), arguments.begin(), arguments.end());
    return QuorvexTest::runCommand(command);
}

CommandResult runSingleMachineTool(std::string const& identity) {
    return QuorvexTest::runCommand({QUORVEX_SURVEY_TOOL, "-c", identity});
}

class SurveyProgram : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(QuorvexTest::isInsideSandbox());
        QuorvexTest::clearFolder(gc_VPD_Folder);
        QuorvexTest::clearFolder(gc_Trace_Folder);
    }
};

TEST_F(SurveyProgram, BadCommandLineExits64WithItsReasonAndRunsNothing) {
    struct Refusal {
        std::vector<std::string> arguments;
        std::string reason;
    };
    for (auto const& refusal : std::vector<Refusal>{
             {{}, "no machine to survey: give identities (type-model_serial) or --all"},
             {{"-j", "0", gc_Machine}, "-j/--jobs takes a whole number from 1 to 1024, not '0'"},
             {{"--all", gc_Machine},
              "--all and identities exclude each other: give either --all or identities"},
             {{"--bogus", gc_Machine}, "unknown option --bogus"}}) {
        QuorvexTest::SimulatedConsole const console(gc_Console);
        CommandResult const result = runSurvey(refusal.arguments);
        EXPECT_EQ(result.exitStatus, 64);
        EXPECT_EQ(result.stdoutText, "");
        EXPECT_EQ(result.stderrText,
                  "quorvex-survey: " + refusal.reason + " (try 'quorvex-survey --help')\n");
        EXPECT_TRUE(console.invocations().empty());
        EXPECT_TRUE(QuorvexTest::listFolder(gc_VPD_Folder).empty());
        EXPECT_TRUE(QuorvexTest::listFolder(gc_Trace_Folder).empty());
    }
}

TEST_F(SurveyProgram, MachineGivenTwiceWarnsFirstThenPrintsWhatTheToolPrintsOnce) {
    QuorvexTest::SimulatedConsole const console(gc_Console);
    CommandResult const single = runSingleMachineTool(gc_Machine);
    std::string const status = QuorvexTest::readFile(gc_StatusFile);
    QuorvexTest::clearFolder(gc_VPD_Folder);

    CommandResult const result = runSurvey({"-q", "-j", "4", gc_Machine, gc_Machine});
    EXPECT_EQ(result.exitStatus, 4);
    EXPECT_EQ(result.stdoutText, single.stdoutText);
    EXPECT_EQ(result.stderrText,
              std::string("quorvex-survey: warning: 9119-MHE_21ABCDE given more than once, "
                          "surveyed once\n") +
                  single.stderrText);
    EXPECT_EQ(QuorvexTest::readFile(gc_StatusFile), status);
}

TEST_F(SurveyProgram, HungClientRunIsStoppedAndRecordedAsAnActionThatPrintedNothing) {
    QuorvexTest::SimulatedConsole const console(std::string(gc_HangingClient) + gc_Console);
    QuorvexTest::TemporaryDirectory const folder;
    std::string const summary = folder.file("summary.json");
    CommandResult const result = runSurvey({"-t", "1", "--summary", summary, gc_Machine});
    EXPECT_EQ(result.exitStatus, 4);
    EXPECT_EQ(QuorvexTest::readFile(gc_StatusFile),
              "host1 [10.1.1.11] - VPD Survey - Ok\n"
              "host2 [10.1.1.12] - VPD Survey - RELAY Failed, rc = 4294967295\n"
              "host3 [10.1.1.13] - VPD Survey - Failed - Active Status < 3\n");
    std::string const document = QuorvexTest::readFile(
        "/var/adm/quorvex/VPD/quorvexPYLON_VPD_Survey_ClientPartition_9119-MHE_21ABCDE-2.VPD.xml");
    EXPECT_NE(document.find("Stopped by the time limit of 1 s after 1."), std::string::npos);
    std::string const trace =
        QuorvexTest::readFile("/var/adm/quorvex/Trace/"
                              "quorvexPYLON_VPD_Survey_ClientPartition_9119-MHE_21ABCDE.Trace");
    EXPECT_NE(trace.find("\nStopped by the time limit of 1 s after 1."), std::string::npos);
    std::string const json = QuorvexTest::readFile(summary);
    EXPECT_NE(json.find("\"outcome\": \"timed_out\""), std::string::npos);
    EXPECT_NE(json.find("\"action\": \"runCmdOnPartition\""), std::string::npos);
}

// The summary's folder is made as the report's is; the streams stay the tool's.
TEST_F(SurveyProgram, SummaryInAMissingFolderIsWrittenThereAndTheStreamsStayTheTools) {
    QuorvexTest::SimulatedConsole const console(gc_Console);
    CommandResult const single = runSingleMachineTool(gc_Machine);
    QuorvexTest::clearFolder(gc_VPD_Folder);
    QuorvexTest::TemporaryDirectory const folder;
    std::string const summary = folder.file("missing/summary.json");

    CommandResult const result = runSurvey({"-q", "--summary", summary, gc_Machine});
    EXPECT_EQ(result.stdoutText, single.stdoutText);
    EXPECT_EQ(result.stderrText, single.stderrText);
    EXPECT_EQ(result.exitStatus, 4);
    EXPECT_TRUE(QuorvexTest::fileExists(summary));
}

TEST_F(SurveyProgram, TraceOfEachMachineIsKeptUnderItsOwnNameAndNoPieceIsLeft) {
    QuorvexTest::SimulatedConsole const console(gc_Console);
    CommandResult const result = runSurvey({"-j", "8", gc_Machine, "8286-42A_10XYZ99"});
    EXPECT_EQ(result.exitStatus, 4);
    EXPECT_EQ(QuorvexTest::listFolder(gc_Trace_Folder),
              (std::vector<std::string>{
                  "quorvexPYLON_VPD_Survey_ClientPartition_8286-42A_10XYZ99.Trace",
                  "quorvexPYLON_VPD_Survey_ClientPartition_9119-MHE_21ABCDE.Trace"}));
}

} // namespace
