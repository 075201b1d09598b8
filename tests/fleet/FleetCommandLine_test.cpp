// The command line of quorvex-survey: a bad one is refused with status 64,
// its reason on one line and where the help is on the next, before anything
// runs; help and version need no console.
// Runs inside the sandbox, so "nothing runs" is seen in the console's
// invocation log and the empty result folders.

#include "FleetTools.h"
#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <ostream>

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

struct BadCommandLine {
    // cppcheck-suppress unusedStructMember ; read by the test name generator
    std::string name;
    // cppcheck-suppress unusedStructMember ; read through GetParam()
    std::vector<std::string> arguments;
    // cppcheck-suppress unusedStructMember ; read through GetParam()
    std::string reason;
    // cppcheck-suppress unusedStructMember ; read through GetParam()
    std::string helpCommand = "quorvex-survey";
};

// The case by its name in test listings, not as the bytes of the struct.
void PrintTo(BadCommandLine const& badCommandLine, std::ostream* out) {
    *out << badCommandLine.name;
}

class FleetBadCommandLine : public ::testing::TestWithParam<BadCommandLine> {};

TEST_P(FleetBadCommandLine, IsRefusedWithItsReasonAndWhereTheHelpIsAndRunsNothing) {
    QuorvexTest::clearFolder(QuorvexTest::gc_VPD_Folder);
    QuorvexTest::clearFolder(QuorvexTest::gc_TraceFolder);
    SimulatedConsole const console(gc_Console);
    CommandResult const result = runSurvey(GetParam().arguments);
    EXPECT_EQ(result.exitStatus, 64);
    EXPECT_EQ(result.stdoutText, "");
    EXPECT_EQ(result.stderrText, "quorvex-survey: " + GetParam().reason + " (try '" +
                                     GetParam().helpCommand + " --help')\n");
    EXPECT_EQ(console.invocations(), std::vector<QuorvexTest::Invocation>{}) << "console called";
    EXPECT_EQ(QuorvexTest::listFolder(QuorvexTest::gc_VPD_Folder), std::vector<std::string>{});
    EXPECT_EQ(QuorvexTest::listFolder(QuorvexTest::gc_TraceFolder), std::vector<std::string>{});
}

constexpr char gc_Machine[] = "1234-ABC_10ABCDE";
constexpr char gc_NoMachine[] =
    "no machine to survey: give identities (type-model_serial) or --all";
constexpr char gc_JobsTake[] = "-j/--jobs takes a whole number from 1 to 1024, not ";
constexpr char gc_TimeoutTakes[] =
    "-t/--timeout takes a whole number of seconds from 0 to 31536000, not ";
constexpr char gc_StaleAfterTakes[] =
    "--stale-after takes a whole number of runs from 1 to 1000000, not ";

INSTANTIATE_TEST_SUITE_P(
    Cases, FleetBadCommandLine,
    ::testing::Values(
        BadCommandLine{"NoIdentityAndNoAll", {}, gc_NoMachine},
        BadCommandLine{"OnlyOptions", {"-j", "4", "-q"}, gc_NoMachine},
        BadCommandLine{"AllWithIdentity",
                       {"--all", "9119-MHE_21ABCDE"},
                       "--all and identities exclude each other: give either --all or identities"},
        BadCommandLine{"MistypedJobsAfterAll",
                       {"--all", "--job", "4"},
                       "unknown option --job: did you mean --jobs?"},
        BadCommandLine{"MistypedSummaryAfterAll",
                       {"--all", "--sumary", "x.json"},
                       "unknown option --sumary: did you mean --summary?"},
        BadCommandLine{"MistypedSummaryWithIdentity",
                       {"--sumary", gc_Machine},
                       "unknown option --sumary: did you mean --summary?"},
        BadCommandLine{
            "UnknownOption", {"--frobnicate", gc_Machine}, "unknown option --frobnicate"},
        BadCommandLine{"ZeroJobs", {"-j", "0", gc_Machine}, std::string(gc_JobsTake) + "'0'"},
        BadCommandLine{
            "TooManyJobs", {"-j", "2000", gc_Machine}, std::string(gc_JobsTake) + "'2000'"},
        BadCommandLine{
            "JobsNotANumber", {"--jobs", "many", gc_Machine}, std::string(gc_JobsTake) + "'many'"},
        BadCommandLine{"JobsWithoutValue",
                       {gc_Machine, "-j"},
                       "-j/--jobs needs a value (a whole number from 1 to 1024)"},
        BadCommandLine{
            "FractionalTimeout", {"-t", "1.5", gc_Machine}, std::string(gc_TimeoutTakes) + "'1.5'"},
        BadCommandLine{
            "NegativeTimeout", {"-t", "-1", gc_Machine}, std::string(gc_TimeoutTakes) + "'-1'"},
        BadCommandLine{"TimeoutNotANumber",
                       {"--timeout", "soon", gc_Machine},
                       std::string(gc_TimeoutTakes) + "'soon'"},
        BadCommandLine{"SummaryWithoutFile",
                       {gc_Machine, "--summary"},
                       "--summary needs a value (a file name)"},
        BadCommandLine{"ReportWithUnknownOption",
                       {"report", "--bogus", "/tmp/report"},
                       "report: unknown option --bogus",
                       "quorvex-survey report"},
        BadCommandLine{"ZeroStaleAfter",
                       {"--all", "--stale-after", "0"},
                       std::string(gc_StaleAfterTakes) + "'0'"},
        BadCommandLine{"StaleAfterWithTrailingCharacters",
                       {"--all", "--stale-after=2x"},
                       std::string(gc_StaleAfterTakes) + "'2x'"},
        BadCommandLine{"StaleAfterWithoutValue",
                       {"--all", "--stale-after"},
                       "--stale-after needs a value (a whole number of runs from 1 to 1000000)"},
        BadCommandLine{"ReportWithTooLargeStaleAfter",
                       {"report", "--stale-after", "1000001", "/tmp/report"},
                       "report: " + std::string(gc_StaleAfterTakes) + "'1000001'",
                       "quorvex-survey report"},
        BadCommandLine{"ReportStaleAfterNotANumber",
                       {"report", "--stale-after", "three", "/tmp/report"},
                       "report: " + std::string(gc_StaleAfterTakes) + "'three'",
                       "quorvex-survey report"},
        BadCommandLine{"ReportStaleAfterWithoutValue",
                       {"report", "/tmp/report", "--stale-after"},
                       "report: --stale-after needs a value (a whole number of runs from 1 to "
                       "1000000)",
                       "quorvex-survey report"},
        BadCommandLine{"ReportWithoutFolder",
                       {"report"},
                       "report: no DIR given (the folder to write the report into)",
                       "quorvex-survey report"}),
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

TEST(FleetCommandLine, HelpHasNoParserNotation) {
    CommandResult const result = runSurvey({"--help"});
    EXPECT_EQ(result.exitStatus, 0) << result.stderrText;
    EXPECT_EQ(result.stdoutText.rfind("Usage: quorvex-survey [options] IDENTITY...\n", 0), 0U)
        << result.stdoutText;
    EXPECT_NE(result.stdoutText.find("-j, --jobs N "), std::string::npos) << result.stdoutText;
    EXPECT_NE(result.stdoutText.find("(default 8)"), std::string::npos) << result.stdoutText;
    for (char const* notation : {"UINT", "TEXT", "in [", "=8", "Excludes"}) {
        EXPECT_EQ(result.stdoutText.find(notation), std::string::npos) << notation << " in:\n"
                                                                       << result.stdoutText;
    }
    EXPECT_EQ(result.stderrText, "");
}

TEST(FleetCommandLine, ReportHelpIsPrintedAndNothingRuns) {
    SimulatedConsole const console(gc_Console);
    CommandResult const result = runSurvey({"report", "--help"});
    EXPECT_EQ(result.exitStatus, 0) << result.stderrText;
    EXPECT_EQ(result.stdoutText.rfind("Usage: quorvex-survey report [--from VPD_FOLDER] "
                                      "[--history FILE] [--stale-after N] DIR\n",
                                      0),
              0U)
        << result.stdoutText;
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
