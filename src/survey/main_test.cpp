// Runs the built tool as a whole, inside the sandbox of this test program.

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

using QuorvexTest::CommandResult;

using QuorvexTest::gc_VPD_Folder;
constexpr char gc_TraceFile[] =
    "/var/adm/quorvex/Trace/quorvexPYLON_VPD_Survey_ClientPartition.Trace";
using QuorvexTest::gc_ReturnCodeHeading;
constexpr char gc_FirstTraceLine[] = "PYLON_VPD_Survey_ClientPartition::main\n";
constexpr char gc_Listing[] = "[lspartition *]\n"
                              "stdout 2,10.1.1.12,3,host2,Zeph,7.1;3,10.1.1.13,3,host3,Zeph,7.2;\n";

CommandResult u_run_Tool(std::vector<std::string> const& arguments) {
    std::vector<std::string> command{QUORVEX_SURVEY_TOOL};
    command.insert(command.end(), arguments.begin(), arguments.end());
    return QuorvexTest::runCommand(command);
}

class SurveyTool : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(QuorvexTest::isInsideSandbox());
        QuorvexTest::clearFolder(gc_VPD_Folder);
    }

    // A bad command line: exit 255, nothing printed, no file but the trace's first line.
    static void expect_Rejected(std::vector<std::string> const& arguments) {
        QuorvexTest::SimulatedConsole const console(gc_Listing);
        CommandResult const result = u_run_Tool(arguments);
        EXPECT_EQ(result.exitStatus, 255);
        EXPECT_EQ(result.stdoutText, "");
        EXPECT_EQ(result.stderrText, "");
        EXPECT_EQ(QuorvexTest::readFile(gc_TraceFile), gc_FirstTraceLine);
        EXPECT_TRUE(QuorvexTest::listFolder(gc_VPD_Folder).empty());
        EXPECT_TRUE(console.invocations().empty());
    }
};

TEST_F(SurveyTool, CommandLineOfOnlyMachineOptionExitsWith255) {
    expect_Rejected({"-c"});
}

TEST_F(SurveyTool, MachineOptionFollowedByAnotherOptionExitsWith255) {
    expect_Rejected({"-c", "-x", "1234-ABC_10ABCDE"});
}

TEST_F(SurveyTool, EmptyMachineValueExitsWith255) {
    expect_Rejected({"-c", ""});
}

TEST_F(SurveyTool, MissingMachineOptionExitsWith255) {
    expect_Rejected({});
    expect_Rejected({"1234-ABC_10ABCDE"});
}

TEST_F(SurveyTool, FirstOfTwoMachineOptionsIsTheMachineSurveyed) {
    QuorvexTest::SimulatedConsole const console("");
    CommandResult const result = u_run_Tool({"-c", "1111-AAA_FIRST", "-c", "2222-BBB_SECOND"});
    EXPECT_EQ(result.exitStatus, 2);
    EXPECT_EQ(console.invocations(), (std::vector<QuorvexTest::Invocation>{
                                         {"lspartition", "-ix", "-c", "1111-AAA_FIRST"}}));
    EXPECT_EQ(QuorvexTest::listFolder(gc_VPD_Folder),
              (std::vector<std::string>{
                  "quorvexPYLON_VPD_Survey_ClientPartition_1111-AAA_FIRST.status"}));
}

TEST_F(SurveyTool, PlainArgumentBeforeMachineOptionIsIgnored) {
    QuorvexTest::SimulatedConsole const console("");
    CommandResult const result = u_run_Tool({"extra", "-c", "1234-ABC_10ABCDE"});
    EXPECT_EQ(result.exitStatus, 2);
    EXPECT_EQ(result.stderrText, std::string(gc_ReturnCodeHeading) + "8");
    EXPECT_EQ(console.invocations(), (std::vector<QuorvexTest::Invocation>{
                                         {"lspartition", "-ix", "-c", "1234-ABC_10ABCDE"}}));
}

TEST_F(SurveyTool, ExitsWithTwoEvenWhenEveryPartitionFailed) {
    QuorvexTest::SimulatedConsole const console(std::string(gc_Listing) +
                                                "[runCmdOnPartition *]\nexit 1\n");
    CommandResult const result = u_run_Tool({"-c", "1234-ABC_10ABCDE"});
    EXPECT_EQ(result.exitStatus, 2);
    EXPECT_EQ(result.stderrText, std::string("8\n8\n") + gc_ReturnCodeHeading + "8");
}

TEST_F(SurveyTool, ExitsWithTwoWhenEveryPartitionWasSurveyed) {
    QuorvexTest::SimulatedConsole const console(
        std::string(gc_Listing) +
        "[runCmdOnPartition *]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
        "[getFileFromPartition *]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n");
    CommandResult const result = u_run_Tool({"-c", "1234-ABC_10ABCDE"});
    EXPECT_EQ(result.exitStatus, 2);
    EXPECT_EQ(result.stderrText, std::string("0\n0\n") + gc_ReturnCodeHeading + "0");
}

TEST_F(SurveyTool, NamesAndCodesInterleavePerPartitionWhenBothStreamsShareAFile) {
    QuorvexTest::SimulatedConsole const console(
        std::string(gc_Listing) +
        "[runCmdOnPartition 2]\nstdout Rc::1::RcCmd::0::RetStr1::timeout::RetStr2::\nexit 1\n"
        "[runCmdOnPartition 3]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
        "[getFileFromPartition 3]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n");
    CommandResult const result =
        QuorvexTest::runShell(std::string(QUORVEX_SURVEY_TOOL) + " -c 1234-ABC_10ABCDE 2>&1 | cat");
    EXPECT_EQ(result.stdoutText,
              std::string("VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE-2.VPD.xml\n"
                          "8\n"
                          "VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE-3.VPD.xml\n"
                          "0\n") +
                  gc_ReturnCodeHeading + "4");
}

} // namespace
