#include "fleet/CommandLine.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <iostream>
#include <iterator>
#include <sstream>

namespace {

using fleet::parseCommandLine;
using fleet::ParsedCommandLine;

// Parses argv with both standard streams captured.
struct ParseRun {
    ParsedCommandLine parsed;
    std::string out;
    std::string err;
};

ParseRun parse(std::vector<std::string> arguments) {
    arguments.insert(arguments.begin(), "quorvex-survey");
    std::vector<char const*> argv;
    argv.reserve(arguments.size());
    std::transform(arguments.begin(), arguments.end(), std::back_inserter(argv),
                   [](std::string const& argument) { return argument.c_str(); });
    std::ostringstream out;
    std::ostringstream err;
    std::streambuf* const oldOut = std::cout.rdbuf(out.rdbuf());
    std::streambuf* const oldErr = std::cerr.rdbuf(err.rdbuf());
    ParseRun run{parseCommandLine(static_cast<int>(argv.size()), argv.data()), "", ""};
    std::cout.rdbuf(oldOut);
    std::cerr.rdbuf(oldErr);
    run.out = out.str();
    run.err = err.str();
    return run;
}

// The command line is refused with exactly reason and the pointer to the
// help, on standard error, and the program ends with 64.
void expectRefused(std::vector<std::string> const& arguments, std::string const& reason,
                   std::string const& helpCommand = "quorvex-survey") {
    ParseRun const run = parse(arguments);
    ASSERT_TRUE(run.parsed.exitStatus.has_value());
    EXPECT_EQ(*run.parsed.exitStatus, 64);
    EXPECT_EQ(run.out, "");
    EXPECT_EQ(run.err, "quorvex-survey: " + reason + " (try '" + helpCommand + " --help')\n");
}

// An unset variable in a script must not turn an output off silently.
TEST(CommandLine, EmptySummaryOrReportNameIsRefused) {
    expectRefused({"--summary", "", "9119-MHE_21ABCDE"},
                  "--summary needs a file name, not an empty value");
    expectRefused({"--summary=", "--all"}, "--summary needs a file name, not an empty value");
    expectRefused({"--report=", "9119-MHE_21ABCDE"},
                  "--report needs a folder name, not an empty value");
}

TEST(CommandLine, EmptyMetricsOrJunitNameIsRefused) {
    expectRefused({"--metrics", "", "9119-MHE_21ABCDE"},
                  "--metrics needs a file name, not an empty value");
    expectRefused({"--junit=", "--all"}, "--junit needs a file name, not an empty value");
}

TEST(CommandLine, MetricsAndJunitFilesAreReadAndOffUnlessGiven) {
    EXPECT_EQ(parse({"--all"}).parsed.options.metricsFile, "");
    EXPECT_EQ(parse({"--all"}).parsed.options.junitFile, "");
    ParseRun const run =
        parse({"--metrics", "a.prom", "--junit=j.xml", "--metrics", "b.prom", "--all"});
    EXPECT_EQ(run.parsed.options.metricsFile, "b.prom");
    EXPECT_EQ(run.parsed.options.junitFile, "j.xml");
}

TEST(CommandLine, DefaultsAreEightJobsAndHalfAnHour) {
    ParseRun const run = parse({"9119-MHE_21ABCDE"});
    EXPECT_FALSE(run.parsed.exitStatus.has_value());
    EXPECT_EQ(run.parsed.options.jobs, 8U);
    EXPECT_EQ(run.parsed.options.timeoutSeconds, 1800U);
    EXPECT_FALSE(run.parsed.options.quiet);
    EXPECT_FALSE(run.parsed.options.all);
    EXPECT_EQ(run.parsed.options.summaryFile, "");
    EXPECT_EQ(run.parsed.options.identities, (std::vector<std::string>{"9119-MHE_21ABCDE"}));
}

TEST(CommandLine, EveryOptionIsRead) {
    ParseRun const run =
        parse({"-j", "32", "--timeout", "0", "--summary", "s.json", "-q", "--all"});
    EXPECT_FALSE(run.parsed.exitStatus.has_value());
    EXPECT_EQ(run.parsed.options.jobs, 32U);
    EXPECT_EQ(run.parsed.options.timeoutSeconds, 0U);
    EXPECT_EQ(run.parsed.options.summaryFile, "s.json");
    EXPECT_TRUE(run.parsed.options.quiet);
    EXPECT_TRUE(run.parsed.options.all);
}

TEST(CommandLine, RecapIsLeftToTheTerminalUnlessAskedFor) {
    EXPECT_EQ(parse({"A_1"}).parsed.options.recap, std::nullopt);
    EXPECT_EQ(parse({"--recap", "A_1"}).parsed.options.recap, std::optional<bool>(true));
    EXPECT_EQ(parse({"--no-recap", "A_1"}).parsed.options.recap, std::optional<bool>(false));
}

TEST(CommandLine, RecapAndNoRecapTogetherAreRefused) {
    expectRefused({"--recap", "--no-recap", "A_1"}, "--recap excludes --no-recap");
}

TEST(CommandLine, IdentitiesKeepTheirOrder) {
    ParseRun const run = parse({"B_2", "A_1", "--jobs=2", "C_3"});
    EXPECT_EQ(run.parsed.options.identities, (std::vector<std::string>{"B_2", "A_1", "C_3"}));
}

TEST(CommandLine, IdentityGivenTwiceIsKeptOnceWithOneWarning) {
    ParseRun const run = parse({"A_1", "B_2", "A_1", "A_1"});
    EXPECT_EQ(run.parsed.options.identities, (std::vector<std::string>{"A_1", "B_2"}));
    EXPECT_EQ(run.parsed.warnings,
              (std::vector<std::string>{
                  "quorvex-survey: warning: A_1 given more than once, surveyed once"}));
    EXPECT_EQ(run.err, "");
}

TEST(CommandLine, NoMachineSaysToGiveIdentitiesOrAll) {
    std::string const reason = "no machine to survey: give identities (type-model_serial) or --all";
    expectRefused({}, reason);
    expectRefused({"-j", "4"}, reason);
}

TEST(CommandLine, AllWithIdentitiesSaysTheyExcludeEachOther) {
    expectRefused({"--all", "9119-MHE_21ABCDE"},
                  "--all and identities exclude each other: give either --all or identities");
}

TEST(CommandLine, MistypedOptionAfterAllIsNamedWithTheOptionMeant) {
    expectRefused({"--all", "--job", "4"}, "unknown option --job: did you mean --jobs?");
    expectRefused({"--all", "--sumary", "x.json"},
                  "unknown option --sumary: did you mean --summary?");
}

TEST(CommandLine, MistypedOptionBeforeAnIdentityIsNamedWithTheOptionMeant) {
    expectRefused({"--sumary", "9119-MHE_21ABCDE"},
                  "unknown option --sumary: did you mean --summary?");
    expectRefused({"--sumary=x.json", "9119-MHE_21ABCDE"},
                  "unknown option --sumary: did you mean --summary?");
}

TEST(CommandLine, OptionFarFromEveryKnownOneIsNamedAlone) {
    expectRefused({"--frobnicate", "A_1"}, "unknown option --frobnicate");
    expectRefused({"A_1", "-x"}, "unknown option -x");
}

TEST(CommandLine, WordStartingWithDashIsNeverAnIdentity) {
    expectRefused({"-5"}, "unknown option -5");
    expectRefused({"A_1", "--", "-B_2"},
                  "an identity must not start with '-': '-B_2' (after '--' every argument is an "
                  "identity)");
}

// After "--" even a known option's name is an identity: no spelling of it
// is suggested.
TEST(CommandLine, KnownOptionAfterDoubleDashIsRefusedAsAnIdentityWithoutASuggestion) {
    expectRefused({"--", "--all"}, "an identity must not start with '-': '--all' (after '--' "
                                   "every argument is an identity)");
}

TEST(CommandLine, JobsOutsideOneTo1024SayWhatJobsTakes) {
    for (std::string const jobs : {"0", "1025", "2000", "many", "-3", "1.5", "+4", ""}) {
        expectRefused({"-j", jobs, "A_1"},
                      "-j/--jobs takes a whole number from 1 to 1024, not '" + jobs + "'");
    }
}

TEST(CommandLine, TimeoutThatIsNoWholeNumberOfSecondsSaysWhatTimeoutTakes) {
    for (std::string const timeout : {"1.5", "-1", "soon", "31536001"}) {
        expectRefused({"-t", timeout, "A_1"}, "-t/--timeout takes a whole number of seconds "
                                              "from 0 to 31536000, not '" +
                                                  timeout + "'");
    }
}

TEST(CommandLine, NumbersAtTheirLimitsAreTaken) {
    ParseRun const run = parse({"-j", "1024", "-t", "31536000", "A_1"});
    EXPECT_FALSE(run.parsed.exitStatus.has_value()) << run.err;
    EXPECT_EQ(run.parsed.options.jobs, 1024U);
    EXPECT_EQ(run.parsed.options.timeoutSeconds, 31536000U);
}

TEST(CommandLine, OptionGivenTwiceTakesTheLastValue) {
    ParseRun const run =
        parse({"-j", "4", "--jobs", "6", "--summary", "a", "--summary", "b", "A_1"});
    EXPECT_FALSE(run.parsed.exitStatus.has_value()) << run.err;
    EXPECT_EQ(run.parsed.options.jobs, 6U);
    EXPECT_EQ(run.parsed.options.summaryFile, "b");
}

TEST(CommandLine, OptionWithoutItsValueSaysWhatValueItNeeds) {
    expectRefused({"A_1", "--summary"}, "--summary needs a value (a file name)");
    expectRefused({"A_1", "--summary="}, "--summary needs a value (a file name)");
    expectRefused({"A_1", "--report"}, "--report needs a value (a folder name)");
    expectRefused({"A_1", "--metrics"}, "--metrics needs a value (a file name)");
    expectRefused({"A_1", "--junit"}, "--junit needs a value (a file name)");
    expectRefused({"A_1", "-j"}, "-j/--jobs needs a value (a whole number from 1 to 1024)");
    expectRefused({"A_1", "-qj"}, "-j/--jobs needs a value (a whole number from 1 to 1024)");
    expectRefused({"A_1", "--timeout"},
                  "-t/--timeout needs a value (a whole number of seconds from 0 to 31536000)");
}

TEST(CommandLine, EmptyIdentitySaysSo) {
    expectRefused({""}, "an identity must not be empty");
}

TEST(CommandLine, ReportWithAMistypedOptionPointsToTheReportsHelp) {
    expectRefused({"report", "--form", "/tmp", "out"},
                  "report: unknown option --form: did you mean --from?", "quorvex-survey report");
    expectRefused({"report", "--bogus", "out"}, "report: unknown option --bogus",
                  "quorvex-survey report");
}

TEST(CommandLine, ReportWithoutItsFolderOrWithAWrongOneSaysWhy) {
    expectRefused({"report"}, "report: no DIR given (the folder to write the report into)",
                  "quorvex-survey report");
    expectRefused({"report", "--from"}, "report: --from needs a value (a folder name)",
                  "quorvex-survey report");
    expectRefused({"report", "a", "b"}, "report: unexpected argument 'b'", "quorvex-survey report");
}

TEST(CommandLine, ReportLeavesAMissingFromFolderToTheRunWhichSaysWhy) {
    ParseRun const run = parse({"report", "--from", "/nonexistent/folder", "out"});
    EXPECT_FALSE(run.parsed.exitStatus.has_value()) << run.err;
    ASSERT_TRUE(run.parsed.reportRequest.has_value());
    EXPECT_EQ(run.parsed.reportRequest->vpdFolder, "/nonexistent/folder");
}

TEST(CommandLine, ReportTakesItsFolder) {
    ParseRun const run = parse({"report", "--from", "/tmp", "out"});
    EXPECT_FALSE(run.parsed.exitStatus.has_value()) << run.err;
    ASSERT_TRUE(run.parsed.reportRequest.has_value());
    EXPECT_EQ(run.parsed.reportRequest->vpdFolder, "/tmp");
    EXPECT_EQ(run.parsed.reportRequest->folder, "out");
}

TEST(CommandLine, SurveyHasNoReportRequest) {
    EXPECT_FALSE(parse({"A_1"}).parsed.reportRequest.has_value());
}

TEST(CommandLine, HistoryIsRecordedInTheDefaultFileUnlessTold) {
    EXPECT_EQ(parse({"--all"}).parsed.options.historyFile,
              "/var/lib/quorvex-survey/history.sqlite");
    EXPECT_TRUE(parse({"--all"}).parsed.options.recordHistory);
    EXPECT_EQ(parse({"--all", "--history", "h.sqlite"}).parsed.options.historyFile, "h.sqlite");
    EXPECT_FALSE(parse({"--all", "--no-history"}).parsed.options.recordHistory);
}

TEST(CommandLine, HistoryAndNoHistoryExcludeEachOther) {
    ParseRun const run = parse({"--all", "--history", "h.sqlite", "--no-history"});
    ASSERT_TRUE(run.parsed.exitStatus.has_value());
    EXPECT_EQ(*run.parsed.exitStatus, 64);
    EXPECT_NE(run.err.find("--no-history"), std::string::npos) << run.err;
}

TEST(CommandLine, EmptyHistoryNameIsRefused) {
    expectRefused({"--history", "", "--all"}, "--history needs a file name, not an empty value");
    expectRefused({"--history=", "--all"}, "--history needs a file name, not an empty value");
}

TEST(CommandLine, WaitIsOffUnlessGiven) {
    EXPECT_FALSE(parse({"--all"}).parsed.options.waitForFolder);
    EXPECT_TRUE(parse({"--all", "--wait"}).parsed.options.waitForFolder);
}

TEST(CommandLine, StaleAfterIsTakenForTheRunsReport) {
    EXPECT_EQ(3, parse({"--all"}).parsed.options.staleAfterRuns);
    EXPECT_EQ(5, parse({"--all", "--stale-after", "5"}).parsed.options.staleAfterRuns);
}

TEST(CommandLine, HelpGoesToStandardOutputInPlainWordsAndEndsWithZero) {
    ParseRun const run = parse({"--help"});
    ASSERT_TRUE(run.parsed.exitStatus.has_value());
    EXPECT_EQ(*run.parsed.exitStatus, 0);
    EXPECT_EQ(run.out,
              "Usage: quorvex-survey [options] IDENTITY...\n"
              "       quorvex-survey [options] --all\n"
              "       quorvex-survey report [--from VPD_FOLDER] [--history FILE] [--stale-after "
              "N] DIR\n"
              "       quorvex-survey history runs|changes|partition|export|prune ...\n"
              "       quorvex-survey estate [--from COLLECT_DIR] [--report DIR] [--history FILE] "
              "[--no-history]\n"
              "\n"
              "Surveys the client partitions of the PYLON console's managed machines,\n"
              "several partitions at a time.\n"
              "\n"
              "Arguments:\n"
              "  IDENTITY                a managed machine (type-model_serial)\n"
              "\n"
              "Options:\n"
              "  -h, --help              print this help and exit\n"
              "  --version               print the version and exit\n"
              "  -j, --jobs N            partitions surveyed at the same time, all machines "
              "together (default 8)\n"
              "  -t, --timeout SECONDS   time limit of one remote action, 0 for none "
              "(default 1800)\n"
              "  --summary FILE          write a summary of the run (JSON) to FILE\n"
              "  -q, --quiet             no progress line, and no recap unless --recap\n"
              "  --recap                 end with a recap on standard error even when it is "
              "not a terminal\n"
              "  --no-recap              no recap, even on a terminal\n"
              "  --all                   every managed machine the console lists\n"
              "  --wait                  wait for another run using the result folder to end, "
              "rather than exit 75\n"
              "  --history FILE          record the run in the history database FILE "
              "(default /var/lib/quorvex-survey/history.sqlite)\n"
              "  --no-history            record nothing in the history database\n"
              "  --report DIR            after the run, write its report into DIR\n"
              "  --stale-after N         mark partitions not surveyed for N runs in a row "
              "stale (default 3)\n"
              "  --metrics FILE          write the run's figures for the node exporter's "
              "textfile collector to FILE (*.prom)\n"
              "  --junit FILE            write the run as JUnit XML to FILE\n"
              "\n"
              "Subcommands:\n"
              "  report                  write into DIR the report of the files earlier runs "
              "left\n"
              "  history                 what the history database holds: runs, changes, "
              "partition, export or prune\n"
              "  estate                  merge the consoles' bundles in COLLECT_DIR into one "
              "estate report in DIR\n"
              "\n"
              "Exit status:\n"
              "  0, 4, 8                 every listed partition surveyed, some, none\n"
              "  64                      bad command line (nothing run)\n"
              "  69                      the console's machine listing (--all) failed\n"
              "  73                      an output cannot be written\n"
              "  74                      the run's history could not be recorded\n"
              "  75                      another run uses the result folder\n"
              "  128+N                   ended by signal N: 129 SIGHUP, 130 SIGINT, 141 "
              "SIGPIPE,\n"
              "                          143 SIGTERM\n");
    EXPECT_EQ(run.err, "");
}

TEST(CommandLine, HistoryActionTakesItsOptionsAndSurveysNothing) {
    ParseRun const run =
        parse({"history", "changes", "--since", "2026-11-01T00:00Z", "--json", "--history", "h"});
    ASSERT_FALSE(run.parsed.exitStatus.has_value()) << run.err;
    ASSERT_TRUE(run.parsed.historyRequest.has_value());
    EXPECT_FALSE(run.parsed.reportRequest.has_value());
    history::HistoryRequest const& request = *run.parsed.historyRequest;
    EXPECT_EQ(request.action, history::HistoryAction::Changes);
    EXPECT_EQ(request.file, "h");
    EXPECT_TRUE(request.json);
    EXPECT_EQ(request.sinceUnix, 1793491200);
    EXPECT_FALSE(parse({"A_1"}).parsed.historyRequest.has_value());
}

TEST(CommandLine, HistoryHelpShowsAnActionsUsage) {
    ParseRun const run = parse({"history", "prune", "--help"});
    ASSERT_TRUE(run.parsed.exitStatus.has_value());
    EXPECT_EQ(*run.parsed.exitStatus, 0);
    EXPECT_EQ(run.out.substr(0, run.out.find('\n')),
              "Usage: quorvex-survey history prune [--history FILE] [--json] [--keep N] "
              "[--before DATE]");
}

TEST(CommandLine, ReportHelpShowsTheReportsUsageAndOptions) {
    ParseRun const run = parse({"report", "--help"});
    ASSERT_TRUE(run.parsed.exitStatus.has_value());
    EXPECT_EQ(*run.parsed.exitStatus, 0);
    EXPECT_EQ(run.out, "Usage: quorvex-survey report [--from VPD_FOLDER] [--history FILE] "
                       "[--stale-after N] DIR\n"
                       "\n"
                       "write into DIR the report of the files earlier runs left\n"
                       "\n"
                       "Arguments:\n"
                       "  DIR                     folder to write the report into\n"
                       "\n"
                       "Options:\n"
                       "  -h, --help              print this help and exit\n"
                       "  --from VPD_FOLDER       where the status files and VPD documents are "
                       "(default /var/adm/quorvex/VPD)\n"
                       "  --history FILE          show what changed in the newest run FILE "
                       "holds of this console\n"
                       "  --stale-after N         mark partitions not surveyed for N runs in a "
                       "row stale (default 3)\n");
    EXPECT_EQ(run.err, "");
}

TEST(CommandLine, VersionPrintsTheProgramAndItsVersion) {
    ParseRun const run = parse({"--version"});
    ASSERT_TRUE(run.parsed.exitStatus.has_value());
    EXPECT_EQ(*run.parsed.exitStatus, 0);
    EXPECT_EQ(run.out, std::string("quorvex-survey ") + QUORVEX_SURVEY_VERSION + "\n");
}

} // namespace
