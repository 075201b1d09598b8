#include "fleet/Progress.h"

#include <gtest/gtest.h>

namespace {

using fleet::ProgressFigures;

ProgressFigures exampleFigures() {
    ProgressFigures figures;
    figures.machinesDone = 1;
    figures.machines = 3;
    figures.endedWithoutFailure = 12;
    figures.failed = 2;
    figures.running = 4;
    figures.partitions = 40;
    figures.elapsedSeconds = 72;
    figures.left = fleet::TimeLeft{190, false};
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
                                "00:01:12 elapsed  ~3 min left  longest host7 45 s";

TEST(Progress, LineShowsEveryFigureInItsPlace) {
    EXPECT_EQ(fleet::formatProgress(exampleFiguresWithHost()), gc_WholeLine);
}

TEST(Progress, WideTerminalShowsTheWholeLine) {
    EXPECT_EQ(fleet::formatProgress(exampleFiguresWithHost(), 200), gc_WholeLine);
}

TEST(Progress, LineOneColumnTooWideGivesUpTheElapsedTimeFirst) {
    std::size_t const width = std::string(gc_WholeLine).size();
    EXPECT_EQ(fleet::formatProgress(exampleFiguresWithHost(), width),
              "14/40 partitions done, 2 failed, 4 running  1/3 machines done  ~3 min left  "
              "longest host7 45 s");
}

TEST(Progress, EightyColumnsKeepPartitionsTimeLeftAndLongest) {
    EXPECT_EQ(fleet::formatProgress(exampleFiguresWithHost(), 80),
              "14/40 partitions done, 2 failed, 4 running  ~3 min left  longest host7 45 s");
}

TEST(Progress, OneColumnMoreKeepsTheTimeLeftBesideTheLongestPartition) {
    EXPECT_EQ(fleet::formatProgress(exampleFiguresWithHost(), 32),
              "~3 min left  longest host7 45 s");
}

TEST(Progress, NarrowTerminalKeepsTheTimeLeftAndTheLongestPartition) {
    EXPECT_EQ(fleet::formatProgress(exampleFiguresWithHost(), 60),
              "~3 min left  longest host7 45 s");
}

TEST(Progress, NarrowerTerminalKeepsTheLongestPartitionAlone) {
    EXPECT_EQ(fleet::formatProgress(exampleFiguresWithHost(), 31), "longest host7 45 s");
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

TEST(Progress, ListingsRunningAloneTakeThePlaceOfTheRunningPartitions) {
    ProgressFigures figures;
    figures.machines = 3;
    figures.listingsPending = 3;
    figures.listingsRunning = 2;
    EXPECT_EQ(fleet::formatProgress(figures),
              "0/0+ partitions done, 0 failed, listing 2 machines  0/3 machines done  "
              "00:00:00 elapsed  time left unknown");
    figures.listingsRunning = 1;
    EXPECT_EQ(fleet::formatProgress(figures),
              "0/0+ partitions done, 0 failed, listing 1 machine  0/3 machines done  "
              "00:00:00 elapsed  time left unknown");
}

TEST(Progress, ListingsRunningBesideSurveysFollowThem) {
    ProgressFigures figures = exampleFiguresWithHost();
    figures.listingsPending = 1;
    figures.listingsRunning = 1;
    figures.left.reset();
    EXPECT_EQ(fleet::formatProgress(figures),
              "14/40+ partitions done, 2 failed, 4 running, listing 1 machine  1/3 machines done  "
              "00:01:12 elapsed  time left unknown  longest host7 45 s");
}

TEST(Progress, TimeLimitEstimateSaysUpTo) {
    ProgressFigures figures = exampleFiguresWithHost();
    figures.left = fleet::TimeLeft{3580, true};
    EXPECT_EQ(fleet::formatProgress(figures, 100),
              "14/40 partitions done, 2 failed, 4 running  up to 60 min left  longest host7 45 s");
}

TEST(Progress, TimeLeftIsInSecondsMinutesOrHours) {
    ProgressFigures figures;
    std::vector<std::pair<fleet::TimeLeft, std::string>> const cases = {
        {{99.4, false}, "~99 s left"},      {{99.4, true}, "up to 100 s left"},
        {{100, false}, "~2 min left"},      {{3580, true}, "up to 60 min left"},
        {{5939, false}, "~99 min left"},    {{5999, false}, "~1 h 40 min left"},
        {{7500, false}, "~2 h 5 min left"}, {{0, true}, "up to 0 s left"}};
    for (auto const& [left, text] : cases) {
        figures.left = left;
        std::string const line = fleet::formatProgress(figures);
        EXPECT_NE(line.find("elapsed  " + text), std::string::npos) << line;
    }
}

TEST(Progress, PartitionsStillToBeListedShowAsAPlus) {
    ProgressFigures figures = exampleFiguresWithHost();
    figures.listingsPending = 1;
    figures.left.reset();
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

// A console's text in another language: characters count, not bytes, and
// no character is cut in half.
TEST(Progress, FitToWidthCountsCharactersAndNeverSplitsOne) {
    EXPECT_EQ(fleet::fitToWidth("caf\u00e9 cr\u00e8me", 80), "caf\u00e9 cr\u00e8me");
    EXPECT_EQ(fleet::fitToWidth("caf\u00e9 cr\u00e8me", 5), "caf\u00e9");
    EXPECT_EQ(fleet::fitToWidth("\u00e9\u00e9\u00e9", 3), "\u00e9\u00e9");
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
    figures.endedWithoutFailure = 3;
    figures.failed = 1;
    figures.partitions = 10;
    figures.elapsedSeconds = 20;
    std::optional<fleet::TimeLeft> const left = fleet::estimateLeft(figures, {});
    ASSERT_TRUE(left.has_value());
    EXPECT_DOUBLE_EQ(left->seconds, 30.0);
    EXPECT_FALSE(left->isTimeLimit);
}

TEST(Progress, NoEstimateBeforeAnyPartitionFinished) {
    ProgressFigures figures;
    figures.partitions = 10;
    figures.elapsedSeconds = 20;
    EXPECT_FALSE(fleet::estimateLeft(figures, {}).has_value());
}

TEST(Progress, NoEstimateWhileAListingIsPending) {
    ProgressFigures figures;
    figures.endedWithoutFailure = 3;
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
    figures.endedWithoutFailure = 9;
    figures.running = 1;
    figures.partitions = 10;
    figures.elapsedSeconds = 44;
    std::optional<fleet::TimeLeft> const left = fleet::estimateLeft(figures, {{40}, 300});
    ASSERT_TRUE(left.has_value());
    EXPECT_DOUBLE_EQ(left->seconds, 560.0);
    EXPECT_TRUE(left->isTimeLimit);
}

TEST(Progress, EstimateTakesTheLongestOfTheRunningPartitions) {
    ProgressFigures figures;
    figures.endedWithoutFailure = 2;
    figures.running = 3;
    figures.partitions = 5;
    figures.elapsedSeconds = 10;
    EXPECT_DOUBLE_EQ(fleet::estimateLeft(figures, {{3, 1, 2}, 10})->seconds, 19.0);
}

TEST(Progress, EstimateKeepsThePaceWhenItIsLongerThanTheRunningPartitionsMayTake) {
    ProgressFigures figures;
    figures.endedWithoutFailure = 1;
    figures.running = 1;
    figures.partitions = 100;
    figures.elapsedSeconds = 10;
    std::optional<fleet::TimeLeft> const left = fleet::estimateLeft(figures, {{5}, 10});
    EXPECT_DOUBLE_EQ(left->seconds, 990.0);
    EXPECT_FALSE(left->isTimeLimit);
}

TEST(Progress, RunningPartitionPastEveryLimitAddsNothing) {
    ProgressFigures figures;
    figures.endedWithoutFailure = 1;
    figures.running = 1;
    figures.partitions = 2;
    figures.elapsedSeconds = 30;
    EXPECT_DOUBLE_EQ(fleet::estimateLeft(figures, {{25}, 10})->seconds, 30.0);
}

TEST(Progress, WithoutATimeLimitTheEstimateIsThePaceAlone) {
    ProgressFigures figures;
    figures.endedWithoutFailure = 9;
    figures.running = 1;
    figures.partitions = 10;
    figures.elapsedSeconds = 45;
    EXPECT_DOUBLE_EQ(fleet::estimateLeft(figures, {{40}, 0})->seconds, 5.0);
}

} // namespace
