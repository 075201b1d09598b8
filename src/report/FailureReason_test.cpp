#include "report/FailureReason.h"

#include <gtest/gtest.h>

namespace {

constexpr char channelReason[] = "Partition not surveyed, reason: \nRELAY Failed.\n\n"
                                 "[     Rc] = 4\n[  RcCmd] = 0\n[RetStr1] = no route\n"
                                 "[RetStr2] = \n\n\n";
constexpr char fetchReason[] = "Unable to get File From Partition : \n\n[     Rc] = 2\n"
                               "[  RcCmd] = 0\n[RetStr1] = permission denied\n[RetStr2] = \n\n\n";

TEST(FailureReason, ClientRunReasonGivesActionAndCodes) {
    report::FailureReason const facts = report::parseFailureReason(channelReason);
    EXPECT_EQ("runCmdOnPartition", facts.action);
    EXPECT_EQ(4, facts.rc);
    EXPECT_EQ(0, facts.rcCmd);
    EXPECT_EQ(std::nullopt, facts.stoppedBy);
}

TEST(FailureReason, FetchReasonGivesItsAction) {
    report::FailureReason const facts = report::parseFailureReason(fetchReason);
    EXPECT_EQ("getFileFromPartition", facts.action);
    EXPECT_EQ(2, facts.rc);
}

TEST(FailureReason, ReasonWithoutCodesLeavesThemUnknown) {
    report::FailureReason const facts =
        report::parseFailureReason("Partition not surveyed, reason: \nRELAY Failed.\n\n\n\n");
    EXPECT_EQ(std::nullopt, facts.rc);
    EXPECT_EQ(std::nullopt, facts.rcCmd);
}

TEST(FailureReason, NonNumericOrHugeCodesAreUnknown) {
    report::FailureReason const facts = report::parseFailureReason(
        "Partition not surveyed, reason: \nRELAY Failed.\n\n[     Rc] = abc\n"
        "[  RcCmd] = 99999999999999999999999\n\n");
    EXPECT_EQ(std::nullopt, facts.rc);
    EXPECT_EQ(std::nullopt, facts.rcCmd);
}

TEST(FailureReason, ReturnStringLookingLikeACodeLineDoesNotCount) {
    report::FailureReason const facts = report::parseFailureReason(
        "Partition not surveyed, reason: \nRELAY Failed.\n\n[RetStr1] = [     Rc] = 7\n\n");
    EXPECT_EQ(std::nullopt, facts.rc);
}

TEST(FailureReason, TimeLimitLineGivesTheTimeItStopped) {
    report::FailureReason const facts = report::parseFailureReason(
        std::string(channelReason) + "Stopped by the time limit of 2 s after 2.0 s.\n");
    EXPECT_EQ("time limit", facts.stoppedBy);
    EXPECT_DOUBLE_EQ(2.0, facts.stoppedAfterSeconds.value());
}

TEST(FailureReason, SignalLineGivesTheSignalAndTheTime) {
    report::FailureReason const facts =
        report::parseFailureReason(std::string(fetchReason) + "Stopped by SIGTERM after 12.5 s.\n");
    EXPECT_EQ("SIGTERM", facts.stoppedBy);
    EXPECT_DOUBLE_EQ(12.5, facts.stoppedAfterSeconds.value());
}

TEST(FailureReason, OnlyTheSurveysFirstLinesMakeAReason) {
    EXPECT_TRUE(report::isFailureReason(channelReason));
    EXPECT_TRUE(report::isFailureReason(fetchReason));
    EXPECT_FALSE(report::isFailureReason("client note"));
    EXPECT_FALSE(report::isFailureReason(""));
    EXPECT_EQ("", report::parseFailureReason("client note").action);
}

} // namespace
