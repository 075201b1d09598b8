#include "survey/VPD_Survey_ClientPartition.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

using QuorvexTest::Invocation;

using QuorvexTest::gc_VPD_Folder;
constexpr char gc_StatusFile[] =
    "/var/adm/quorvex/VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE.status";
using QuorvexTest::gc_ReturnCodeHeading;
constexpr char gc_LocalPrefix[] = "VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE-";

constexpr char gc_ConsoleAnswersEverything[] = "[runCmdOnPartition *]\n"
                                               "stdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
                                               "[getFileFromPartition *]\n"
                                               "stdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
                                               "document-nolf <fetched/>\n";

std::string u_local_File(std::string const& id) {
    return gc_LocalPrefix + id + ".VPD.xml";
}

// What one run left behind: its standard streams, status file and console calls.
struct SurveyRun {
    std::string stdoutText;
    std::string stderrText;
    std::string status;
    std::vector<Invocation> calls;
};

// Surveys machineIdentity in a child process, against a console answering
// as scenario says.
SurveyRun u_run_Survey(std::string const& scenario, std::string const& machineIdentity) {
    QuorvexTest::SimulatedConsole const console(scenario);
    QuorvexTest::CommandResult const child = QuorvexTest::runInChild([&machineIdentity]() {
        VPD_Survey_ClientPartition(machineIdentity);
        return 0;
    });
    EXPECT_EQ(child.exitStatus, 0);
    std::string const statusFile = std::string(gc_VPD_Folder) +
                                   "/quorvexPYLON_VPD_Survey_ClientPartition_" + machineIdentity +
                                   ".status";
    std::string const status =
        QuorvexTest::fileExists(statusFile) ? QuorvexTest::readFile(statusFile) : "<missing>";
    return {child.stdoutText, child.stderrText, status, console.invocations()};
}

class VPD_Survey_ClientPartition_Run : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(QuorvexTest::isInsideSandbox());
        QuorvexTest::clearFolder(gc_VPD_Folder);
    }
};

TEST_F(VPD_Survey_ClientPartition_Run, AllPartitionsSurveyedEndsStandardErrorWithZero) {
    SurveyRun const run = u_run_Survey(std::string("[lspartition 1234-ABC_10ABCDE]\n"
                                                   "stdout 1,10.1.1.11,3,host1,Zeph,7.1;"
                                                   "2,10.1.1.12,3,host2,Zeph,7.2;\n") +
                                           gc_ConsoleAnswersEverything,
                                       "1234-ABC_10ABCDE");
    EXPECT_EQ(run.stdoutText, u_local_File("1") + "\n" + u_local_File("2") + "\n");
    EXPECT_EQ(run.stderrText, std::string("0\n0\n") + gc_ReturnCodeHeading + "0");
    EXPECT_EQ(run.status, "host1 [10.1.1.11] - VPD Survey - Ok\n"
                          "host2 [10.1.1.12] - VPD Survey - Ok\n");
}

TEST_F(VPD_Survey_ClientPartition_Run, SomePartitionsFailedEndsStandardErrorWithFour) {
    SurveyRun const run =
        u_run_Survey(std::string("[lspartition 1234-ABC_10ABCDE]\n"
                                 "stdout 1,10.1.1.11,3,host1,Zeph,7.1;"
                                 "2,10.1.1.12,3,host2,Zeph,7.2;\n"
                                 "[runCmdOnPartition 1]\n"
                                 "stdout Rc::0::RcCmd::5::RetStr1::x::RetStr2::\n") +
                         gc_ConsoleAnswersEverything,
                     "1234-ABC_10ABCDE");
    EXPECT_EQ(run.stdoutText, u_local_File("1") + "\n" + u_local_File("2") + "\n");
    EXPECT_EQ(run.stderrText, std::string("8\n0\n") + gc_ReturnCodeHeading + "4");
    EXPECT_EQ(run.status, "host1 [10.1.1.11] - VPD Survey - Partition Failed, RcCmd = 5\n"
                          "host2 [10.1.1.12] - VPD Survey - Ok\n");
}

TEST_F(VPD_Survey_ClientPartition_Run, AllPartitionsFailedEndsStandardErrorWithEight) {
    SurveyRun const run =
        u_run_Survey("[lspartition 1234-ABC_10ABCDE]\n"
                     "stdout 1,10.1.1.11,3,host1,Zeph,7.1;2,10.1.1.12,1,host2,Zeph,7.2;\n"
                     "[runCmdOnPartition *]\nexit 1\n",
                     "1234-ABC_10ABCDE");
    EXPECT_EQ(run.stdoutText, u_local_File("1") + "\n");
    EXPECT_EQ(run.stderrText, std::string("8\n") + gc_ReturnCodeHeading + "8");
    EXPECT_EQ(run.status, "host1 [10.1.1.11] - VPD Survey - RELAY Failed, rc = 4294967295\n"
                          "host2 [10.1.1.12] - VPD Survey - Failed - Active Status < 3\n");
}

TEST_F(VPD_Survey_ClientPartition_Run, NoPartitionListedWritesNoActivePartitionFoundAndEight) {
    SurveyRun const run = u_run_Survey("", "1234-ABC_10ABCDE");
    EXPECT_EQ(run.stdoutText, "");
    EXPECT_EQ(run.stderrText, std::string(gc_ReturnCodeHeading) + "8");
    EXPECT_EQ(run.status, "No ACTIVE Partition Found.\n");
    EXPECT_EQ(run.calls,
              (std::vector<Invocation>{{"lspartition", "-ix", "-c", "1234-ABC_10ABCDE"}}));
}

TEST_F(VPD_Survey_ClientPartition_Run, FailingListingCountsAsNoPartition) {
    SurveyRun const run = u_run_Survey("[lspartition *]\n"
                                       "stdout 1,10.1.1.11,3,host1,Zeph,7.1;\n"
                                       "stderr lspartition: unknown managed system\n"
                                       "exit 1\n"
                                       "[lspartition 1234-ABC_10ABCDE]\n"
                                       "stderr lspartition: unknown managed system\n"
                                       "exit 1\n",
                                       "1234-ABC_10ABCDE");
    EXPECT_EQ(run.stdoutText, "");
    EXPECT_EQ(run.stderrText, std::string(gc_ReturnCodeHeading) + "8");
    EXPECT_EQ(run.status, "No ACTIVE Partition Found.\n");
}

TEST_F(VPD_Survey_ClientPartition_Run, InactivePartitionHasNoOutputLinesButAStatusLine) {
    SurveyRun const run = u_run_Survey("[lspartition 1234-ABC_10ABCDE]\n"
                                       "stdout 1,10.1.1.11,2,host1,Zeph,7.1;\n",
                                       "1234-ABC_10ABCDE");
    EXPECT_EQ(run.stdoutText, "");
    EXPECT_EQ(run.stderrText, std::string(gc_ReturnCodeHeading) + "8");
    EXPECT_EQ(run.status, "host1 [10.1.1.11] - VPD Survey - Failed - Active Status < 3\n");
    EXPECT_EQ(run.calls.size(), 1u);
}

TEST_F(VPD_Survey_ClientPartition_Run, StatusLineOfAPartitionWithoutHostNameStartsWithABlank) {
    SurveyRun const run = u_run_Survey("[lspartition 1234-ABC_10ABCDE]\n"
                                       "stdout 1,10.1.1.11,1,,Zeph,7.1;\n",
                                       "1234-ABC_10ABCDE");
    EXPECT_EQ(run.status, " [10.1.1.11] - VPD Survey - Failed - Active Status < 3\n");
}

TEST_F(VPD_Survey_ClientPartition_Run, PartitionsAreSurveyedInListingOrder) {
    SurveyRun const run = u_run_Survey(std::string("[lspartition 1234-ABC_10ABCDE]\n"
                                                   "stdout 9,10.1.1.19,3,host9,Zeph,7.1;"
                                                   "10,10.1.1.20,3,host10,Zeph,7.2;\n") +
                                           gc_ConsoleAnswersEverything,
                                       "1234-ABC_10ABCDE");
    EXPECT_EQ(run.stdoutText, u_local_File("9") + "\n" + u_local_File("10") + "\n");
    EXPECT_EQ(run.status, "host9 [10.1.1.19] - VPD Survey - Ok\n"
                          "host10 [10.1.1.20] - VPD Survey - Ok\n");
}

TEST_F(VPD_Survey_ClientPartition_Run, OnlyThePartitionListingOfTheNamedMachineIsRun) {
    SurveyRun const run = u_run_Survey("[lsvtc]\nstdout 0:1234-ABC_10ABCDE;0:5678-DEF_65XYZ12;\n",
                                       "1234-ABC_10ABCDE");
    EXPECT_EQ(run.calls,
              (std::vector<Invocation>{{"lspartition", "-ix", "-c", "1234-ABC_10ABCDE"}}));
}

TEST_F(VPD_Survey_ClientPartition_Run, StatusFileOfAnEarlierRunIsRewritten) {
    QuorvexTest::writeFile(gc_StatusFile, "an earlier run's lines\nmore\nand more\n");
    SurveyRun const run = u_run_Survey("", "1234-ABC_10ABCDE");
    EXPECT_EQ(run.status, "No ACTIVE Partition Found.\n");
}

TEST_F(VPD_Survey_ClientPartition_Run, IdentityWithoutDashIsListedAsMarkedButNamesTheStatusFile) {
    SurveyRun const run = u_run_Survey("[lspartition 1234MMAERROR_10ABCDEERROR]\n"
                                       "stdout 2,10.1.1.12,3,host2,Zeph,7.2;\n"
                                       "[runCmdOnPartition *]\nexit 1\n",
                                       "1234MMA_10ABCDE");
    EXPECT_EQ(run.calls.front(),
              (Invocation{"lspartition", "-ix", "-c", "1234MMAERROR_10ABCDEERROR"}));
    EXPECT_EQ(run.stdoutText, "VPD/quorvexPYLON_VPD_Survey_ClientPartition_"
                              "1234MMAERROR_10ABCDEERROR-2.VPD.xml\n");
    EXPECT_EQ(run.stderrText, std::string("8\n") + gc_ReturnCodeHeading + "8");
    EXPECT_EQ(run.status, "host2 [10.1.1.12] - VPD Survey - RELAY Failed, rc = 4294967295\n");
    EXPECT_EQ(QuorvexTest::listFolder(gc_VPD_Folder),
              (std::vector<std::string>{
                  "quorvexPYLON_VPD_Survey_ClientPartition_1234MMA_10ABCDE.status"}));
}

} // namespace
