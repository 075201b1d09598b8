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
        {"tools/check-css", "Usage: tools/check-css FILE...\n"},
        {"tools/check-static", "Usage: tools/check-static [--page]\n"},
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
        _write("cmake", "exit 0\n");
        QuorvexTest::writeFile(_folder.file("summary"), ctestSummary);
        _write("ctest",
               "cat '" + _folder.file("summary") + "'\nexit " + std::to_string(ctestStatus) + "\n");
    }

    CommandResult runTest(std::string const& allowSkips) const {
        char const* path = std::getenv("PATH");
        return runCommand(
            {"/usr/bin/env",
             "PATH=" + _folder.path() + ":" + (path != nullptr ? path : "/usr/bin:/bin"),
             "QUORVEX_ALLOW_SKIPS=" + allowSkips, QuorvexTest::sourceRoot() + "/tools/test"});
    }

private:
    void _write(std::string const& name, std::string const& body) const {
        QuorvexTest::writeFile(_folder.file(name), "#!/bin/sh\n" + body);
        ::chmod(_folder.file(name).c_str(), 0755);
    }

    QuorvexTest::TemporaryDirectory _folder;
};

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
    EXPECT_EQ("test: unknown preset 'release2' (dev, ci or asan)\n"
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
