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

TEST(Progress, LineShowsEveryFigureInItsPlace) {
    EXPECT_EQ(fleet::formatProgress(exampleFigures()),
              "machines 1/3  partitions 12 ok 2 failed 4 running /40  00:01:12 elapsed, "
              "~00:03:10 left  longest: 9119-MHE_21ABCDE-7 (45 s)");
}

TEST(Progress, WithoutEstimateOrRunningPartitionTheirPlacesSaySo) {
    ProgressFigures figures;
    figures.machines = 2;
    figures.elapsedSeconds = 3.9;
    EXPECT_EQ(fleet::formatProgress(figures),
              "machines 0/2  partitions 0 ok 0 failed 0 running /0  00:00:03 elapsed, ~--:--:-- "
              "left");
}

TEST(Progress, LineIsCutToLeaveTheTerminalsLastColumnFree) {
    std::string const line = fleet::formatProgress(exampleFigures());
    EXPECT_EQ(fleet::fitToWidth(line, 80), line.substr(0, 79));
    EXPECT_EQ(fleet::fitToWidth("abc", 4), "abc");
    EXPECT_EQ(fleet::fitToWidth("abcd", 4), "abc");
    EXPECT_EQ(fleet::fitToWidth("abcd", 1), "");
}

TEST(Progress, LineIsKeptWholeWhenTheWidthIsUnknown) {
    std::string const line = fleet::formatProgress(exampleFigures());
    EXPECT_EQ(fleet::fitToWidth(line, 0), line);
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
    ASSERT_TRUE(fleet::estimateLeft(figures).has_value());
    EXPECT_DOUBLE_EQ(*fleet::estimateLeft(figures), 30.0);
}

TEST(Progress, NoEstimateBeforeAnyPartitionFinished) {
    ProgressFigures figures;
    figures.partitions = 10;
    figures.elapsedSeconds = 20;
    EXPECT_FALSE(fleet::estimateLeft(figures).has_value());
}

} // namespace
