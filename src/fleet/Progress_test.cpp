#include "fleet/Progress.h"

#include <gtest/gtest.h>

namespace {

using fleet::ProgressFigures;

ProgressFigures exampleFigures() {
    ProgressFigures figures;
    figures.machinesDone = 1;
    figures.machines = 3;
    figures.surveyed = 12;
    figures.failed = 2;
    figures.running = 4;
    figures.partitions = 40;
    figures.elapsedSeconds = 72;
    figures.leftSeconds = 190;
    figures.longestName = "9119-MHE_21ABCDE-7";
    figures.longestSeconds = 45.7;
    return figures;
}

ProgressFigures exampleFiguresWithHost() {
    ProgressFigures figures = exampleFigures();
    figures.longestName = "host7";
    return figures;
}

constexpr char gc_WholeLine[] = "14/40 partitions done, 2 failed, 4 running  1/3 machines done  "
                                "00:01:12 elapsed  ~00:03:10 left  longest host7 45 s";

TEST(Progress, LineShowsEveryFigureInItsPlace) {
    EXPECT_EQ(fleet::formatProgress(exampleFiguresWithHost()), gc_WholeLine);
}

TEST(Progress, WideTerminalShowsTheWholeLine) {
    EXPECT_EQ(fleet::formatProgress(exampleFiguresWithHost(), 200), gc_WholeLine);
}

TEST(Progress, LineOneColumnTooWideGivesUpTheElapsedTimeFirst) {
    std::size_t const width = std::string(gc_WholeLine).size();
    EXPECT_EQ(fleet::formatProgress(exampleFiguresWithHost(), width),
              "14/40 partitions done, 2 failed, 4 running  1/3 machines done  ~00:03:10 left  "
              "longest host7 45 s");
}

TEST(Progress, EightyColumnsKeepPartitionsTimeLeftAndLongest) {
    EXPECT_EQ(fleet::formatProgress(exampleFiguresWithHost(), 80),
              "14/40 partitions done, 2 failed, 4 running  ~00:03:10 left  longest host7 45 s");
}

TEST(Progress, OneColumnMoreKeepsTheTimeLeftBesideTheLongestPartition) {
    EXPECT_EQ(fleet::formatProgress(exampleFiguresWithHost(), 35),
              "~00:03:10 left  longest host7 45 s");
}

TEST(Progress, NarrowTerminalKeepsTheTimeLeftAndTheLongestPartition) {
    EXPECT_EQ(fleet::formatProgress(exampleFiguresWithHost(), 60),
              "~00:03:10 left  longest host7 45 s");
}

TEST(Progress, NarrowerTerminalKeepsTheLongestPartitionAlone) {
    EXPECT_EQ(fleet::formatProgress(exampleFiguresWithHost(), 34), "longest host7 45 s");
}

TEST(Progress, LongestPartitionAloneIsCutWhenItDoesNotFit) {
    EXPECT_EQ(fleet::formatProgress(exampleFiguresWithHost(), 12), "longest hos");
}

TEST(Progress, WithoutEstimateOrRunningPartitionTheirPlacesSaySo) {
    ProgressFigures figures;
    figures.machines = 2;
    figures.elapsedSeconds = 3.9;
    EXPECT_EQ(fleet::formatProgress(figures),
              "0/0 partitions done, 0 failed, 0 running  0/2 machines done  00:00:03 elapsed  "
              "time left unknown");
}

TEST(Progress, PartitionsStillToBeListedShowAsAPlus) {
    ProgressFigures figures = exampleFiguresWithHost();
    figures.listingsPending = 1;
    figures.leftSeconds.reset();
    EXPECT_EQ(fleet::formatProgress(figures),
              "14/40+ partitions done, 2 failed, 4 running  1/3 machines done  00:01:12 elapsed  "
              "time left unknown  longest host7 45 s");
}

TEST(Progress, LineIsCutToLeaveTheTerminalsLastColumnFree) {
    std::string const line = fleet::formatProgress(exampleFigures());
    EXPECT_EQ(fleet::fitToWidth(line, 80), line.substr(0, 79));
    EXPECT_EQ(fleet::fitToWidth("abc", 4), "abc");
    EXPECT_EQ(fleet::fitToWidth("abcd", 4), "abc");
    EXPECT_EQ(fleet::fitToWidth("abcd", 1), "");
}

TEST(Progress, LineIsKeptWholeWhenTheWidthIsUnknown) {
    EXPECT_EQ(fleet::formatProgress(exampleFiguresWithHost(), 0), gc_WholeLine);
}

TEST(Progress, ClockCountsHoursBeyondADay) {
    EXPECT_EQ(fleet::clockText(0), "00:00:00");
    EXPECT_EQ(fleet::clockText(3661.5), "01:01:01");
    EXPECT_EQ(fleet::clockText(90000), "25:00:00");
    EXPECT_EQ(fleet::clockText(-5), "00:00:00");
}

TEST(Progress, EstimateFollowsThePaceSoFar) {
    ProgressFigures figures;
    figures.surveyed = 3;
    figures.failed = 1;
    figures.partitions = 10;
    figures.elapsedSeconds = 20;
    ASSERT_TRUE(fleet::estimateLeft(figures, {}).has_value());
    EXPECT_DOUBLE_EQ(*fleet::estimateLeft(figures, {}), 30.0);
}

TEST(Progress, NoEstimateBeforeAnyPartitionFinished) {
    ProgressFigures figures;
    figures.partitions = 10;
    figures.elapsedSeconds = 20;
    EXPECT_FALSE(fleet::estimateLeft(figures, {}).has_value());
}

TEST(Progress, NoEstimateWhileAListingIsPending) {
    ProgressFigures figures;
    figures.surveyed = 3;
    figures.partitions = 10;
    figures.elapsedSeconds = 20;
    figures.listingsPending = 1;
    EXPECT_FALSE(fleet::estimateLeft(figures, {{5}, 300}).has_value());
}

// Nine quick partitions done in 4 s and one hanging for 40 s under a limit
// of 300 s: its client run may last until 300 s, then fetching its document
// as long again.
TEST(Progress, EstimateIsNeverBelowWhatARunningPartitionMayStillTake) {
    ProgressFigures figures;
    figures.surveyed = 9;
    figures.running = 1;
    figures.partitions = 10;
    figures.elapsedSeconds = 44;
    ASSERT_TRUE(fleet::estimateLeft(figures, {{40}, 300}).has_value());
    EXPECT_DOUBLE_EQ(*fleet::estimateLeft(figures, {{40}, 300}), 560.0);
}

TEST(Progress, EstimateTakesTheLongestOfTheRunningPartitions) {
    ProgressFigures figures;
    figures.surveyed = 2;
    figures.running = 3;
    figures.partitions = 5;
    figures.elapsedSeconds = 10;
    EXPECT_DOUBLE_EQ(*fleet::estimateLeft(figures, {{3, 1, 2}, 10}), 19.0);
}

TEST(Progress, EstimateKeepsThePaceWhenItIsLongerThanTheRunningPartitionsMayTake) {
    ProgressFigures figures;
    figures.surveyed = 1;
    figures.running = 1;
    figures.partitions = 100;
    figures.elapsedSeconds = 10;
    EXPECT_DOUBLE_EQ(*fleet::estimateLeft(figures, {{5}, 10}), 990.0);
}

TEST(Progress, RunningPartitionPastEveryLimitAddsNothing) {
    ProgressFigures figures;
    figures.surveyed = 1;
    figures.running = 1;
    figures.partitions = 2;
    figures.elapsedSeconds = 30;
    EXPECT_DOUBLE_EQ(*fleet::estimateLeft(figures, {{25}, 10}), 30.0);
}

TEST(Progress, WithoutATimeLimitTheEstimateIsThePaceAlone) {
    ProgressFigures figures;
    figures.surveyed = 9;
    figures.running = 1;
    figures.partitions = 10;
    figures.elapsedSeconds = 45;
    EXPECT_DOUBLE_EQ(*fleet::estimateLeft(figures, {{40}, 0}), 5.0);
}

} // namespace
