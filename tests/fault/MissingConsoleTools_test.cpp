// A console tool missing: the shell answers 127 with its complaint on
// standard error and nothing on standard output. Without the partition
// listing tool the listing is empty; without the remote action tool every
// tried partition fails at the channel with the blank return code (-1, shown
// as 4294967295), gets its default document, and every listed partition
// still gets its status line.

#include "FaultRun.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

constexpr char gc_Listing[] = "/opt/vtc/bin/lspartition";
constexpr char gc_RemoteAction[] = "/usr/bin/runact-api";
constexpr char gc_Expected[] = QUORVEX_FAULT_EXPECTED "/runact-api-missing";
constexpr char gc_Prefix[] = "quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE";

// Partition 1 and 3 (without host name) are tried, 2 is inactive.
constexpr char gc_Console[] =
    "[lspartition 1234-ABC_10ABCDE]\n"
    "stdout 1,10.1.1.11,3,host1,Zeph,7.2;2,10.1.1.12,1,host2,Zeph,7.2;3,10.1.1.13,3,,Zeph,7.3;\n"
    "[runCmdOnPartition *]\n"
    "stdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n";

class MissingConsoleTool : public ::testing::Test {
protected:
    MissingConsoleTool() : run(gc_Console) {}

    // False when no sandbox can be made: the test is skipped. A tool that
    // lies on the host would show through the sandbox; that is checked first.
    bool runWithout(std::string const& tool) {
        EXPECT_FALSE(QuorvexTest::fileExists(tool)) << "the host has " << tool;
        run.removeTool(tool);
        result = run.run("1234-ABC_10ABCDE");
        return FaultRun::ranInSandbox(result);
    }

    FaultRun run;
    QuorvexTest::CommandResult result;
};

TEST_F(MissingConsoleTool, MissingListingToolGives127AndNoPartition) {
    if (!runWithout(gc_Listing)) {
        return;
    }
    EXPECT_EQ(result.exitStatus, 2);
    EXPECT_EQ(result.stdoutText, "");
    EXPECT_EQ(result.stderrText, "\nquorvexPYLON_VPD_Survey_ClientPartition ReturnCode: \n8");
    ASSERT_EQ(run.vpdFiles(), std::vector<std::string>{std::string(gc_Prefix) + ".status"});
    EXPECT_EQ(run.vpdFile(std::string(gc_Prefix) + ".status"), "No ACTIVE Partition Found.\n");
    ASSERT_TRUE(run.hasTrace());
    EXPECT_EQ(run.trace(), "PYLON_VPD_Survey_ClientPartition::main\n"
                           "\n"
                           "****** ShellCommand::execute ******\n"
                           "/opt/vtc/bin/lspartition -ix -c 1234-ABC_10ABCDE"
                           " > /tmp/ShellCommand.aaaaaa 2> /tmp/ShellCommand.bbbbbb\n"
                           "RC = 127\n"
                           "STDOUT\n"
                           "\n"
                           "STDERR\n"
                           "sh: 1: /opt/vtc/bin/lspartition: not found\n"
                           "\n"
                           "\n"
                           "\n");
    EXPECT_EQ(run.calls(), "");
    EXPECT_EQ(run.leftInTmp(), std::vector<std::string>{});
}

TEST_F(MissingConsoleTool, MissingRemoteActionToolFailsEveryTriedPartitionAtTheChannel) {
    if (!runWithout(gc_RemoteAction)) {
        return;
    }
    EXPECT_EQ(result.exitStatus, 2);
    EXPECT_EQ(result.stdoutText, "VPD/" + std::string(gc_Prefix) + "-1.VPD.xml\n" + "VPD/" +
                                     gc_Prefix + "-3.VPD.xml\n");
    EXPECT_EQ(result.stderrText, "8\n8\n\nquorvexPYLON_VPD_Survey_ClientPartition ReturnCode: \n8");
    std::vector<std::string> const files = run.vpdFiles();
    ASSERT_EQ(files, QuorvexTest::listFolder(gc_Expected + std::string("/VPD")));
    for (std::string const& name : files) {
        EXPECT_EQ(run.vpdFile(name), QuorvexTest::readFile(gc_Expected + ("/VPD/" + name))) << name;
    }
    ASSERT_TRUE(run.hasTrace());
    EXPECT_EQ(run.trace(), QuorvexTest::readFile(gc_Expected + std::string("/trace")));
    EXPECT_EQ(run.calls(), "lspartition\t-ix\t-c\t1234-ABC_10ABCDE\n");
    EXPECT_EQ(run.leftInTmp(), std::vector<std::string>{});
}

} // namespace
