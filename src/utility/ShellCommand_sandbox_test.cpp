// Runs inside the sandbox, whose /tmp is private: every file there is ours.

#include "utility/ShellCommand.h"

#include "utility/Trace.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <string>
#include <sys/stat.h>
#include <unistd.h>
#include <vector>

namespace {

using Lines = std::vector<std::string>;

constexpr char gc_MarkerFolder[] = "/var/adm/quorvex/Trace";

// Names in /tmp that begin with "ShellCommand.".
Lines temporaryFilesInTmp() {
    Lines names;
    for (auto const& entry : std::filesystem::directory_iterator("/tmp")) {
        std::string const name = entry.path().filename().string();
        if (name.rfind("ShellCommand.", 0) == 0) {
            names.push_back(name);
        }
    }
    return names;
}

// Runs the probe in a sandbox of its own with the given options.
QuorvexTest::CommandResult runProbe(std::vector<std::string> const& sandboxOptions) {
    return QuorvexTest::runInSandbox(sandboxOptions,
                                     {QUORVEX_SHELL_COMMAND_PROBE, std::string(gc_MarkerFolder)});
}

// Runs the probe with a script of the given body standing in for /bin/hostname.
QuorvexTest::CommandResult runProbeWithHostNameTool(std::string const& scriptBody) {
    QuorvexTest::TemporaryDirectory const folder;
    std::string const script = folder.file("hostname");
    QuorvexTest::writeFile(script, "#!/bin/sh\n" + scriptBody);
    ::chmod(script.c_str(), 0755);
    return runProbe({"--bind", script + ":/bin/hostname"});
}

// The sandbox's exit status when it cannot give what the command asks for.
constexpr int gc_SandboxUnavailable = 77;

// Mounts a fresh tmpfs over /tmp with room for exactly one file (the folder
// itself takes the other inode), then runs "$0" "$1". The probe is copied to
// the sandbox's private /dev/shm first: in a checkout under /tmp the new
// /tmp would hide it. Only a mount namespace can mount; proot, which runs the
// command without privilege, gives the skip status with that reason.
constexpr char gc_OneFileTmpThenRun[] =
    "if [ \"$QUORVEX_SANDBOX_KIND\" = proot ]; then\n"
    "  echo 'a /tmp with room for one file needs a private mount namespace: proot cannot mount' "
    ">&2\n"
    "  exit 77\n"
    "fi\n"
    "cp \"$0\" /dev/shm/probe || exit 125\n"
    "mount -t tmpfs -o size=64k,nr_inodes=2,mode=1777 quorvex-one-file-tmp /tmp || exit 125\n"
    "exec /dev/shm/probe \"$1\"";

// Runs the probe in a sandbox of its own whose /tmp has room for one file.
QuorvexTest::CommandResult runProbeWithRoomForOneTemporaryFile() {
    return QuorvexTest::runInSandbox({},
                                     {"/bin/sh", "-c", gc_OneFileTmpThenRun,
                                      QUORVEX_SHELL_COMMAND_PROBE, std::string(gc_MarkerFolder)});
}

// The probe's report of a run in a writable /tmp, with the host name it got.
std::string reportWithHost(std::string const& host) {
    return "execute 0\n"
           "wasExecuted 1\n"
           "returnCode 0\n"
           "stdout 1\n"
           "stderr 1\n"
           "marker present\n"
           "host " +
           host +
           "\n"
           "left 0\n";
}

// The probe's report when no temporary files could be made for its command,
// with the number of temporary files left in /tmp.
std::string refusedRunReport(int leftFiles) {
    return "execute -1\n"
           "wasExecuted 0\n"
           "returnCode 0\n"
           "stdout 0\n"
           "stderr 0\n"
           "marker absent\n"
           "host ***Unknown***.hostname.\n"
           "left " +
           std::to_string(leftFiles) + "\n";
}

std::string hostName() {
    char name[256] = {0};
    ::gethostname(name, sizeof name - 1);
    return name;
}

class ShellCommandPrivateTmp : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(QuorvexTest::isInsideSandbox());
        ASSERT_EQ(temporaryFilesInTmp(), Lines{});
    }

    // Runs the command once and checks that /tmp holds no temporary file after it.
    void runAndExpectNoFileLeft(std::string const& commandText, int expectedCode) {
        Utility::ShellCommand command(commandText);
        EXPECT_EQ(command.execute(), expectedCode) << commandText;
        EXPECT_EQ(temporaryFilesInTmp(), Lines{}) << commandText;
    }
};

TEST_F(ShellCommandPrivateTmp, SuccessfulRunLeavesNoTemporaryFile) {
    runAndExpectNoFileLeft("echo word", 0);
}

TEST_F(ShellCommandPrivateTmp, FailingRunsLeaveNoTemporaryFile) {
    runAndExpectNoFileLeft("exit 3", 3);
    runAndExpectNoFileLeft("/nonexistent/quorvex-no-such-tool", 127);
    runAndExpectNoFileLeft("kill -9 $$", 0);
}

TEST_F(ShellCommandPrivateTmp, RunWithOverLongLineLeavesNoTemporaryFile) {
    runAndExpectNoFileLeft(R"(sh -c "head -c 200000 /dev/zero | tr '\\000' x; echo; echo z")", 0);
}

TEST_F(ShellCommandPrivateTmp, RepeatedRunsLeaveNoTemporaryFile) {
    Utility::ShellCommand command("echo again");
    command.set_ExecuteOnlyOnce(false);
    for (int run = 0; run < 3; ++run) {
        EXPECT_EQ(command.execute(), 0);
        EXPECT_EQ(temporaryFilesInTmp(), Lines{});
    }
    EXPECT_EQ(command.get_stdout(), (Lines{"again", "", "again", "", "again", ""}));
}

TEST_F(ShellCommandPrivateTmp, RefusedSecondRunLeavesNoTemporaryFile) {
    Utility::ShellCommand command("echo once");
    EXPECT_EQ(command.execute(), 0);
    EXPECT_EQ(command.execute(), -1);
    EXPECT_EQ(temporaryFilesInTmp(), Lines{});
}

TEST_F(ShellCommandPrivateTmp, HostNameQueryLeavesNoTemporaryFile) {
    EXPECT_EQ(Utility::get_HostName(), hostName());
    EXPECT_EQ(temporaryFilesInTmp(), Lines{});
}

TEST(ShellCommandTmpNotWritable, ExecuteGivesMinusOneAndRunsNothing) {
    QuorvexTest::CommandResult const result = runProbe({"--readonly-tmp"});
    EXPECT_EQ(result.exitStatus, 0) << result.stderrText;
    EXPECT_EQ(result.stdoutText, refusedRunReport(0));
}

// The standard-output file is made but the standard-error file is not: the
// command is not run, and the file already made stays in /tmp. The host-name
// query after it finds /tmp full and falls back too.
TEST(ShellCommandTmpWithRoomForOneFile, ExecuteGivesMinusOneAndLeavesTheFirstFileBehind) {
    QuorvexTest::CommandResult const result = runProbeWithRoomForOneTemporaryFile();
    if (result.exitStatus == gc_SandboxUnavailable) {
        GTEST_SKIP() << result.stderrText;
    }
    EXPECT_EQ(result.exitStatus, 0) << result.stderrText;
    EXPECT_EQ(result.stdoutText, refusedRunReport(1));
}

// The same probe with a writable /tmp runs its command: the marker check in
// the read-only case can see a command that ran.
TEST(ShellCommandTmpWritable, ProbeRunsCommandAndFindsItsMarker) {
    QuorvexTest::CommandResult const result = runProbe({});
    EXPECT_EQ(result.exitStatus, 0) << result.stderrText;
    EXPECT_EQ(result.stdoutText, reportWithHost(hostName()));
}

// The host name is the first line of the tool's output, taken as it is.
TEST(HostNameQuery, FirstLineIsTakenAsItIs) {
    QuorvexTest::CommandResult const result =
        runProbeWithHostNameTool("printf ' console-1.example \\nsecond line\\n'\n");
    EXPECT_EQ(result.exitStatus, 0) << result.stderrText;
    EXPECT_EQ(result.stdoutText, reportWithHost(" console-1.example "));
}

// A tool that ran with code 0 but printed nothing gives the empty first line,
// not the fallback.
TEST(HostNameQuery, ToolPrintingNothingGivesEmptyName) {
    QuorvexTest::CommandResult const result = runProbeWithHostNameTool("exit 0\n");
    EXPECT_EQ(result.exitStatus, 0) << result.stderrText;
    EXPECT_EQ(result.stdoutText, reportWithHost(""));
}

// A non-zero code gives the fallback even when the tool printed a name.
TEST(HostNameQuery, ToolFailingGivesFallbackName) {
    QuorvexTest::CommandResult const result = runProbeWithHostNameTool("echo console-1\nexit 1\n");
    EXPECT_EQ(result.exitStatus, 0) << result.stderrText;
    EXPECT_EQ(result.stdoutText, reportWithHost("***Unknown***.hostname."));
}

// A tool that removes the file its standard output goes to: the file is found
// in /tmp by the inode of that output, since in a sandbox nested under proot
// the path read back from /proc/<pid>/fd may name another file.
constexpr char gc_ToolRemovingItsOutputFile[] =
    "echo console-1\n"
    "exec 3>&1\n"
    "find /tmp -maxdepth 1 -name 'ShellCommand.*' -inum \"$(stat -c %i - <&3)\" -delete\n";

// A tool that ran with code 0 but whose output file is gone by the time it is
// read has no first line: the fallback is used, never a line that is not there.
TEST(HostNameQuery, OutputFileRemovedByTheToolGivesFallbackName) {
    QuorvexTest::CommandResult const result =
        runProbeWithHostNameTool(gc_ToolRemovingItsOutputFile);
    EXPECT_EQ(result.exitStatus, 0) << result.stderrText;
    EXPECT_EQ(result.stdoutText, reportWithHost("***Unknown***.hostname."));
}

} // namespace
