// Runs on the host and calls tools/sandbox itself, to check what the sandbox
// leaves behind (nothing) and how it reports its own failures.

#include "QuorvexTest.h"
#include "utility/TextChecks.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <iterator>
#include <string>
#include <sys/stat.h>
#include <unistd.h>
#include <vector>

using QuorvexTest::CommandResult;
using QuorvexTest::fileExists;
using QuorvexTest::runCommand;
using QuorvexTest::runInSandbox;

namespace {

constexpr int gc_ExitSetupFailed = 120;
constexpr int gc_ExitUsage = 125;

constexpr char gc_Remedy[] =
    "install proot (apt-get install proot python3; tools/ensure-deps does it as root), or start "
    "the container with mount namespaces allowed (the capability SYS_ADMIN, or user namespaces "
    "enabled)";

// The paths the sandbox provides; none may appear on the host.
std::vector<std::string> const& _consolePaths() {
    static std::vector<std::string> const paths{"/var/adm", "/opt/vtc", "/opt/lsvtc",
                                                "/usr/bin/runact-api", "/var/lib/quorvex-survey"};
    return paths;
}

CommandResult _sandbox(std::vector<std::string> const& arguments) {
    std::vector<std::string> argv{QuorvexTest::sandboxPath()};
    argv.insert(argv.end(), arguments.begin(), arguments.end());
    return runCommand(argv);
}

// tools/sandbox with the simulator and the given arguments, under the
// environment settings given as NAME=VALUE.
CommandResult _sandboxWith(std::vector<std::string> const& environment,
                           std::vector<std::string> const& arguments) {
    std::vector<std::string> argv{"/usr/bin/env"};
    argv.insert(argv.end(), environment.begin(), environment.end());
    argv.insert(argv.end(), {QuorvexTest::sandboxPath(), "--sim", QuorvexTest::simulatorPath()});
    argv.insert(argv.end(), arguments.begin(), arguments.end());
    return runCommand(argv);
}

// tools/sandbox run with a PATH where no program is found, so that neither
// unshare nor proot can be used, and QUORVEX_SANDBOX set to kind.
CommandResult _sandboxWithEmptyPath(std::string const& kind) {
    return runCommand({"/usr/bin/env", "PATH=/nonexistent", "QUORVEX_SANDBOX=" + kind, "/bin/bash",
                       QuorvexTest::sandboxPath(), "--", "true"});
}

void _makeExecutable(std::string const& path) {
    ::chmod(path.c_str(), 0755);
}

// A folder holding an unshare that fails as it does in an unprivileged
// container, to be put first in PATH.
class NoNamespaceHere {
public:
    NoNamespaceHere() {
        QuorvexTest::writeFile(_folder.file("unshare"),
                               "#!/bin/sh\n"
                               "echo 'unshare: unshare failed: Operation not permitted' >&2\n"
                               "exit 1\n");
        _makeExecutable(_folder.file("unshare"));
    }

    std::string path() const {
        char const* path = std::getenv("PATH");
        return "PATH=" + _folder.path() + ":" + (path != nullptr ? path : "/usr/bin:/bin");
    }

private:
    QuorvexTest::TemporaryDirectory _folder;
};

// The proot sandbox's seccomp helper, which lies beside tools/sandbox.
std::string _seccompHelperPath() {
    return QuorvexTest::sourceRoot() + "/tools/sandbox-seccomp.py";
}

// A path under /opt whose folders the host does not have: the name of a
// fresh temporary folder makes it unique.
std::string _pathMissingOnTheHost(QuorvexTest::TemporaryDirectory const& unique,
                                  std::string const& rest) {
    return "/opt/" + std::filesystem::path(unique.path()).filename().string() + rest;
}

// The warning for a path that names the sandbox's private /tmp.
std::string _privateTmpWarning(std::string const& path) {
    return "sandbox: warning: " + path +
           " is inside the sandbox's private /tmp: it is not seen outside the sandbox; use a "
           "folder outside /tmp\n";
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
                          "touch /var/adm/quorvex/VPD/x /var/adm/quorvex/Trace/y /opt/vtc/bin/z "
                          "/var/lib/quorvex-survey/h && "
                          "/usr/bin/runact-api -c x >/dev/null; /opt/lsvtc/bin/lsvtc -t0"});
    if (run.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
        GTEST_SKIP() << run.stderrText;
    }
    ASSERT_EQ(0, run.exitStatus) << run.stderrText;
    for (std::string const& path : absentBefore) {
        EXPECT_FALSE(fileExists(path)) << path;
    }
}

// The host is looked at while the command runs: the sandbox must not make
// its paths on the host even for a while.
TEST(SandboxHost, NothingAppearsOnTheHostWhileTheCommandRuns) {
    std::vector<std::string> const& paths = _consolePaths();
    std::string absentPaths;
    for (std::string const& path : paths) {
        if (!fileExists(path)) {
            absentPaths += " " + path;
        }
    }
    if (absentPaths.empty()) {
        GTEST_SKIP() << "the host already has every console path";
    }
    QuorvexTest::TemporaryDirectory shared;
    std::string const started = shared.file("started");
    std::string const checked = shared.file("checked");
    CommandResult const run = QuorvexTest::runShell(
        "'" + QuorvexTest::sandboxPath() + "' --sim '" + QuorvexTest::simulatorPath() +
        "' --bind '" + shared.path() + ":" + shared.path() + "' -- sh -c 'touch " + started +
        "; i=0; while [ ! -e " + checked +
        " ] && [ $i -lt 600 ]; do sleep 0.1; i=$((i+1)); done' &\n"
        "i=0; while [ ! -e " +
        started +
        " ] && [ $i -lt 600 ]; do sleep 0.1; i=$((i+1)); done\n"
        "test -e " +
        started +
        " || echo 'the sandboxed command never started'\n"
        "for path in" +
        absentPaths +
        "; do test ! -e $path || echo \"$path appeared\"; done\n"
        "touch " +
        checked +
        "\n"
        "wait $!; echo \"sandbox: $?\"\n");
    EXPECT_EQ("sandbox: 0\n", run.stdoutText) << run.stderrText;
}

TEST(SandboxHost, TmpInsideIsNotTheHostTmp) {
    QuorvexTest::TemporaryDirectory hostFolder;
    std::string const insideName = hostFolder.path() + "-made-inside";
    CommandResult const run =
        runInSandbox({}, {"sh", "-c", R"(test ! -e "$0" && mkdir "$1" && touch "$1/file")",
                          hostFolder.path(), insideName});
    if (run.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
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
    if (run.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
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
    CommandResult const run = _sandboxWithEmptyPath("namespace");
    EXPECT_EQ(QuorvexTest::gc_SandboxUnavailable, run.exitStatus);
    EXPECT_EQ(
        "sandbox: cannot make a private mount namespace: the unshare command is not installed\n",
        run.stderrText);
}

TEST(SandboxHost, NeitherNamespaceNorProotGivesSkipStatusNamingWhatToInstall) {
    CommandResult const run = _sandboxWithEmptyPath("");
    EXPECT_EQ(QuorvexTest::gc_SandboxUnavailable, run.exitStatus);
    EXPECT_EQ(std::string("sandbox: cannot make a private mount namespace: the unshare command is "
                          "not installed; cannot use proot either: proot is not installed; ") +
                  gc_Remedy + "\n",
              run.stderrText);
}

TEST(SandboxHost, ForcedProotWithoutProotGivesSkipStatusNamingWhatToInstall) {
    CommandResult const run = _sandboxWithEmptyPath("proot");
    EXPECT_EQ(QuorvexTest::gc_SandboxUnavailable, run.exitStatus);
    EXPECT_EQ(std::string("sandbox: cannot use proot: proot is not installed; ") + gc_Remedy + "\n",
              run.stderrText);
}

TEST(SandboxHost, UnknownSandboxKindIsAUsageError) {
    CommandResult const run = _sandboxWith({"QUORVEX_SANDBOX=chroot"}, {"--", "true"});
    EXPECT_EQ(gc_ExitUsage, run.exitStatus);
    EXPECT_EQ("sandbox: QUORVEX_SANDBOX must be 'namespace' or 'proot', not 'chroot'\n"
              "sandbox: try 'tools/sandbox --help'\n",
              run.stderrText);
}

TEST(SandboxHost, InducedMountFailureInTheNamespaceFailsNamingTheMount) {
    CommandResult const run =
        _sandboxWith({"QUORVEX_SANDBOX=namespace", "QUORVEX_SANDBOX_FAIL_MOUNT=/var/adm/quorvex"},
                     {"--", "true"});
    if (run.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
        GTEST_SKIP() << run.stderrText;
    }
    EXPECT_EQ(gc_ExitSetupFailed, run.exitStatus);
    EXPECT_EQ("sandbox: setting up the private mount namespace failed: mount -t tmpfs -o "
              "mode=0755 sandbox-quorvex /var/adm/quorvex: failure induced by "
              "QUORVEX_SANDBOX_FAIL_MOUNT\n",
              run.stderrText);
}

TEST(SandboxHost, InducedBindFailureUnderProotFailsNamingTheBindAndLeavesNothing) {
    QuorvexTest::TemporaryDirectory scratchBase;
    CommandResult const run =
        _sandboxWith({"QUORVEX_SANDBOX=proot", "QUORVEX_SANDBOX_FAIL_MOUNT=/var/adm/quorvex",
                      "TMPDIR=" + scratchBase.path()},
                     {"--", "true"});
    if (run.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
        GTEST_SKIP() << run.stderrText;
    }
    EXPECT_EQ(gc_ExitSetupFailed, run.exitStatus);
    EXPECT_TRUE(
        util::startsWith(run.stderrText, "sandbox: setting up the proot sandbox failed: proot -b " +
                                             scratchBase.path() + "/quorvex-sandbox."))
        << run.stderrText;
    EXPECT_TRUE(util::endsWith(run.stderrText, "/quorvex:/var/adm/quorvex: failure induced by "
                                               "QUORVEX_SANDBOX_FAIL_MOUNT\n"))
        << run.stderrText;
    EXPECT_EQ("", QuorvexTest::runShell("ls -A '" + scratchBase.path() + "'").stdoutText);
}

// ctest counts exit status 77 as a skip: a sandboxed test whose sandbox broke
// after it was begun must give another status, so that it counts as failed.
TEST(SandboxHost, InducedMountFailureFailsASandboxedTestInsteadOfSkippingIt) {
    for (char const* kind : {"namespace", "proot"}) {
        CommandResult const run =
            runCommand({"/usr/bin/env", std::string("QUORVEX_SANDBOX=") + kind,
                        "QUORVEX_SANDBOX_FAIL_MOUNT=/var/adm/quorvex", QUORVEX_SANDBOXED_TEST,
                        "--gtest_filter=Sandbox.TestMainRunsTestsInsideTheSandbox"});
        if (run.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
            GTEST_SKIP() << run.stderrText;
        }
        EXPECT_EQ(gc_ExitSetupFailed, run.exitStatus) << kind;
        EXPECT_NE(std::string::npos, run.stderrText.find("/var/adm/quorvex: failure induced by "
                                                         "QUORVEX_SANDBOX_FAIL_MOUNT\n"))
            << run.stderrText;
    }
}

TEST(SandboxHost, WithoutNamespaceProotShowsTheConsoleAtTheFixedPaths) {
    NoNamespaceHere noNamespace;
    QuorvexTest::SimulatedConsole console(
        "[lsvtc]\nstdout 0:1234-ABC_10ABCDE;\n"
        "[lspartition *]\nstdout 1,10.1.1.11,3,host1,Zeph,7.2;\n");
    std::string const commandLine =
        "echo $QUORVEX_SANDBOX_KIND; /opt/lsvtc/bin/lsvtc -t0;"
        "/opt/vtc/bin/lspartition -ix -c 1234-ABC_10ABCDE; test -x /usr/bin/runact-api &&"
        "ls -A /var/adm/quorvex /var/adm/quorvex/VPD /var/adm/quorvex/Trace";
    CommandResult const run = _sandboxWith(
        {noNamespace.path(), "QUORVEX_SANDBOX="},
        {"--bind", console.directory() + ":" + console.directory(), "--", "sh", "-c", commandLine});
    if (run.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
        GTEST_SKIP() << run.stderrText;
    }
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
    EXPECT_EQ("proot\n"
              "0:1234-ABC_10ABCDE;\n"
              "1,10.1.1.11,3,host1,Zeph,7.2;\n"
              "/var/adm/quorvex:\nTrace\nVPD\n\n"
              "/var/adm/quorvex/Trace:\n\n"
              "/var/adm/quorvex/VPD:\n",
              run.stdoutText);
    EXPECT_EQ("lsvtc\t-t0\nlspartition\t-ix\t-c\t1234-ABC_10ABCDE\n", console.logText());
}

TEST(SandboxHost, ProotRefusesTmpSizeWithItsReason) {
    CommandResult const run =
        _sandboxWith({"QUORVEX_SANDBOX=proot"}, {"--tmp-size", "16k", "--", "true"});
    EXPECT_EQ(QuorvexTest::gc_SandboxUnavailable, run.exitStatus);
    EXPECT_EQ("sandbox: --tmp-size needs a private mount namespace, which cannot be made here: "
              "proot cannot limit the size of /tmp\n",
              run.stderrText);
}

// A checkout in a folder only its owner may enter (a home folder) is out of
// the unprivileged user's reach: the sandbox, its seccomp helper and the
// simulator are copied into a folder that user may read. The state folder,
// made under /var/lib where /var is already a layer, can be written.
TEST(SandboxHost, UnprivilegedCallerGetsASandboxEvenFromAPrivateCheckout) {
    if (::geteuid() != 0 || !fileExists("/usr/bin/setpriv")) {
        GTEST_SKIP() << "needs root and setpriv to become an unprivileged user";
    }
    QuorvexTest::TemporaryDirectory readable;
    ::chmod(readable.path().c_str(), 0755);
    std::string const sandbox = readable.file("sandbox");
    std::string const simulator = readable.file("pylon-sim");
    std::filesystem::copy_file(QuorvexTest::sandboxPath(), sandbox);
    std::filesystem::copy_file(_seccompHelperPath(), readable.file("sandbox-seccomp.py"));
    std::filesystem::copy_file(QuorvexTest::simulatorPath(), simulator);
    _makeExecutable(sandbox);
    _makeExecutable(simulator);
    CommandResult const run =
        runCommand({"/usr/bin/setpriv", "--reuid=65534", "--regid=65534", "--clear-groups",
                    "/usr/bin/env", "-C", "/", sandbox, "--sim", simulator, "--", "sh", "-c",
                    std::string("test -d /var/adm/quorvex/VPD && test -x /usr/bin/runact-api") +
                        " && touch /var/lib/quorvex-survey/history.sqlite"});
    if (run.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
        GTEST_SKIP() << run.stderrText;
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
    EXPECT_EQ(gc_ExitUsage, _sandbox({"--state", "/nonexistent", "--", "true"}).exitStatus);
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
          "--readonly-vpd", "--readonly-trace", "--readonly-tmp", "--tmp-size SIZE", "--state DIR",
          "--readonly-state", "/var/lib/quorvex-survey", "--bind SRC:DST", "77", "120", "125",
          "QUORVEX_SANDBOX=namespace|proot", "QUORVEX_SANDBOX_FAIL_MOUNT=PATH",
          "QUORVEX_SANDBOX_KIND"}) {
        EXPECT_NE(std::string::npos, run.stdoutText.find(option)) << option;
    }
}

// sim/README.md shows the simulated console answering at its real path with
// this command line, run from the checkout's root: the tool's folder exists
// only inside the sandbox, and the simulator is named by a relative path.
TEST(SandboxHost, SimulatorReadmeExamplePrintsTheDemoListing) {
    std::string const simulator =
        std::filesystem::relative(QuorvexTest::simulatorPath(), QuorvexTest::sourceRoot()).string();
    CommandResult const run = runCommand(
        {"/usr/bin/env", "-C", QuorvexTest::sourceRoot(),
         "PYLON_SIM_SCENARIO=" + QuorvexTest::shippedScenario("demo.scn"), "tools/sandbox", "--sim",
         simulator, "--", "/opt/vtc/bin/lspartition", "-ix", "-c", "9119-MHE_21ABCDE"});
    if (run.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
        GTEST_SKIP() << run.stderrText;
    }
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
    EXPECT_EQ("1,10.20.30.41,3,aurora,Zeph,7.2;2,10.20.30.42,3,boreas,Zeph,7.3;"
              "3,10.20.30.43,1,cirrus,Zeph,7.1;4,10.20.30.44,3,delta,Zeph,7.2;"
              "5,10.20.30.45,3,eos,Linux,5.14;6,10.20.30.46,3,fjord,Zeph,7.3;"
              "7,10.20.30.47,3,,Zeph,7.2;\n",
              run.stdoutText);
    EXPECT_EQ("", run.stderrText);
}

TEST(SandboxHost, CommandInAFolderThatOnlyTheSandboxHasRuns) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file("hello"), "#!/bin/sh\necho hello\n");
    _makeExecutable(folder.file("hello"));
    std::string const inside = _pathMissingOnTheHost(folder, "/bin/hello");
    CommandResult const run =
        runInSandbox({"--bind", folder.file("hello") + ":" + inside}, {inside});
    if (run.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
        GTEST_SKIP() << run.stderrText;
    }
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
    EXPECT_EQ("hello\n", run.stdoutText);
    EXPECT_FALSE(fileExists(_pathMissingOnTheHost(folder, "")));
}

TEST(SandboxHost, MissingSimulatorIsNamedInTheMessage) {
    CommandResult const run = _sandbox({"--sim", "/nonexistent/pylon-sim", "--", "true"});
    EXPECT_EQ(gc_ExitUsage, run.exitStatus);
    EXPECT_EQ("sandbox: simulator '/nonexistent/pylon-sim' is not an executable file\n"
              "sandbox: try 'tools/sandbox --help'\n",
              run.stderrText);
}

TEST(SandboxHost, CommandMissingInTheNamespaceGives127AndSaysSo) {
    QuorvexTest::TemporaryDirectory unique;
    std::string const missing = _pathMissingOnTheHost(unique, "/bin/missing");
    CommandResult const run = _sandboxWith({"QUORVEX_SANDBOX=namespace"}, {"--", missing});
    if (run.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
        GTEST_SKIP() << run.stderrText;
    }
    EXPECT_EQ(127, run.exitStatus);
    EXPECT_EQ("sandbox: command not found in the sandbox: " + missing + "\n", run.stderrText);
}

TEST(SandboxHost, CommandMissingUnderProotFailsNamingIt) {
    QuorvexTest::TemporaryDirectory unique;
    std::string const missing = _pathMissingOnTheHost(unique, "/bin/missing");
    CommandResult const run = _sandboxWith({"QUORVEX_SANDBOX=proot"}, {"--", missing});
    if (run.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
        GTEST_SKIP() << run.stderrText;
    }
    EXPECT_NE(0, run.exitStatus);
    EXPECT_NE(std::string::npos, run.stderrText.find(missing)) << run.stderrText;
}

TEST(SandboxHost, MissingSeccompHelperUnderProotFailsNamingIt) {
    QuorvexTest::TemporaryDirectory folder;
    std::string const sandbox = folder.file("sandbox");
    std::filesystem::copy_file(QuorvexTest::sandboxPath(), sandbox);
    _makeExecutable(sandbox);
    CommandResult const run =
        runCommand({"/usr/bin/env", "QUORVEX_SANDBOX=proot", sandbox, "--", "true"});
    if (run.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
        GTEST_SKIP() << run.stderrText;
    }
    EXPECT_EQ(gc_ExitSetupFailed, run.exitStatus);
    EXPECT_EQ("sandbox: the proot sandbox needs " + folder.file("sandbox-seccomp.py") +
                  ", which is missing: keep sandbox-seccomp.py in the folder of tools/sandbox\n",
              run.stderrText);
}

// A step of the script that fails where no check of its own names it would
// otherwise end the run silently under set -e: here dirname, replaced by one
// that fails, is the first step.
TEST(SandboxHost, StepThatFailsUnexpectedlyIsNamedInTheMessage) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file("dirname"), "#!/bin/sh\nexit 3\n");
    _makeExecutable(folder.file("dirname"));
    char const* path = std::getenv("PATH");
    CommandResult const run = runCommand(
        {"/usr/bin/env", "PATH=" + folder.path() + ":" + (path != nullptr ? path : "/usr/bin:/bin"),
         QuorvexTest::sandboxPath(), "--", "true"});
    EXPECT_EQ(gc_ExitSetupFailed, run.exitStatus);
    EXPECT_TRUE(util::startsWith(
        run.stderrText, "sandbox: 'dirname -- \"$0\"' failed with status 3 (tools/sandbox, line "))
        << run.stderrText;
    EXPECT_TRUE(util::endsWith(run.stderrText,
                               "run 'bash -x tools/sandbox ...' to see the step that failed\n"))
        << run.stderrText;
}

TEST(SandboxHost, SeccompHelperAnswersHelpAndRefusesAMissingCommand) {
    CommandResult const help = runCommand({_seccompHelperPath(), "--help"});
    EXPECT_EQ(0, help.exitStatus);
    EXPECT_TRUE(
        util::startsWith(help.stdoutText, "Usage: tools/sandbox-seccomp.py COMMAND [ARGS...]\n"))
        << help.stdoutText;
    CommandResult const bare = runCommand({_seccompHelperPath()});
    EXPECT_EQ(gc_ExitUsage, bare.exitStatus);
    EXPECT_EQ("sandbox-seccomp.py: no command given\n"
              "sandbox-seccomp.py: try 'tools/sandbox-seccomp.py --help'\n",
              bare.stderrText);
}

TEST(SandboxHost, SeccompHelperRefusesStatxWithEnosys) {
    CommandResult const run = runCommand(
        {_seccompHelperPath(), "python3", "-c",
         "import ctypes, os\n"
         "libc = ctypes.CDLL(None, use_errno=True)\n"
         "buffer = ctypes.create_string_buffer(256)\n"
         "result = libc.syscall(332 if os.uname().machine == 'x86_64' else 291, -100, b'/', 0, 0,"
         " buffer)\n"
         "print(result, os.strerror(ctypes.get_errno()))\n"});
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
    EXPECT_EQ("-1 Function not implemented\n", run.stdoutText);
}

TEST(SandboxHost, CommandArgumentUnderTmpGetsOneWarningLineEach) {
    CommandResult const run =
        _sandboxWith({}, {"--", "true", "--report", "/tmp/quorvex-report", "/tmp/survey.json"});
    if (run.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
        GTEST_SKIP() << run.stderrText;
    }
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
    EXPECT_EQ(_privateTmpWarning("/tmp/quorvex-report") + _privateTmpWarning("/tmp/survey.json"),
              run.stderrText);
}

TEST(SandboxHost, CommandArgumentOutsideTmpGetsNoWarning) {
    CommandResult const run = _sandboxWith(
        {}, {"--", "true", "--summary", QuorvexTest::sourceRoot() + "/out/summary.json",
             "--report=/var/tmp/report", "/tmpfile", "tmp/relative"});
    if (run.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
        GTEST_SKIP() << run.stderrText;
    }
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
    EXPECT_EQ("", run.stderrText);
}

TEST(SandboxHost, OptionWithATmpValueAfterAnEqualsSignGetsAWarning) {
    CommandResult const run = _sandboxWith({}, {"--", "true", "--summary=/tmp/x.json"});
    if (run.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
        GTEST_SKIP() << run.stderrText;
    }
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
    EXPECT_EQ(_privateTmpWarning("/tmp/x.json"), run.stderrText);
}

TEST(SandboxHost, ScenarioVariableUnderTmpGetsAWarningNamingTheVariable) {
    CommandResult const run =
        _sandboxWith({"PYLON_SIM_SCENARIO=/tmp/demo.scn", "PYLON_SIM_LOG="}, {"--", "true"});
    if (run.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
        GTEST_SKIP() << run.stderrText;
    }
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
    EXPECT_EQ("sandbox: warning: /tmp/demo.scn (PYLON_SIM_SCENARIO) is inside the sandbox's "
              "private /tmp: it is not seen outside the sandbox; use a folder outside /tmp\n",
              run.stderrText);
}

// A folder under /tmp that is bound into the sandbox, by --bind or as the
// working folder, is the host's own: paths in it are seen on both sides.
TEST(SandboxHost, PathInAFolderBoundIntoTheSandboxGetsNoWarning) {
    QuorvexTest::TemporaryDirectory bound;
    QuorvexTest::TemporaryDirectory working;
    CommandResult const run = runCommand(
        {"/usr/bin/env", "-C", working.path(), "PYLON_SIM_SCENARIO=" + bound.file("demo.scn"),
         QuorvexTest::sandboxPath(), "--sim", QuorvexTest::simulatorPath(), "--bind",
         bound.path() + ":" + bound.path(), "--", "true", bound.file("summary.json"),
         "--report=" + working.file("report")});
    if (run.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
        GTEST_SKIP() << run.stderrText;
    }
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
    EXPECT_EQ("", run.stderrText);
}

TEST(SandboxHost, HelpDescribesTheWarningForPathsUnderTmp) {
    CommandResult const run = _sandbox({"--help"});
    EXPECT_NE(std::string::npos, run.stdoutText.find("sandbox: warning: PATH is inside the "
                                                     "sandbox's private /tmp"))
        << run.stdoutText;
}
