#include "report/FailureReason.h"

#include <gtest/gtest.h>

namespace {

constexpr char gc_ChannelReason[] = "Partition not surveyed, reason: \nRELAY Failed.\n\n"
                                    "[     Rc] = 4\n[  RcCmd] = 0\n[RetStr1] = no route\n"
                                    "[RetStr2] = \n\n\n";
constexpr char gc_FetchReason[] =
    "Unable to get File From Partition : \n\n[     Rc] = 2\n"
    "[  RcCmd] = 0\n[RetStr1] = permission denied\n[RetStr2] = \n\n\n";

TEST(FailureReason, ClientRunReasonGivesActionAndCodes) {
    report::FailureReason const facts = report::parseFailureReason(gc_ChannelReason);
    EXPECT_EQ(report::RemoteAction::RunCommand, facts.action);
    EXPECT_EQ(4, facts.rc);
    EXPECT_EQ(0, facts.rcCmd);
    EXPECT_FALSE(facts.stop.has_value());
    EXPECT_FALSE(facts.isStoppedByTimeLimit());
    EXPECT_FALSE(facts.isStoppedBySignal());
}

TEST(FailureReason, FetchReasonGivesItsAction) {
    report::FailureReason const facts = report::parseFailureReason(gc_FetchReason);
    EXPECT_EQ(report::RemoteAction::GetFile, facts.action);
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
        std::string(gc_ChannelReason) + "Stopped by the time limit of 2 s after 2.0 s.\n");
    EXPECT_TRUE(facts.isStoppedByTimeLimit());
    EXPECT_FALSE(facts.isStoppedBySignal());
    EXPECT_EQ("", facts.stop.value().signalName);
    EXPECT_DOUBLE_EQ(2.0, facts.stop.value().afterSeconds);
}

TEST(FailureReason, SignalLineGivesTheSignalAndTheTime) {
    report::FailureReason const facts = report::parseFailureReason(
        std::string(gc_FetchReason) + "Stopped by SIGTERM after 12.5 s.\n");
    EXPECT_TRUE(facts.isStoppedBySignal());
    EXPECT_FALSE(facts.isStoppedByTimeLimit());
    EXPECT_EQ("SIGTERM", facts.stop.value().signalName);
    EXPECT_DOUBLE_EQ(12.5, facts.stop.value().afterSeconds);
}

TEST(FailureReason, OnlyTheSurveysFirstLinesMakeAReason) {
    EXPECT_TRUE(report::isFailureReason(gc_ChannelReason));
    EXPECT_TRUE(report::isFailureReason(gc_FetchReason));
    EXPECT_FALSE(report::isFailureReason("client note"));
    EXPECT_FALSE(report::isFailureReason(""));
    EXPECT_EQ(std::nullopt, report::parseFailureReason("client note").action);
}

} // namespace
