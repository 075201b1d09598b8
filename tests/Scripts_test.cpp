// Runs on the host: every script under tools/, fuzz/ and .ci/ answers
// --help and -h with its usage and refuses an unknown option before it does
// anything else (no build, no package installation, no sandbox).

#include "QuorvexTest.h"
#include "utility/TextChecks.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <string>
#include <sys/stat.h>
#include <vector>

using QuorvexTest::CommandResult;
using QuorvexTest::runCommand;

namespace {

// Each script with the first words of its usage line.
struct Script {
    char const* path;
    char const* usage;
};

std::vector<Script> const& _scripts() {
    static std::vector<Script> const scripts{
        {"tools/check-ansible", "Usage: tools/check-ansible\n"},
        {"tools/check-css", "Usage: tools/check-css FILE...\n"},
        {"tools/check-static", "Usage: tools/check-static [--page]\n"},
        {"tools/check-units", "Usage: tools/check-units BUILD_DIR\n"},
        {"tools/coverage", "Usage: tools/coverage\n"},
        {"tools/demo", "Usage: tools/demo [SCENARIO [IDENTITY]]\n"},
        {"tools/ensure-deps", "Usage: tools/ensure-deps [PACKAGE ...]\n"},
        {"tools/sandbox", "Usage: tools/sandbox [options] -- command [args...]\n"},
        {"tools/test", "Usage: tools/test [PRESET]\n"},
        {"fuzz/run", "Usage: fuzz/run [SECONDS [TARGET ...]]\n"},
        {".ci/run", "Usage: .ci/run\n"},
    };
    return scripts;
}

CommandResult _run(Script const& script, std::string const& argument) {
    return runCommand({QuorvexTest::sourceRoot() + "/" + script.path, argument});
}

// A folder, put first in PATH, whose cmake does nothing and whose ctest
// prints the given summary and exits with the given status, so that
// tools/test can be run without building anything.
class StandInBuildTools {
public:
    StandInBuildTools(std::string const& ctestSummary, int ctestStatus) {
        std::string const log = R"(echo "$(basename "$0") $*" >> ')" + calls() + "'\n";
        _write("cmake", log + "exit 0\n");
        QuorvexTest::writeFile(_folder.file("summary"), ctestSummary);
        _write("ctest", log + "cat '" + _folder.file("summary") + "'\nexit " +
                            std::to_string(ctestStatus) + "\n");
    }

    CommandResult runTest(std::string const& allowSkips, std::string const& preset = "") const {
        char const* path = std::getenv("PATH");
        std::vector<std::string> argv{
            "/usr/bin/env",
            "PATH=" + _folder.path() + ":" + (path != nullptr ? path : "/usr/bin:/bin"),
            "QUORVEX_ALLOW_SKIPS=" + allowSkips, QuorvexTest::sourceRoot() + "/tools/test"};
        if (!preset.empty()) {
            argv.push_back(preset);
        }
        return runCommand(argv);
    }

    // The file the stand-ins log their command lines to, one per call.
    std::string calls() const { return _folder.file("calls"); }

private:
    void _write(std::string const& name, std::string const& body) const {
        QuorvexTest::writeFile(_folder.file(name), "#!/bin/sh\n" + body);
        ::chmod(_folder.file(name).c_str(), 0755);
    }

    QuorvexTest::TemporaryDirectory _folder;
};

// A folder, put first in PATH, that lets tools/ensure-deps reach apt-get
// without touching the host's packages: an id that says root, and an
// apt-get, given as a shell script body, that records its arguments, one
// call a line, in the file "calls". Every package counts as missing
// (QUORVEX_DEPS_ROOT names an empty folder).
class StandInAptGet {
public:
    explicit StandInAptGet(std::string const& body) {
        _write("id", "echo 0\n");
        _write("apt-get", R"(printf '%s\n' "$*" >>')" + calls() + "'\n" + body);
    }

    std::string calls() const { return _folder.file("calls"); }

    CommandResult runEnsureDeps(std::string const& lockSeconds) const {
        char const* path = std::getenv("PATH");
        return runCommand(
            {"/usr/bin/env",
             "PATH=" + _folder.path() + ":" + (path != nullptr ? path : "/usr/bin:/bin"),
             "QUORVEX_DEPS_ROOT=" + _noPackages.path(), "QUORVEX_APT_LOCK_SECONDS=" + lockSeconds,
             QuorvexTest::sourceRoot() + "/tools/ensure-deps"});
    }

private:
    void _write(std::string const& name, std::string const& body) const {
        QuorvexTest::writeFile(_folder.file(name), "#!/bin/sh\n" + body);
        ::chmod(_folder.file(name).c_str(), 0755);
    }

    QuorvexTest::TemporaryDirectory _folder;
    QuorvexTest::TemporaryDirectory _noPackages;
};

// What apt-get says when another process holds the lock of its package
// lists (it does not wait for that one) and of dpkg's frontend (it waits
// for DPkg::Lock::Timeout seconds, saying so on its standard output).
constexpr char gc_ListsLockHeld[] =
    "echo 'Reading package lists...'\n"
    "echo 'E: Could not get lock /var/lib/apt/lists/lock. It is held by process 812 "
    "(apt-get)' >&2\n"
    "echo 'E: Unable to lock directory /var/lib/apt/lists/' >&2\n"
    "exit 100\n";
constexpr char gc_FrontendLockHeldOnInstall[] =
    "case \" $* \" in *' install '*)\n"
    "  echo 'Waiting for cache lock: Could not get lock /var/lib/dpkg/lock-frontend. It is held "
    "by process 4030 (unattended-upgr)...'\n"
    "  echo 'Waiting for cache lock: Could not get lock /var/lib/dpkg/lock-frontend. It is held "
    "by process 4030 (unattended-upgr)...'\n"
    "  echo 'E: Unable to acquire the dpkg frontend lock (/var/lib/dpkg/lock-frontend), is "
    "another process using it?' >&2\n"
    "  exit 100 ;;\n"
    "esac\n";

constexpr char gc_Packages[] = "cmake g++ make libgtest-dev util-linux time proot python3 "
                               "libcli11-dev nlohmann-json3-dev python3-jsonschema libexpat1-dev "
                               "systemd man-db libsqlite3-dev libsqlitecpp-dev libpugixml-dev "
                               "prometheus python3-prometheus-client libxml2-utils ansible-core "
                               "openssh-server openssh-client";

std::string _waitingLine(std::string const& lock, std::string const& seconds) {
    return "ensure-deps: another package manager holds apt's lock " + lock +
           "; waiting for it, up to " + seconds + " s (QUORVEX_APT_LOCK_SECONDS)\n";
}

std::string _stillHeldLine(std::string const& lock, std::string const& seconds) {
    return "ensure-deps: apt's lock " + lock + " is still held after " + seconds +
           " s: another package manager (an automatic upgrade, say) is at work. Let it finish "
           "and run tools/ensure-deps again, or wait longer with "
           "QUORVEX_APT_LOCK_SECONDS=SECONDS.\n";
}

constexpr char gc_SummaryWithSkips[] = "90% tests passed, 0 tests failed out of 10\n"
                                       "\n"
                                       "The following tests did not run:\n"
                                       "\t  3 - Sandbox.TmpSizeLimitsTmp (Skipped)\n"
                                       "\t  7 - Sandbox.ReadonlyTmpRefusesNewFiles (Skipped)\n";
constexpr char gc_SummaryWithoutSkips[] = "100% tests passed, 0 tests failed out of 10\n";

} // namespace

TEST(Scripts, HelpPrintsTheUsageAndSucceeds) {
    for (Script const& script : _scripts()) {
        for (char const* option : {"--help", "-h"}) {
            CommandResult const run = _run(script, option);
            EXPECT_EQ(0, run.exitStatus) << script.path << " " << option;
            EXPECT_TRUE(util::startsWith(run.stdoutText, script.usage))
                << script.path << " " << option << ":\n"
                << run.stdoutText;
            EXPECT_EQ("", run.stderrText) << script.path << " " << option;
        }
    }
}

TEST(Scripts, UnknownOptionIsRefusedWithAMessageAndNothingElse) {
    for (Script const& script : _scripts()) {
        CommandResult const run = _run(script, "--bogus");
        EXPECT_NE(0, run.exitStatus) << script.path;
        EXPECT_EQ("", run.stdoutText) << script.path;
        EXPECT_NE(std::string::npos, run.stderrText.find("'--bogus'")) << run.stderrText;
        EXPECT_NE(std::string::npos, run.stderrText.find("--help")) << run.stderrText;
    }
}

TEST(Scripts, CheckUnitsRefusesAFolderThatIsNoConfiguredBuildBeforeInstallingAnything) {
    QuorvexTest::TemporaryDirectory const empty;
    CommandResult const run =
        runCommand({QuorvexTest::sourceRoot() + "/tools/check-units", empty.path()});
    EXPECT_EQ(2, run.exitStatus);
    EXPECT_EQ("", run.stdoutText);
    EXPECT_EQ("check-units: '" + empty.path() +
                  "' is no configured build folder\n"
                  "check-units: try 'tools/check-units --help'\n",
              run.stderrText);
}

TEST(Scripts, CheckUnitsRefusesAMissingOrASecondBuildFolder) {
    CommandResult const none = runCommand({QuorvexTest::sourceRoot() + "/tools/check-units"});
    EXPECT_EQ(2, none.exitStatus);
    EXPECT_EQ("check-units: no build folder given\ncheck-units: try 'tools/check-units --help'\n",
              none.stderrText);
    CommandResult const two =
        runCommand({QuorvexTest::sourceRoot() + "/tools/check-units", "a", "b"});
    EXPECT_EQ(2, two.exitStatus);
    EXPECT_EQ("check-units: too many arguments\ncheck-units: try 'tools/check-units --help'\n",
              two.stderrText);
}

TEST(Scripts, DemoHelpIsNotTakenForAScenarioFile) {
    CommandResult const run = runCommand({QuorvexTest::sourceRoot() + "/tools/demo", "--help"});
    EXPECT_EQ(std::string::npos, run.stdoutText.find("no scenario file")) << run.stdoutText;
    EXPECT_EQ(std::string::npos, run.stderrText.find("no scenario file")) << run.stderrText;
}

TEST(Scripts, TestHelpIsNotHandedToCmake) {
    CommandResult const run = runCommand({QuorvexTest::sourceRoot() + "/tools/test", "--help"});
    EXPECT_EQ(0, run.exitStatus);
    EXPECT_TRUE(util::startsWith(run.stdoutText, "Usage: tools/test [PRESET]\n")) << run.stdoutText;
    EXPECT_EQ(std::string::npos, run.stdoutText.find("Preset CMake variables")) << run.stdoutText;
}

TEST(Scripts, TestRefusesAnUnknownPreset) {
    CommandResult const run = runCommand({QuorvexTest::sourceRoot() + "/tools/test", "release2"});
    EXPECT_EQ(2, run.exitStatus);
    EXPECT_EQ("test: unknown preset 'release2' (dev, ci, asan or fault)\n"
              "test: try 'tools/test --help'\n",
              run.stderrText);
}

TEST(Scripts, TestRefusesAnAllowSkipsValueOtherThanZeroOrOne) {
    CommandResult const run = runCommand({"/usr/bin/env", "QUORVEX_ALLOW_SKIPS=yes",
                                          QuorvexTest::sourceRoot() + "/tools/test", "dev"});
    EXPECT_EQ(2, run.exitStatus);
    EXPECT_EQ("test: QUORVEX_ALLOW_SKIPS must be 0 or 1, not 'yes'\n"
              "test: try 'tools/test --help'\n",
              run.stderrText);
}

TEST(Scripts, TestFailsWhenATestWasSkipped) {
    CommandResult const run = StandInBuildTools(gc_SummaryWithSkips, 0).runTest("0");
    EXPECT_EQ(1, run.exitStatus);
    EXPECT_NE(std::string::npos, run.stdoutText.find(gc_SummaryWithSkips)) << run.stdoutText;
    EXPECT_NE(std::string::npos,
              run.stderrText.find("test: 2 tests skipped (listed above; their output, with the "
                                  "reason, is in build/dev/Testing/Temporary/LastTest.log); a "
                                  "skipped test did not run. Set QUORVEX_ALLOW_SKIPS=1 to accept "
                                  "skips.\n"))
        << run.stderrText;
}

TEST(Scripts, TestAcceptsSkipsWhenAllowed) {
    CommandResult const run = StandInBuildTools(gc_SummaryWithSkips, 0).runTest("1");
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
    EXPECT_NE(std::string::npos,
              run.stdoutText.find("test: 2 tests skipped, allowed by QUORVEX_ALLOW_SKIPS=1\n"))
        << run.stdoutText;
}

TEST(Scripts, TestPassesWithoutSkips) {
    CommandResult const run = StandInBuildTools(gc_SummaryWithoutSkips, 0).runTest("0");
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
    EXPECT_EQ(std::string::npos, run.stdoutText.find("skipped")) << run.stdoutText;
}

TEST(Scripts, TestFailsWithTheStatusOfFailedTests) {
    CommandResult const run = StandInBuildTools(gc_SummaryWithoutSkips, 8).runTest("1");
    EXPECT_EQ(8, run.exitStatus) << run.stderrText;
}

TEST(Scripts, TestFaultBuildsTheDevPresetAndRunsOnlyTheSlowFaultRuns) {
    StandInBuildTools const tools(gc_SummaryWithoutSkips, 0);
    CommandResult const run = tools.runTest("0", "fault");
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
    EXPECT_EQ(QuorvexTest::linesOf(QuorvexTest::readFile(tools.calls())),
              (std::vector<std::string>{"cmake --preset dev", "cmake --build --preset dev",
                                        "ctest --preset fault"}));
}

TEST(Scripts, EnsureDepsPassesTheLockBoundToAptGetAndNamesAListsLockStillHeld) {
    StandInAptGet const aptGet(gc_ListsLockHeld);
    CommandResult const run = aptGet.runEnsureDeps("2");
    EXPECT_EQ(1, run.exitStatus);
    std::vector<std::string> const calls =
        QuorvexTest::linesOf(QuorvexTest::readFile(aptGet.calls()));
    ASSERT_LE(2U, calls.size());
    EXPECT_EQ("-o DPkg::Lock::Timeout=2 update -q", calls.front());
    for (std::string const& call : calls) {
        EXPECT_TRUE(util::startsWith(call, "-o DPkg::Lock::Timeout=")) << call;
        EXPECT_TRUE(util::endsWith(call, " update -q")) << call;
    }
    std::string const lock = "/var/lib/apt/lists/lock (held by process 812 (apt-get))";
    EXPECT_EQ(_waitingLine(lock, "2") + _stillHeldLine(lock, "2"), run.stderrText);
}

TEST(Scripts, EnsureDepsSaysOnceThatItWaitsForTheFrontendLockAndNamesItAfterTheBound) {
    StandInAptGet const aptGet(gc_FrontendLockHeldOnInstall);
    CommandResult const run = aptGet.runEnsureDeps("0");
    EXPECT_EQ(1, run.exitStatus);
    EXPECT_EQ(std::string("-o DPkg::Lock::Timeout=0 update -q\n"
                          "-o DPkg::Lock::Timeout=0 install -y -q --no-install-recommends ") +
                  gc_Packages + "\n",
              QuorvexTest::readFile(aptGet.calls()));
    std::string const lock = "/var/lib/dpkg/lock-frontend (held by process 4030 (unattended-upgr))";
    EXPECT_EQ(_waitingLine(lock, "0") + _stillHeldLine(lock, "0"), run.stderrText);
    EXPECT_EQ(std::string::npos, run.stdoutText.find("Waiting for cache lock")) << run.stdoutText;
}

TEST(Scripts, EnsureDepsGoesOnOnceTheLockIsFreed) {
    // The first call finds the lock held and leaves a mark beside apt-get.
    StandInAptGet const heldOnce(std::string("if [ ! -e \"${0%/*}/freed\" ]; then\n"
                                             ": >\"${0%/*}/freed\"\n") +
                                 gc_ListsLockHeld + "fi\n");
    CommandResult const run = heldOnce.runEnsureDeps("60");
    EXPECT_EQ(0, run.exitStatus) << run.stderrText;
    std::vector<std::string> const calls =
        QuorvexTest::linesOf(QuorvexTest::readFile(heldOnce.calls()));
    ASSERT_EQ(3U, calls.size());
    EXPECT_EQ("-o DPkg::Lock::Timeout=60 update -q", calls[0]);
    EXPECT_TRUE(util::endsWith(calls[1], " update -q")) << calls[1];
    EXPECT_TRUE(util::endsWith(calls[2], std::string(" install -y -q --no-install-recommends ") +
                                             gc_Packages))
        << calls[2];
    EXPECT_EQ(_waitingLine("/var/lib/apt/lists/lock (held by process 812 (apt-get))", "60"),
              run.stderrText);
}

TEST(Scripts, EnsureDepsPassesOnAnAptGetFailureThatIsNotALock) {
    StandInAptGet const aptGet("echo 'E: The repository is not signed.' >&2\nexit 100\n");
    CommandResult const run = aptGet.runEnsureDeps("60");
    EXPECT_EQ(100, run.exitStatus);
    EXPECT_EQ("-o DPkg::Lock::Timeout=60 update -q\n", QuorvexTest::readFile(aptGet.calls()));
    EXPECT_EQ("E: The repository is not signed.\n", run.stderrText);
}

TEST(Scripts, EnsureDepsRefusesALockBoundThatIsNotANumberOfSeconds) {
    StandInAptGet const aptGet("");
    CommandResult const run = aptGet.runEnsureDeps("5m");
    EXPECT_EQ(2, run.exitStatus);
    EXPECT_EQ("ensure-deps: QUORVEX_APT_LOCK_SECONDS must be a number of seconds, not '5m'\n"
              "ensure-deps: try 'tools/ensure-deps --help'\n",
              run.stderrText);
    EXPECT_FALSE(QuorvexTest::fileExists(aptGet.calls()));
}

TEST(Scripts, EnsureDepsHelpDocumentsTheLockBoundAndItsDefault) {
    CommandResult const run =
        runCommand({QuorvexTest::sourceRoot() + "/tools/ensure-deps", "--help"});
    EXPECT_NE(std::string::npos, run.stdoutText.find("QUORVEX_APT_LOCK_SECONDS=SECONDS"))
        << run.stdoutText;
    EXPECT_NE(std::string::npos, run.stdoutText.find("default 300")) << run.stdoutText;
}
