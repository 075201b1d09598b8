// Runs on the host: every script under tools/, fuzz/ and .ci/ answers
// --help and -h with its usage and refuses an unknown option before it does
// anything else (no build, no package installation, no sandbox).

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <string>
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
        {"tools/check-static", "Usage: tools/check-static\n"},
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

bool _startsWith(std::string const& text, std::string const& head) {
    return text.rfind(head, 0) == 0;
}

} // namespace

TEST(Scripts, HelpPrintsTheUsageAndSucceeds) {
    for (Script const& script : _scripts()) {
        for (char const* option : {"--help", "-h"}) {
            CommandResult const run = _run(script, option);
            EXPECT_EQ(0, run.exitStatus) << script.path << " " << option;
            EXPECT_TRUE(_startsWith(run.stdoutText, script.usage))
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
    EXPECT_TRUE(_startsWith(run.stdoutText, "Usage: tools/test [PRESET]\n")) << run.stdoutText;
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
