// The command line of bench/whole-run: it is run by hand, so it explains
// itself and refuses what it does not know before building or measuring.

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

constexpr int gc_ExitUsage = 2;

QuorvexTest::CommandResult wholeRun(std::vector<std::string> const& arguments) {
    std::vector<std::string> argv{QuorvexTest::sourceRoot() + "/bench/whole-run"};
    argv.insert(argv.end(), arguments.begin(), arguments.end());
    return QuorvexTest::runCommand(argv);
}

TEST(WholeRunOptions, HelpPrintsUsageOfEveryOption) {
    for (char const* help : {"--help", "-h"}) {
        QuorvexTest::CommandResult const run = wholeRun({help});
        EXPECT_EQ(0, run.exitStatus) << help;
        EXPECT_EQ(0u, run.stdoutText.find("Usage: bench/whole-run [options]\n")) << help;
        for (char const* option : {"--tool PATH", "--ratio-size N", "--callgrind-size N",
                                   "--memory-sizes", "--mode ok|failing|both", "--min-pairs N",
                                   "--max-pairs N", "--cpu N", "--out DIR", "--parts"}) {
            EXPECT_NE(std::string::npos, run.stdoutText.find(option)) << help << " " << option;
        }
        EXPECT_EQ("", run.stderrText);
    }
}

TEST(WholeRunOptions, UnknownOptionIsRejectedWithAHint) {
    QuorvexTest::CommandResult const run = wholeRun({"--bogus"});
    EXPECT_EQ(gc_ExitUsage, run.exitStatus);
    EXPECT_EQ("whole-run: unknown option '--bogus'\nwhole-run: try 'bench/whole-run --help'\n",
              run.stderrText);
    EXPECT_EQ("", run.stdoutText);
}

TEST(WholeRunOptions, BadValuesAreRejectedBeforeAnythingRuns) {
    EXPECT_EQ("whole-run: --ratio-size needs a positive number, not '0'\n"
              "whole-run: try 'bench/whole-run --help'\n",
              wholeRun({"--ratio-size", "0"}).stderrText);
    EXPECT_EQ("whole-run: --mode is ok, failing or both, not 'all'\n"
              "whole-run: try 'bench/whole-run --help'\n",
              wholeRun({"--mode", "all"}).stderrText);
    EXPECT_EQ(gc_ExitUsage, wholeRun({"--memory-sizes", "100 x"}).exitStatus);
    EXPECT_EQ(gc_ExitUsage, wholeRun({"--min-pairs", "5"}).exitStatus);
    EXPECT_EQ(gc_ExitUsage, wholeRun({"--min-pairs", "20", "--max-pairs", "10"}).exitStatus);
    EXPECT_EQ(gc_ExitUsage, wholeRun({"--cpu"}).exitStatus);
    EXPECT_EQ(gc_ExitUsage, wholeRun({"--parts", "pairs speed"}).exitStatus);
}

} // namespace
