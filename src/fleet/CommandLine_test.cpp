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

void expectUsageError(std::vector<std::string> const& arguments) {
    ParseRun const run = parse(arguments);
    ASSERT_TRUE(run.parsed.exitStatus.has_value());
    EXPECT_EQ(*run.parsed.exitStatus, 64);
    EXPECT_EQ(run.out, "");
    EXPECT_EQ(run.err.rfind("quorvex-survey: ", 0), 0U) << run.err;
    EXPECT_NE(run.err.find("Usage: quorvex-survey"), std::string::npos) << run.err;
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

TEST(CommandLine, NoMachineIsAUsageError) {
    expectUsageError({});
    expectUsageError({"-j", "4"});
}

TEST(CommandLine, AllTogetherWithIdentitiesIsAUsageError) {
    expectUsageError({"--all", "A_1"});
}

TEST(CommandLine, UnknownOptionIsAUsageError) {
    expectUsageError({"--frobnicate", "A_1"});
}

TEST(CommandLine, JobsOutsideOneTo1024IsAUsageError) {
    expectUsageError({"-j", "0", "A_1"});
    expectUsageError({"-j", "1025", "A_1"});
    expectUsageError({"-j", "many", "A_1"});
    expectUsageError({"-j", "-3", "A_1"});
}

TEST(CommandLine, NegativeOrTextTimeoutIsAUsageError) {
    expectUsageError({"-t", "-1", "A_1"});
    expectUsageError({"-t", "1.5", "A_1"});
    expectUsageError({"-t", "soon", "A_1"});
}

TEST(CommandLine, OptionWithoutItsValueIsAUsageError) {
    expectUsageError({"A_1", "--summary"});
}

TEST(CommandLine, EmptyIdentityIsAUsageError) {
    expectUsageError({""});
}

TEST(CommandLine, HelpGoesToStandardOutputAndEndsWithZero) {
    ParseRun const run = parse({"--help"});
    ASSERT_TRUE(run.parsed.exitStatus.has_value());
    EXPECT_EQ(*run.parsed.exitStatus, 0);
    EXPECT_NE(run.out.find("--timeout"), std::string::npos);
    EXPECT_EQ(run.err, "");
}

TEST(CommandLine, VersionPrintsTheProgramAndItsVersion) {
    ParseRun const run = parse({"--version"});
    ASSERT_TRUE(run.parsed.exitStatus.has_value());
    EXPECT_EQ(*run.parsed.exitStatus, 0);
    EXPECT_EQ(run.out, std::string("quorvex-survey ") + QUORVEX_SURVEY_VERSION + "\n");
}

} // namespace
