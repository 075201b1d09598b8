// Runs on the host and calls tools/sandbox itself, to check what the sandbox
// leaves behind (nothing) and how it reports its own failures.

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>
#include <string>
#include <unistd.h>
#include <vector>

using QuorvexTest::CommandResult;
using QuorvexTest::fileExists;
using QuorvexTest::runCommand;
using QuorvexTest::runInSandbox;

namespace {

constexpr int gc_ExitSkip = 77;
constexpr int gc_ExitUsage = 125;

// The paths the sandbox provides; none may appear on the host.
std::vector<std::string> const& _consolePaths() {
    static std::vector<std::string> const paths{"/var/adm", "/opt/vtc", "/opt/lsvtc",
                                                "/usr/bin/runact-api"};
    return paths;
}

CommandResult _sandbox(std::vector<std::string> const& arguments) {
    std::vector<std::string> argv{QuorvexTest::sandboxPath()};
    argv.insert(argv.end(), arguments.begin(), arguments.end());
    return runCommand(argv);
}

} // namespace

TEST(SandboxHost, ExitStatusOfTheCommandPassesThrough) {
    EXPECT_EQ(0, runInSandbox({}, {"true"}).exitStatus);
    EXPECT_EQ(42, runInSandbox({}, {"sh", "-c", "exit 42"}).exitStatus);
}

TEST(SandboxHost, OutputOfTheCommandPassesThrough) {
    CommandResult const run = runInSandbox({}, {"sh", "-c", "printf out; printf err >&2"});
    EXPECT_EQ("out", run.stdoutText);
    EXPECT_EQ("err", run.stderrText);
}

TEST(SandboxHost, NothingAppearsOnTheHost) {
    std::vector<std::string> const& paths = _consolePaths();
    std::vector<std::string> absentBefore;
    std::copy_if(paths.begin(), paths.end(), std::back_inserter(absentBefore),
                 [](std::string const& path) { return !fileExists(path); });
    if (absentBefore.empty()) {
        GTEST_SKIP() << "the host already has every console path";
    }
    CommandResult const run =
        runInSandbox({}, {"sh", "-c",
                          "touch /var/adm/quorvex/VPD/x /var/adm/quorvex/Trace/y /opt/vtc/bin/z && "
                          "/usr/bin/runact-api -c x >/dev/null; /opt/lsvtc/bin/lsvtc -t0"});
    if (run.exitStatus == gc_ExitSkip) {
        GTEST_SKIP() << run.stderrText;
    }
    ASSERT_EQ(0, run.exitStatus) << run.stderrText;
    for (std::string const& path : absentBefore) {
        EXPECT_FALSE(fileExists(path)) << path;
    }
}

TEST(SandboxHost, TmpInsideIsNotTheHostTmp) {
    QuorvexTest::TemporaryDirectory hostFolder;
    std::string const insideName = hostFolder.path() + "-made-inside";
    CommandResult const run =
        runInSandbox({}, {"sh", "-c", R"(test ! -e "$0" && mkdir "$1" && touch "$1/file")",
                          hostFolder.path(), insideName});
    if (run.exitStatus == gc_ExitSkip) {
        GTEST_SKIP() << run.stderrText;
    }
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
    EXPECT_FALSE(fileExists(insideName));
}

TEST(SandboxHost, NoScratchFolderIsMadeOnTheHost) {
    QuorvexTest::TemporaryDirectory scratchBase;
    CommandResult const run = runCommand(
        {"/usr/bin/env", "TMPDIR=" + scratchBase.path(), QuorvexTest::sandboxPath(), "--sim",
         QuorvexTest::simulatorPath(), "--", "sh", "-c", "ls -A /tmp /dev/shm"});
    if (run.exitStatus == gc_ExitSkip) {
        GTEST_SKIP() << run.stderrText;
    }
    std::string expected = "/dev/shm:\n\n/tmp:\n";
    for (std::string const& kept : QuorvexTest::namesKeptInTmp()) {
        expected += kept + "\n";
    }
    EXPECT_EQ(expected, run.stdoutText);
    EXPECT_EQ("", QuorvexTest::runShell("ls -A '" + scratchBase.path() + "'").stdoutText);
}

TEST(SandboxHost, NoNamespaceToolGivesSkipStatusWithReason) {
    CommandResult const run = runCommand({"/usr/bin/env", "PATH=/nonexistent", "/bin/bash",
                                          QuorvexTest::sandboxPath(), "--", "true"});
    EXPECT_EQ(gc_ExitSkip, run.exitStatus);
    EXPECT_EQ(
        "sandbox: cannot make a private mount namespace: the unshare command is not installed\n",
        run.stderrText);
}

TEST(SandboxHost, UnprivilegedCallerGetsASandboxOrASkip) {
    if (::geteuid() != 0 || !fileExists("/usr/bin/setpriv")) {
        GTEST_SKIP() << "needs root and setpriv to become an unprivileged user";
    }
    CommandResult const run =
        runCommand({"/usr/bin/setpriv", "--reuid=65534", "--regid=65534", "--clear-groups",
                    QuorvexTest::sandboxPath(), "--sim", QuorvexTest::simulatorPath(), "--", "sh",
                    "-c", "test -d /var/adm/quorvex/VPD && test -x /usr/bin/runact-api"});
    if (run.exitStatus == gc_ExitSkip) {
        EXPECT_EQ(0u, run.stderrText.find("sandbox: cannot make a private mount namespace: "))
            << run.stderrText;
        return;
    }
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
}

TEST(SandboxHost, UnknownOptionIsAUsageError) {
    CommandResult const run = _sandbox({"--bogus", "--", "true"});
    EXPECT_EQ(gc_ExitUsage, run.exitStatus);
    EXPECT_EQ("sandbox: unknown option '--bogus'\nsandbox: try 'tools/sandbox --help'\n",
              run.stderrText);
}

TEST(SandboxHost, MissingCommandIsAUsageError) {
    CommandResult const run = _sandbox({"--readonly-tmp"});
    EXPECT_EQ(gc_ExitUsage, run.exitStatus);
    EXPECT_EQ("sandbox: no command given after '--'\nsandbox: try 'tools/sandbox --help'\n",
              run.stderrText);
}

TEST(SandboxHost, BadPathsAreUsageErrors) {
    EXPECT_EQ(gc_ExitUsage, _sandbox({"--sim", "/nonexistent", "--", "true"}).exitStatus);
    EXPECT_EQ(gc_ExitUsage, _sandbox({"--vpd", "/nonexistent", "--", "true"}).exitStatus);
    EXPECT_EQ(gc_ExitUsage, _sandbox({"--bind", "/nonexistent:/x", "--", "true"}).exitStatus);
    EXPECT_EQ(gc_ExitUsage,
              _sandbox({"--bind", "/etc/hostname:relative", "--", "true"}).exitStatus);
    EXPECT_EQ(gc_ExitUsage, _sandbox({"--bind", "/etc/hostname", "--", "true"}).exitStatus);
    EXPECT_EQ(gc_ExitUsage, _sandbox({"--tmp-size"}).exitStatus);
}

TEST(SandboxHost, ContradictoryFolderOptionsAreUsageErrors) {
    EXPECT_EQ(gc_ExitUsage, _sandbox({"--no-vpd-dir", "--readonly-vpd", "--", "true"}).exitStatus);
    EXPECT_EQ(gc_ExitUsage,
              _sandbox({"--no-trace-dir", "--trace", "/tmp", "--", "true"}).exitStatus);
}

TEST(SandboxHost, HelpDocumentsEveryOption) {
    CommandResult const run = _sandbox({"--help"});
    EXPECT_EQ(0, run.exitStatus);
    for (char const* option :
         {"--sim PATH", "--vpd DIR", "--trace DIR", "--no-vpd-dir", "--no-trace-dir",
          "--readonly-vpd", "--readonly-trace", "--readonly-tmp", "--tmp-size SIZE",
          "--bind SRC:DST", "77", "125"}) {
        EXPECT_NE(std::string::npos, run.stdoutText.find(option)) << option;
    }
}
