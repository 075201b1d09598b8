// /tmp unusable while the shipped demo machine is surveyed. When the
// temporary files of a command cannot be made, the command is not run and
// gives -1 with no output; when they can be made but nothing can be written
// into them, the command runs and its output is lost. Either way the listing
// is empty: "No ACTIVE Partition Found." in the status file, the code 8 on
// standard error, exit status 2.

#include "FaultRun.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

constexpr char gc_DemoIdentity[] = "9119-MHE_21ABCDE";
constexpr char gc_StatusFile[] = "quorvexPYLON_VPD_Survey_ClientPartition_9119-MHE_21ABCDE.status";
constexpr char gc_TraceHead[] = "PYLON_VPD_Survey_ClientPartition::main\n";
constexpr char gc_NoPartitionCode[] = "\nquorvexPYLON_VPD_Survey_ClientPartition ReturnCode: \n8";

// The sandbox's private /dev/shm: a tool run from there stays reachable when
// a new /tmp is mounted over a build tree under /tmp.
constexpr char gc_FolderOutsideTmp[] = "/dev/shm";
// A /tmp of its own with no inode left: not even an empty file can be made.
// Only a mount namespace can mount it; proot, which runs the command without
// privilege, gives the skip status with that reason.
constexpr char gc_TmpWithoutInode[] =
    "if [ \"$QUORVEX_SANDBOX_KIND\" = proot ]; then\n"
    "  echo 'a /tmp without free inodes needs a private mount namespace: proot cannot mount' >&2\n"
    "  exit 77\n"
    "fi\n"
    "mount -t tmpfs -o size=64k,nr_inodes=1,mode=1777 quorvex-full-tmp /tmp || exit 125";
// The size-limited /tmp of the sandbox filled up: files can be made, but
// nothing can be written into them.
constexpr char gc_FillTmp[] = "cat /dev/zero > /tmp/filler 2>/dev/null";

class FaultInTemporaryFiles : public ::testing::Test {
protected:
    FaultInTemporaryFiles()
        : run(QuorvexTest::ScenarioFile{QuorvexTest::shippedScenario("demo.scn")}) {}

    // False when no sandbox can be made: the test is skipped.
    bool runDemo() {
        result = run.run(gc_DemoIdentity);
        return FaultRun::ranInSandbox(result);
    }

    void expectNoPartitionFound() const {
        EXPECT_EQ(result.exitStatus, 2) << result.stderrText;
        EXPECT_EQ(result.stdoutText, "");
        EXPECT_EQ(result.stderrText, gc_NoPartitionCode);
        ASSERT_EQ(run.vpdFiles(), std::vector<std::string>{gc_StatusFile});
        EXPECT_EQ(run.vpdFile(gc_StatusFile), "No ACTIVE Partition Found.\n");
    }

    // No temporary file could be made, so nothing was run: the trace holds
    // only its first line, the console was never called and /tmp stays empty.
    void expectNoCommandRunAndNoPartitionFound() {
        if (!runDemo()) {
            return;
        }
        expectNoPartitionFound();
        ASSERT_TRUE(run.hasTrace());
        EXPECT_EQ(run.trace(), gc_TraceHead);
        EXPECT_EQ(run.calls(), "");
        EXPECT_EQ(run.leftInTmp(), std::vector<std::string>{});
    }

    FaultRun run;
    QuorvexTest::CommandResult result;
};

TEST_F(FaultInTemporaryFiles, ReadOnlyTmpRunsNoCommandAndFindsNoPartition) {
    run.addSandboxOptions({"--readonly-tmp"});
    expectNoCommandRunAndNoPartitionFound();
}

TEST_F(FaultInTemporaryFiles, TmpWithoutFreeInodeRunsNoCommandAndFindsNoPartition) {
    run.runToolCopiedTo(gc_FolderOutsideTmp);
    run.setPrelude(gc_TmpWithoutInode);
    expectNoCommandRunAndNoPartitionFound();
}

TEST_F(FaultInTemporaryFiles, TmpWithoutFreeSpaceLosesTheListingAndFindsNoPartition) {
    run.addSandboxOptions({"--tmp-size", "64k"});
    run.setPrelude(gc_FillTmp);
    if (!runDemo()) {
        return;
    }
    expectNoPartitionFound();
    ASSERT_TRUE(run.hasTrace());
    EXPECT_EQ(run.trace(), std::string(gc_TraceHead) +
                               "\n"
                               "****** ShellCommand::execute ******\n"
                               "/opt/vtc/bin/lspartition -ix -c 9119-MHE_21ABCDE"
                               " > /tmp/ShellCommand.aaaaaa 2> /tmp/ShellCommand.bbbbbb\n"
                               "RC = 0\n"
                               "STDOUT\n"
                               "\n"
                               "STDERR\n"
                               "\n"
                               "\n"
                               "\n");
    EXPECT_EQ(run.calls(), "lspartition\t-ix\t-c\t9119-MHE_21ABCDE\n");
    EXPECT_EQ(run.leftInTmp(), std::vector<std::string>{"filler"});
}

} // namespace
