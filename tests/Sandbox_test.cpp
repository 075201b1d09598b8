// Runs inside tools/sandbox (through the sandbox test main): the simulated
// console is in place and the folders the survey tool writes exist.

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <sys/stat.h>
#include <unistd.h>

namespace
{

using QuorvexTest::fileExists;
using QuorvexTest::runShell;

bool _isExecutable(std::string const& path)
{
    return ::access(path.c_str(), X_OK) == 0;
}

bool _isWritableFolder(std::string const& path)
{
    struct stat info;
    return ::stat(path.c_str(), &info) == 0 && S_ISDIR(info.st_mode) &&
           ::access(path.c_str(), W_OK) == 0;
}

}  // namespace

TEST(Sandbox, TestMainRunsTestsInsideTheSandbox)
{
    EXPECT_TRUE(QuorvexTest::isInsideSandbox());
}

TEST(Sandbox, TheThreeConsoleToolsArePresent)
{
    EXPECT_TRUE(_isExecutable("/opt/vtc/bin/lspartition"));
    EXPECT_TRUE(_isExecutable("/opt/lsvtc/bin/lsvtc"));
    EXPECT_TRUE(_isExecutable("/usr/bin/runact-api"));
}

TEST(Sandbox, TheConsoleToolsAreTheSimulator)
{
    QuorvexTest::SimulatedConsole console("[lsvtc]\nstdout 0:1234-ABC_10ABCDE;\n"
                                          "[lspartition *]\nstdout 1,10.1.1.11,3,host1,Zeph,7.2;\n"
                                          "[runCmdOnPartition *]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n");
    EXPECT_EQ("0:1234-ABC_10ABCDE;\n", runShell("/opt/lsvtc/bin/lsvtc -t0").stdoutText);
    EXPECT_EQ("1,10.1.1.11,3,host1,Zeph,7.2;\n",
              runShell("/opt/vtc/bin/lspartition -ix -c 1234-ABC_10ABCDE").stdoutText);
    EXPECT_EQ("Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n",
              runShell("/usr/bin/runact-api -c ZOR.ServiceEvent::::runCmdOnPartition::CallerID::0::"
                       "CecMT::\"1234-ABC\"::CecMS::\"10ABCDE\"::PartitionId::\"3\"")
                  .stdoutText);
}

TEST(Sandbox, TheResultFoldersExistEmptyAndWritable)
{
    for (char const* folder : {"/var/adm/quorvex/VPD", "/var/adm/quorvex/Trace"})
    {
        EXPECT_TRUE(_isWritableFolder(folder)) << folder;
        EXPECT_EQ("", runShell(std::string("ls -A ") + folder).stdoutText) << folder;
    }
}

TEST(Sandbox, TmpIsPrivateAndStartsEmpty)
{
    EXPECT_EQ("", runShell("ls -A /tmp | grep -v '^quorvex-test\\.' || true").stdoutText);
    EXPECT_TRUE(_isWritableFolder("/tmp"));
}
