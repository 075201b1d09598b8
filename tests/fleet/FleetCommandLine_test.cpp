// The command line of quorvex-survey: a bad one is refused with status 64 and
// a usage message before anything runs; help and version need no console.
// Runs inside the sandbox, so "nothing runs" is seen in the console's
// invocation log and the empty result folders.

#include "FleetTools.h"
#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cctype>

namespace {

using QuorvexTest::CommandResult;
using QuorvexTest::SimulatedConsole;

constexpr char gc_Console[] = "[lsvtc]\nstdout 0:1234-ABC_10ABCDE;\n"
                              "[lspartition *]\nstdout 1,10.1.1.11,3,host1,Zeph,7.2;\n";

CommandResult runSurvey(std::vector<std::string> const& arguments) {
    std::vector<std::string> argv{FleetTest::consoleWideTool()};
    argv.insert(argv.end(), arguments.begin(), arguments.end());
    return QuorvexTest::runCommand(argv);
}

std::string lowerCase(std::string text) {
    std::transform(text.begin(), text.end(), text.begin(),
                   [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
    return text;
}

struct BadCommandLine {
    // cppcheck-suppress unusedStructMember ; read by the test name generator
    std::string name;
    // cppcheck-suppress unusedStructMember ; read through GetParam()
    std::vector<std::string> arguments;
};

class FleetBadCommandLine : public ::testing::TestWithParam<BadCommandLine> {};

TEST_P(FleetBadCommandLine, IsRefusedWithUsageAndRunsNothing) {
    QuorvexTest::clearFolder(QuorvexTest::gc_VPD_Folder);
    QuorvexTest::clearFolder(QuorvexTest::gc_TraceFolder);
    SimulatedConsole const console(gc_Console);
    CommandResult const result = runSurvey(GetParam().arguments);
    EXPECT_EQ(result.exitStatus, 64);
    EXPECT_EQ(result.stdoutText, "");
    EXPECT_NE(lowerCase(result.stderrText).find("usage"), std::string::npos)
        << "no usage message: " << result.stderrText;
    EXPECT_EQ(console.invocations(), std::vector<QuorvexTest::Invocation>{}) << "console called";
    EXPECT_EQ(QuorvexTest::listFolder(QuorvexTest::gc_VPD_Folder), std::vector<std::string>{});
    EXPECT_EQ(QuorvexTest::listFolder(QuorvexTest::gc_TraceFolder), std::vector<std::string>{});
}

INSTANTIATE_TEST_SUITE_P(
    Cases, FleetBadCommandLine,
    ::testing::Values(BadCommandLine{"NoIdentityAndNoAll", {}},
                      BadCommandLine{"OnlyOptions", {"-j", "4", "-q"}},
                      BadCommandLine{"UnknownOption", {"--frobnicate", "1234-ABC_10ABCDE"}},
                      BadCommandLine{"ZeroJobs", {"-j", "0", "1234-ABC_10ABCDE"}},
                      BadCommandLine{"JobsNotANumber", {"--jobs", "many", "1234-ABC_10ABCDE"}},
                      BadCommandLine{"JobsWithoutValue", {"1234-ABC_10ABCDE", "-j"}},
                      BadCommandLine{"NegativeTimeout", {"-t", "-1", "1234-ABC_10ABCDE"}},
                      BadCommandLine{"TimeoutNotANumber",
                                     {"--timeout", "soon", "1234-ABC_10ABCDE"}},
                      BadCommandLine{"SummaryWithoutFile", {"1234-ABC_10ABCDE", "--summary"}}),
    [](::testing::TestParamInfo<BadCommandLine> const& info) { return info.param.name; });

TEST(FleetCommandLine, HelpNamesEveryOptionAndRunsNothing) {
    SimulatedConsole const console(gc_Console);
    CommandResult const result = runSurvey({"--help"});
    EXPECT_EQ(result.exitStatus, 0) << result.stderrText;
    for (char const* option : {"--jobs", "-j", "--timeout", "-t", "--summary", "--quiet", "-q",
                               "--all", "--version", "--help"}) {
        EXPECT_NE(result.stdoutText.find(option), std::string::npos) << option << " not in:\n"
                                                                     << result.stdoutText;
    }
    EXPECT_EQ(console.invocations(), std::vector<QuorvexTest::Invocation>{});
}

TEST(FleetCommandLine, VersionIsPrintedAndNothingRuns) {
    SimulatedConsole const console(gc_Console);
    CommandResult const result = runSurvey({"--version"});
    EXPECT_EQ(result.exitStatus, 0) << result.stderrText;
    EXPECT_NE(result.stdoutText, "");
    EXPECT_EQ(console.invocations(), std::vector<QuorvexTest::Invocation>{});
}

} // namespace
