#include "report/ListingFailure.h"

#include <gtest/gtest.h>

namespace {

using report::ListingFailure;
using report::listingFailureInTrace;

// A listing piece of a machine's trace as the command runner writes it.
std::string listingTrace(std::string const& exitLine, std::string const& out,
                         std::string const& err) {
    return "PYLON_VPD_Survey_ClientPartition::main\n"
           "\n****** ShellCommand::execute ******\n"
           "/opt/vtc/bin/lspartition -ix -c 9119-MHE_21ABCDX > /tmp/ShellCommandA1 2> "
           "/tmp/ShellCommandB2\n" +
           exitLine + "STDOUT\n" + out + "STDERR\n" + err + "\n\n";
}

TEST(ListingFailure, AListingThatExitedZeroIsNoFailure) {
    EXPECT_FALSE(listingFailureInTrace(listingTrace("RC = 0\n", "1,a,3,h,Z,7\n\n", "\n")));
}

TEST(ListingFailure, ANonZeroExitGivesTheCommandItsStatusAndTheFirstErrorLine) {
    auto const failure = listingFailureInTrace(
        listingTrace("RC = 1\n", "\n", "\nlspartition: managed system not found\nsecond\n\n"));
    ASSERT_TRUE(failure);
    EXPECT_EQ(failure->command, "/opt/vtc/bin/lspartition -ix -c 9119-MHE_21ABCDX");
    EXPECT_EQ(failure->exitStatus, 1);
    EXPECT_EQ(failure->message, "lspartition: managed system not found");
    EXPECT_EQ(report::listingFailureText(*failure),
              "/opt/vtc/bin/lspartition -ix -c 9119-MHE_21ABCDX exited with status 1: "
              "lspartition: managed system not found");
}

TEST(ListingFailure, WithoutStandardErrorTheFirstOutputLineIsTheMessage) {
    auto const failure = listingFailureInTrace(listingTrace("RC = 3\n", "  \nno such\n\n", "\n"));
    ASSERT_TRUE(failure);
    EXPECT_EQ(failure->message, "no such");
}

TEST(ListingFailure, ASilentFailureSaysTheConsoleGaveNoMessage) {
    auto const failure = listingFailureInTrace(listingTrace("RC = 127\n", "\n", "\n"));
    ASSERT_TRUE(failure);
    EXPECT_EQ(failure->message, "the console gave no message");
}

TEST(ListingFailure, ATraceWithoutACommandBlockSaysTheCommandNeverRan) {
    auto const failure = listingFailureInTrace("PYLON_VPD_Survey_ClientPartition::main\n");
    ASSERT_TRUE(failure);
    EXPECT_EQ(failure->command, "");
    EXPECT_EQ(failure->exitStatus, std::nullopt);
    EXPECT_EQ(report::listingFailureText(*failure),
              "the listing command: the command did not run: its output files in /tmp could "
              "not be made");
}

TEST(ListingFailure, ACommandStoppedBeforeItsExitHasNoStatus) {
    std::string const trace = "\n****** ShellCommand::execute ******\n"
                              "/opt/lsvtc/bin/lsvtc -t0 > /tmp/o 2> /tmp/e\n";
    auto const failure = listingFailureInTrace(trace);
    ASSERT_TRUE(failure);
    EXPECT_EQ(failure->exitStatus, std::nullopt);
    EXPECT_EQ(report::listingCommandInTrace(trace), "/opt/lsvtc/bin/lsvtc -t0");
}

TEST(ListingFailure, AStoppedListingNamesItsCommandAndTheTimeLimit) {
    std::string const trace = "\n****** ShellCommand::execute ******\n"
                              "/opt/lsvtc/bin/lsvtc -t0 > /tmp/o 2> /tmp/e\n";
    EXPECT_EQ(report::listingFailureText(report::stoppedListing(trace, 2)),
              "/opt/lsvtc/bin/lsvtc -t0: stopped after the time limit of 2 s");
}

TEST(ListingFailure, AnIdentityWithBlanksStaysInTheCommand) {
    std::string const trace = "\n****** ShellCommand::execute ******\n"
                              "/opt/vtc/bin/lspartition -ix -c a > b > /tmp/o 2> /tmp/e\nRC = 2\n";
    EXPECT_EQ(report::listingCommandInTrace(trace), "/opt/vtc/bin/lspartition -ix -c a > b");
}

} // namespace
