#include "fleet/TimeLimits.h"

#include <gtest/gtest.h>

#include <csignal>

namespace {

using fleet::ActionFacts;
using fleet::TimeLimits;
using fleet::UnitKind;

constexpr char gc_ClientRun[] = "/bin/sh -c /usr/bin/runact-api ZOR.ServiceEvent::::"
                                "runCmdOnPartition::PartitionId::2";
constexpr char gc_Fetch[] = "/bin/sh -c /usr/bin/runact-api ZOR.ServiceEvent::::"
                            "getFileFromPartition::PartitionId::2::LocalFN::x";

TEST(TimeLimits, UnitYoungerThanTheLimitNeedsNoLookAtItsActions) {
    TimeLimits const limits(2);
    EXPECT_FALSE(limits.mayHaveActionToStop(1.99));
    EXPECT_TRUE(limits.mayHaveActionToStop(2.0));
}

TEST(TimeLimits, WithoutLimitNoUnitIsLookedAtUntilAnInterruption) {
    TimeLimits limits(0);
    EXPECT_FALSE(limits.mayHaveActionToStop(1e6));
    EXPECT_TRUE(
        limits.actionsToStop(UnitKind::PartitionListing, {{7, "lspartition", 1e6}}).empty());
    limits.interrupt(SIGINT);
    EXPECT_TRUE(limits.mayHaveActionToStop(0));
}

TEST(TimeLimits, SurveyActionIsDueOnceItHasRunAsLongAsTheLimit) {
    TimeLimits const limits(2);
    std::vector<ActionFacts> const actions{{11, gc_ClientRun, 1.9}, {12, gc_Fetch, 2.0}};
    EXPECT_EQ(limits.actionsToStop(UnitKind::Survey, actions), std::vector<pid_t>{12});
}

TEST(TimeLimits, SurveyCommandsOtherThanRemoteActionsAreNeverStopped) {
    TimeLimits limits(2);
    std::vector<ActionFacts> const actions{{11, "/bin/hostname", 50.0}, {12, gc_ClientRun, 50.0}};
    EXPECT_EQ(limits.actionsToStop(UnitKind::Survey, actions), std::vector<pid_t>{12});
    limits.interrupt(SIGTERM);
    EXPECT_EQ(limits.actionsToStop(UnitKind::Survey, actions), std::vector<pid_t>{12});
}

TEST(TimeLimits, ListingStopsAnyCommandPastTheLimitInTheirOrder) {
    TimeLimits const limits(3);
    std::vector<ActionFacts> const actions{
        {21, "/opt/vtc/bin/lspartition -ix -c X", 4.0}, {22, "sleep 1", 0.5}, {23, "cat", 3.0}};
    EXPECT_EQ(limits.actionsToStop(UnitKind::PartitionListing, actions),
              (std::vector<pid_t>{21, 23}));
    EXPECT_EQ(limits.actionsToStop(UnitKind::MachineListing, actions),
              (std::vector<pid_t>{21, 23}));
}

TEST(TimeLimits, InterruptionStopsEveryActionWhateverItsAge) {
    TimeLimits limits(300);
    limits.interrupt(SIGINT);
    std::vector<ActionFacts> const actions{{31, "lsvtc -t0", 0.0}, {32, "lsvtc", std::nullopt}};
    EXPECT_EQ(limits.actionsToStop(UnitKind::MachineListing, actions),
              (std::vector<pid_t>{31, 32}));
}

TEST(TimeLimits, ActionWithoutAgeIsNotDueByTheLimit) {
    TimeLimits const limits(1);
    EXPECT_TRUE(limits.actionsToStop(UnitKind::Survey, {{41, gc_ClientRun, std::nullopt}}).empty());
}

TEST(TimeLimits, FirstSignalIsTheOneThatInterruptedTheRun) {
    TimeLimits limits(0);
    EXPECT_FALSE(limits.isInterrupted());
    EXPECT_EQ(limits.interruptingSignal(), 0);
    limits.interrupt(0);
    EXPECT_FALSE(limits.isInterrupted());
    limits.interrupt(SIGTERM);
    limits.interrupt(SIGINT);
    EXPECT_TRUE(limits.isInterrupted());
    EXPECT_EQ(limits.interruptingSignal(), SIGTERM);
}

TEST(TimeLimits, NoteOfTheTimeLimitGivesTheLimitAndTheActionsAgeToATenth) {
    TimeLimits const limits(2);
    EXPECT_EQ(limits.stopNote(UnitKind::Survey, 2.04),
              std::optional<std::string>("Stopped by the time limit of 2 s after 2.0 s."));
    EXPECT_EQ(limits.stopNote(UnitKind::Survey, 12.96),
              std::optional<std::string>("Stopped by the time limit of 2 s after 13.0 s."));
}

TEST(TimeLimits, NoteOfAnInterruptionNamesTheSignal) {
    TimeLimits sigint(2);
    sigint.interrupt(SIGINT);
    EXPECT_EQ(sigint.stopNote(UnitKind::Survey, 0.34),
              std::optional<std::string>("Stopped by SIGINT after 0.3 s."));
    TimeLimits sigterm(0);
    sigterm.interrupt(SIGTERM);
    EXPECT_EQ(sigterm.stopNote(UnitKind::Survey, 1.0),
              std::optional<std::string>("Stopped by SIGTERM after 1.0 s."));
}

TEST(TimeLimits, ListingsKeepNoNote) {
    TimeLimits const limits(2);
    EXPECT_EQ(limits.stopNote(UnitKind::PartitionListing, 2.5), std::nullopt);
    EXPECT_EQ(limits.stopNote(UnitKind::MachineListing, 2.5), std::nullopt);
}

TEST(TimeLimits, OnlyTheMachineListingStaysStoppedAfterItsActionIsKilled) {
    EXPECT_FALSE(fleet::resumesAfterStop(UnitKind::MachineListing));
    EXPECT_TRUE(fleet::resumesAfterStop(UnitKind::PartitionListing));
    EXPECT_TRUE(fleet::resumesAfterStop(UnitKind::Survey));
}

} // namespace
