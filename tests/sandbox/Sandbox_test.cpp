// Runs inside tools/sandbox (through the sandbox test main): the simulated
// console is in place and the folders the survey tool writes exist. Options
// that change the sandbox are checked in sandboxes nested in this one.

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <sstream>
#include <sys/stat.h>
#include <unistd.h>

using QuorvexTest::CommandResult;
using QuorvexTest::fileExists;
using QuorvexTest::runInSandbox;
using QuorvexTest::runShell;

namespace {

bool _isExecutable(std::string const& path) {
    return ::access(path.c_str(), X_OK) == 0;
}

bool _isWritableFolder(std::string const& path) {
    struct stat info;
    return ::stat(path.c_str(), &info) == 0 && S_ISDIR(info.st_mode) &&
           ::access(path.c_str(), W_OK) == 0;
}

// Runs a shell command line in a nested sandbox with the given options.
CommandResult _nested(std::vector<std::string> const& options, std::string const& commandLine) {
    return runInSandbox(options, {"/bin/sh", "-c", commandLine});
}

// The kind of sandbox these tests run in; a nested sandbox is of the same
// kind, as the namespace can be made inside a namespace and not inside proot.
bool _underProot() {
    char const* kind = std::getenv("QUORVEX_SANDBOX_KIND");
    return kind != nullptr && std::string(kind) == "proot";
}

// proot cannot mount a folder read-only: file modes refuse the writes there,
// and the command, which runs without capabilities, has to respect them.
char const* _readonlyRefusal() {
    return _underProot() ? "Permission denied" : "Read-only file system";
}

} // namespace

TEST(Sandbox, TestMainRunsTestsInsideTheSandbox) {
    EXPECT_TRUE(QuorvexTest::isInsideSandbox());
}

TEST(Sandbox, TheThreeConsoleToolsArePresent) {
    EXPECT_TRUE(_isExecutable("/opt/vtc/bin/lspartition"));
    EXPECT_TRUE(_isExecutable("/opt/lsvtc/bin/lsvtc"));
    EXPECT_TRUE(_isExecutable("/usr/bin/runact-api"));
}

TEST(Sandbox, TheConsoleToolsAreTheSimulator) {
    QuorvexTest::SimulatedConsole console(
        "[lsvtc]\nstdout 0:1234-ABC_10ABCDE;\n"
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

TEST(Sandbox, TheResultFoldersExistEmptyAndWritable) {
    for (char const* folder : {"/var/adm/quorvex/VPD", "/var/adm/quorvex/Trace"}) {
        EXPECT_TRUE(_isWritableFolder(folder)) << folder;
        EXPECT_EQ("", runShell(std::string("ls -A ") + folder).stdoutText) << folder;
    }
}

TEST(Sandbox, TmpIsPrivateAndWritable) {
    EXPECT_TRUE(_isWritableFolder("/tmp"));
    std::vector<std::string> left;
    std::istringstream listing(
        runShell("ls -A /tmp | grep -v '^quorvex-test\\.' || true").stdoutText);
    for (std::string name; std::getline(listing, name);) {
        left.push_back(name);
    }
    EXPECT_EQ(std::vector<std::string>{}, QuorvexTest::withoutNamesKeptInTmp(left));
}

TEST(Sandbox, RestOfTheSystemStaysUsable) {
    EXPECT_TRUE(_isExecutable("/usr/bin/sh") || _isExecutable("/bin/sh"));
    EXPECT_TRUE(fileExists(QuorvexTest::sandboxPath()));
    EXPECT_EQ("ok\n", runShell("echo ok").stdoutText);
}

TEST(Sandbox, NestedSandboxPassesTheExitStatusThrough) {
    EXPECT_EQ(0, _nested({}, "exit 0").exitStatus);
    EXPECT_EQ(3, _nested({}, "exit 3").exitStatus);
    EXPECT_EQ(77, _nested({}, "exit 77").exitStatus);
}

TEST(Sandbox, NoVpdDirLeavesTheVpdFolderMissing) {
    CommandResult const run = _nested(
        {"--no-vpd-dir"}, "test ! -e /var/adm/quorvex/VPD && test -d /var/adm/quorvex/Trace");
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
}

TEST(Sandbox, NoTraceDirLeavesTheTraceFolderMissing) {
    CommandResult const run = _nested(
        {"--no-trace-dir"}, "test ! -e /var/adm/quorvex/Trace && test -d /var/adm/quorvex/VPD");
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
}

TEST(Sandbox, ReadonlyVpdRefusesWritesThere) {
    CommandResult const run =
        _nested({"--readonly-vpd"},
                "touch /var/adm/quorvex/VPD/x; echo $?; touch /var/adm/quorvex/Trace/y; echo $?");
    EXPECT_EQ("1\n0\n", run.stdoutText);
    EXPECT_NE(std::string::npos, run.stderrText.find(_readonlyRefusal())) << run.stderrText;
}

TEST(Sandbox, ReadonlyTraceRefusesWritesThere) {
    CommandResult const run =
        _nested({"--readonly-trace"},
                "touch /var/adm/quorvex/Trace/x; echo $?; touch /var/adm/quorvex/VPD/y; echo $?");
    EXPECT_EQ("1\n0\n", run.stdoutText);
    EXPECT_NE(std::string::npos, run.stderrText.find(_readonlyRefusal())) << run.stderrText;
}

TEST(Sandbox, ReadonlyHostFolderShowsItsContentAndRefusesWrites) {
    QuorvexTest::TemporaryDirectory vpd;
    QuorvexTest::writeFile(vpd.file("kept.xml"), "kept");
    CommandResult const run = _nested({"--vpd", vpd.path(), "--readonly-vpd"},
                                      "cat /var/adm/quorvex/VPD/kept.xml; echo;"
                                      "echo x > /var/adm/quorvex/VPD/kept.xml; echo $?;"
                                      "touch /var/adm/quorvex/VPD/new; echo $?");
    EXPECT_EQ("kept\n2\n1\n", run.stdoutText);
    EXPECT_EQ("kept", QuorvexTest::readFile(vpd.file("kept.xml")));
    EXPECT_FALSE(fileExists(vpd.file("new")));
}

TEST(Sandbox, ReadonlyTmpRefusesNewFiles) {
    CommandResult const run = _nested({"--readonly-tmp"}, "touch /tmp/x; echo $?; ls -A /tmp");
    std::string expected = "1\n";
    for (std::string const& kept : QuorvexTest::namesKeptInTmp()) {
        expected += kept + "\n";
    }
    EXPECT_EQ(expected, run.stdoutText);
    EXPECT_NE(std::string::npos, run.stderrText.find(_readonlyRefusal())) << run.stderrText;
}

TEST(Sandbox, TmpSizeLimitsTmp) {
    CommandResult const run =
        _nested({"--tmp-size", "16k"}, "head -c 8192 /dev/zero > /tmp/a && echo small; head -c "
                                       "65536 /dev/zero > /tmp/b || echo full");
    if (_underProot() && run.exitStatus == 77) {
        GTEST_SKIP() << run.stderrText;
    }
    EXPECT_EQ("small\nfull\n", run.stdoutText);
    EXPECT_NE(std::string::npos, run.stderrText.find("No space left on device")) << run.stderrText;
}

TEST(Sandbox, NestedTmpIsPrivateInBothDirections) {
    QuorvexTest::writeFile("/tmp/outer-only", "x");
    CommandResult const run = _nested({}, "test ! -e /tmp/outer-only && touch /tmp/inner-only");
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
    EXPECT_FALSE(fileExists("/tmp/inner-only"));
    EXPECT_TRUE(fileExists("/tmp/outer-only"));
    ::unlink("/tmp/outer-only");
}

TEST(Sandbox, NestedResultFoldersStartEmptyAndVanish) {
    QuorvexTest::writeFile("/var/adm/quorvex/VPD/outer.xml", "outer");
    CommandResult const run =
        _nested({}, "ls -A /var/adm/quorvex/VPD; echo inner > /var/adm/quorvex/VPD/inner.xml");
    EXPECT_EQ("", run.stdoutText);
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
    EXPECT_FALSE(fileExists("/var/adm/quorvex/VPD/inner.xml"));
    EXPECT_EQ("outer", QuorvexTest::readFile("/var/adm/quorvex/VPD/outer.xml"));
}

TEST(Sandbox, VpdAndTraceOptionsBindHostFolders) {
    QuorvexTest::TemporaryDirectory vpd;
    QuorvexTest::TemporaryDirectory trace;
    CommandResult const run =
        _nested({"--vpd", vpd.path(), "--trace", trace.path()},
                "printf v > /var/adm/quorvex/VPD/a.xml; printf t > /var/adm/quorvex/Trace/b.Trace");
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
    EXPECT_EQ("v", QuorvexTest::readFile(vpd.file("a.xml")));
    EXPECT_EQ("t", QuorvexTest::readFile(trace.file("b.Trace")));
}

// quorvex-survey records its runs there by default: a test or a demo run in
// the sandbox never writes the host's.
TEST(Sandbox, StateFolderIsFreshAndPrivate) {
    QuorvexTest::writeFile("/var/lib/quorvex-survey/outer.sqlite", "outer");
    CommandResult const run = _nested(
        {}, "ls -A /var/lib/quorvex-survey; echo inner > /var/lib/quorvex-survey/inner.sqlite");
    EXPECT_EQ("", run.stdoutText);
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
    EXPECT_FALSE(fileExists("/var/lib/quorvex-survey/inner.sqlite"));
    EXPECT_EQ("outer", QuorvexTest::readFile("/var/lib/quorvex-survey/outer.sqlite"));
    ::unlink("/var/lib/quorvex-survey/outer.sqlite");
}

TEST(Sandbox, StateOptionBindsAHostFolder) {
    QuorvexTest::TemporaryDirectory state;
    CommandResult const run =
        _nested({"--state", state.path()}, "printf h > /var/lib/quorvex-survey/history.sqlite");
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
    EXPECT_EQ("h", QuorvexTest::readFile(state.file("history.sqlite")));
}

TEST(Sandbox, ReadonlyStateRefusesWritesThere) {
    CommandResult const run = _nested(
        {"--readonly-state"}, "touch /var/lib/quorvex-survey/x; echo $?; touch /tmp/y; echo $?");
    EXPECT_EQ("1\n0\n", run.stdoutText);
    EXPECT_NE(std::string::npos, run.stderrText.find(_readonlyRefusal())) << run.stderrText;
}

TEST(Sandbox, BindReplacesAConsoleTool) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file("big-listing"),
                           "#!/bin/sh\nhead -c 10485760 /dev/zero | tr '\\0' x\n");
    ::chmod(folder.file("big-listing").c_str(), 0755);
    CommandResult const run =
        _nested({"--bind", folder.file("big-listing") + ":/opt/vtc/bin/lspartition"},
                "/opt/vtc/bin/lspartition -ix -c A_B | wc -c; /opt/lsvtc/bin/lsvtc -t0; echo $?");
    EXPECT_EQ("10485760\n0\n", run.stdoutText);
}

TEST(Sandbox, BindCreatesMissingTargetsInsideTheSandboxOnly) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file("data"), "payload");
    CommandResult const run =
        _nested({"--bind", folder.file("data") + ":/opt/quorvex-stand-in/deep/data", "--bind",
                 folder.path() + ":/tmp/bound"},
                "cat /opt/quorvex-stand-in/deep/data /tmp/bound/data");
    EXPECT_EQ("payloadpayload", run.stdoutText);
    EXPECT_FALSE(fileExists("/opt/quorvex-stand-in"));
    EXPECT_FALSE(fileExists("/tmp/bound"));
}

TEST(Sandbox, EnvironmentPassesThrough) {
    ::setenv("QUORVEX_SANDBOX_PROBE", "a b\tc", 1);
    CommandResult const run = _nested({}, "printf '%s' \"$QUORVEX_SANDBOX_PROBE\"");
    ::unsetenv("QUORVEX_SANDBOX_PROBE");
    EXPECT_EQ("a b\tc", run.stdoutText);
}
