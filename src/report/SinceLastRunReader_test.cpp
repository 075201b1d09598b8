#include "report/SinceLastRunReader.h"

#include "HistorySeed.h"
#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <sys/stat.h>

namespace {

using QuorvexTest::HistorySeed;
using report::SinceLastRun;
using Row = HistorySeed::PartitionRow;

constexpr char gc_Machine[] = "9119-MHE_21ABCDE";
constexpr char gc_First[] = "2026-11-20T08:00:00+01:00";
constexpr char gc_Second[] = "2026-11-21T08:00:00+01:00";
constexpr char gc_Third[] = "2026-11-22T08:00:00+01:00";
constexpr char gc_Fourth[] = "2026-11-23T08:00:00+01:00";

class SinceLastRunReader : public ::testing::Test {
protected:
    QuorvexTest::TemporaryDirectory _folder;
    HistorySeed _seed{_folder.file("history.sqlite")};

    void event(long long run, std::string const& values) const {
        _seed.execute("INSERT INTO events (run_id, scope, kind, machine, partition, component,"
                      " component_name, property, old_value, new_value, outcome, reason,"
                      " failing_since_run, runs_failing) VALUES (" +
                      std::to_string(run) + ", " + values + ")");
    }

    SinceLastRun read(long long run, int staleAfter = 3) const {
        return report::readSinceLastRun(_seed.path(), run, staleAfter);
    }
};

TEST_F(SinceLastRunReader, FirstRecordedRunHasNothingToCompare) {
    long long const run = _seed.addRun("console", gc_First);
    _seed.addPartition(run, {gc_Machine, "aurora", "surveyed", {}, {}, run});
    SinceLastRun const since = read(run);
    EXPECT_FALSE(since.unavailable);
    EXPECT_FALSE(since.previousRunId);
    EXPECT_EQ(run, since.runId);
    ASSERT_EQ(1U, since.partitions.size());
    SinceLastRun::PartitionState const& state = since.partitions.at({gc_Machine, "aurora"});
    EXPECT_EQ(gc_First, state.lastSurveyed.value_or("none"));
    EXPECT_FALSE(state.failingSince);
    EXPECT_EQ(0, state.runsNotSurveyed);
    EXPECT_FALSE(state.isStale);
}

TEST_F(SinceLastRunReader, PreviousRunIsTheLatestEarlierRunOfTheSameConsole) {
    long long const first = _seed.addRun("console", gc_First);
    _seed.addRun("other console", gc_Second);
    long long const third = _seed.addRun("console", gc_Third);
    _seed.addRun("console", gc_Fourth);
    SinceLastRun const since = read(third);
    EXPECT_EQ(first, since.previousRunId.value_or(0));
    EXPECT_EQ(gc_First, since.previousStarted);
}

TEST_F(SinceLastRunReader, PartitionEventsGoToTheirListsInRecordingOrder) {
    _seed.addRun("console", gc_First);
    long long const run = _seed.addRun("console", gc_Second);
    event(run, "'partition', 'newly_failing', 'M', 'b', NULL, NULL, NULL, NULL, NULL, "
               "'channel_failure', 'RELAY Failed', 2, 1");
    event(run, "'partition', 'newly_failing', 'M', 'a', NULL, NULL, NULL, NULL, NULL, "
               "'timed_out', NULL, 2, 1");
    event(run, "'partition', 'recovered', 'M', 'c', NULL, NULL, NULL, NULL, NULL, 'surveyed', "
               "NULL, NULL, NULL");
    event(run, "'partition', 'still_failing', 'M', 'd', NULL, NULL, NULL, NULL, NULL, "
               "'fetch_failure', 'file not found', 1, 2");
    event(run, "'partition', 'newly_inactive', 'M', 'e', NULL, NULL, NULL, NULL, NULL, "
               "'inactive', NULL, NULL, NULL");
    event(run, "'partition', 'appeared', 'M', 'f', NULL, NULL, NULL, NULL, NULL, 'surveyed', "
               "NULL, NULL, NULL");
    event(run, "'partition', 'disappeared', 'M', 'g', NULL, NULL, NULL, NULL, NULL, NULL, NULL, "
               "NULL, NULL");
    SinceLastRun const since = read(run);
    ASSERT_EQ(2U, since.newFailures.size());
    EXPECT_EQ("b", since.newFailures[0].partition);
    EXPECT_EQ("channel_failure", since.newFailures[0].outcome);
    EXPECT_EQ("RELAY Failed", since.newFailures[0].reason);
    EXPECT_EQ("a", since.newFailures[1].partition);
    ASSERT_EQ(1U, since.recoveries.size());
    EXPECT_EQ("c", since.recoveries[0].partition);
    ASSERT_EQ(1U, since.stillFailing.size());
    EXPECT_EQ(gc_First, since.stillFailing[0].failingSince.value_or("none"));
    EXPECT_EQ(2, since.stillFailing[0].runsFailing);
    ASSERT_EQ(1U, since.newlyInactive.size());
    EXPECT_EQ("e", since.newlyInactive[0].partition);
    ASSERT_EQ(1U, since.partitionsAppeared.size());
    EXPECT_EQ("f", since.partitionsAppeared[0].partition);
    ASSERT_EQ(1U, since.partitionsDisappeared.size());
    EXPECT_EQ("g", since.partitionsDisappeared[0].partition);
    EXPECT_EQ("", since.partitionsDisappeared[0].outcome);
}

TEST_F(SinceLastRunReader, MachineAndComponentEventsAreRead) {
    _seed.addRun("console", gc_First);
    long long const run = _seed.addRun("console", gc_Second);
    event(run, "'machine', 'appeared', 'NEW', NULL, NULL, NULL, NULL, NULL, NULL, NULL, NULL, "
               "NULL, NULL");
    event(run, "'machine', 'disappeared', 'OLD', NULL, NULL, NULL, NULL, NULL, NULL, NULL, NULL, "
               "NULL, NULL");
    event(run, "'machine', 'listing_failed', 'M', NULL, NULL, NULL, NULL, NULL, NULL, NULL, NULL, "
               "NULL, NULL");
    event(run, "'component', 'replaced', 'M', 'a', 'U78C9.001-P1-C3', 'Ethernet adapter', "
               "'SN', 'Y1', 'Y2', NULL, NULL, NULL, NULL");
    event(run, "'component', 'property_changed', 'M', 'a', 'U78C9.001-P1-C3', "
               "'Ethernet adapter', 'FW', '1.0', '1.1', NULL, NULL, NULL, NULL");
    event(run, "'component', 'added', 'M', 'a', 'U78C9.001-P1-C4', NULL, NULL, NULL, NULL, "
               "NULL, NULL, NULL, NULL");
    SinceLastRun const since = read(run);
    EXPECT_EQ(std::vector<std::string>{"NEW"}, since.machinesAppeared);
    EXPECT_EQ(std::vector<std::string>{"OLD"}, since.machinesDisappeared);
    ASSERT_EQ(3U, since.inventoryChanges.size());
    SinceLastRun::ComponentChange const& replaced = since.inventoryChanges[0];
    EXPECT_EQ("replaced", replaced.kind);
    EXPECT_EQ("U78C9.001-P1-C3", replaced.component);
    EXPECT_EQ("Ethernet adapter", replaced.componentName);
    EXPECT_EQ("Y1", replaced.oldValue);
    EXPECT_EQ("Y2", replaced.newValue);
    EXPECT_EQ("FW", since.inventoryChanges[1].property);
    EXPECT_EQ("added", since.inventoryChanges[2].kind);
    EXPECT_EQ("", since.inventoryChanges[2].componentName);
}

TEST_F(SinceLastRunReader, EventsOfOtherRunsAndUnknownKindsAreLeftOut) {
    long long const first = _seed.addRun("console", gc_First);
    long long const run = _seed.addRun("console", gc_Second);
    event(first, "'partition', 'newly_failing', 'M', 'a', NULL, NULL, NULL, NULL, NULL, "
                 "'timed_out', NULL, 1, 1");
    event(run, "'partition', 'teleported', 'M', 'a', NULL, NULL, NULL, NULL, NULL, NULL, NULL, "
               "NULL, NULL");
    SinceLastRun const since = read(run);
    EXPECT_TRUE(since.newFailures.empty());
    EXPECT_TRUE(since.stillFailing.empty());
}

TEST_F(SinceLastRunReader, FailingSinceAndLastSurveyedAreTheStartsOfTheirRuns) {
    long long const first = _seed.addRun("console", gc_First);
    long long const second = _seed.addRun("console", gc_Second);
    long long const third = _seed.addRun("console", gc_Third);
    _seed.addMachine(second, gc_Machine);
    _seed.addPartition(third, {gc_Machine, "a", "channel_failure", second, 2, first});
    SinceLastRun::PartitionState const state = read(third).partitions.at({gc_Machine, "a"});
    EXPECT_EQ(gc_Second, state.failingSince.value_or("none"));
    EXPECT_EQ(gc_First, state.lastSurveyed.value_or("none"));
    EXPECT_EQ(2, state.runsNotSurveyed);
}

TEST_F(SinceLastRunReader, PartitionNotSurveyedForStaleAfterRunsInARowIsStale) {
    long long const first = _seed.addRun("console", gc_First);
    _seed.addMachine(_seed.addRun("other console", gc_First), gc_Machine);
    _seed.addMachine(_seed.addRun("console", gc_Second), gc_Machine);
    _seed.addMachine(_seed.addRun("console", gc_Third), gc_Machine);
    long long const fourth = _seed.addRun("console", gc_Fourth);
    _seed.addPartition(fourth, {gc_Machine, "a", "timed_out", first + 2, 3, first});
    _seed.addPartition(fourth, {gc_Machine, "b", "surveyed", {}, {}, fourth});
    SinceLastRun const atThree = read(fourth, 3);
    EXPECT_EQ(3, atThree.partitions.at({gc_Machine, "a"}).runsNotSurveyed);
    EXPECT_TRUE(atThree.partitions.at({gc_Machine, "a"}).isStale);
    EXPECT_FALSE(atThree.partitions.at({gc_Machine, "b"}).isStale);
    EXPECT_FALSE(read(fourth, 4).partitions.at({gc_Machine, "a"}).isStale);
}

// A run of other machines (named by hand) did not leave the partition
// unsurveyed: it says nothing of the partition's machine.
TEST_F(SinceLastRunReader, StaleCountLeavesOutRunsThatDidNotListTheMachine) {
    long long const first = _seed.addRun("console", gc_First);
    _seed.addPartition(first, {gc_Machine, "a", "surveyed", {}, {}, first});
    long long const second = _seed.addRun("console", gc_Second);
    _seed.addPartition(second, {gc_Machine, "a", "timed_out", second, 1, first});
    _seed.addMachine(_seed.addRun("console", gc_Third), "8286-42A_10XYZ99");
    long long const fourth = _seed.addRun("console", gc_Fourth);
    _seed.addPartition(fourth, {gc_Machine, "a", "timed_out", second, 2, first});
    SinceLastRun::PartitionState const state = read(fourth, 3).partitions.at({gc_Machine, "a"});
    EXPECT_EQ(2, state.runsNotSurveyed);
    EXPECT_FALSE(state.isStale);
    EXPECT_EQ(gc_First, state.lastSurveyed.value_or("none"));
    EXPECT_TRUE(read(fourth, 2).partitions.at({gc_Machine, "a"}).isStale);
}

// A partition no run has surveyed counts from the run that first listed it,
// not from the console's first run.
TEST_F(SinceLastRunReader, PartitionNeverSurveyedCountsFromItsFirstRecord) {
    _seed.addRun("console", gc_First);
    long long const second = _seed.addRun("console", gc_Second);
    long long const third = _seed.addRun("console", gc_Third);
    _seed.addPartition(second, {gc_Machine, "a", "inactive", {}, {}, {}});
    _seed.addPartition(third, {gc_Machine, "a", "inactive", {}, {}, {}});
    SinceLastRun::PartitionState const state = read(third).partitions.at({gc_Machine, "a"});
    EXPECT_FALSE(state.lastSurveyed);
    EXPECT_EQ(2, state.runsNotSurveyed);
    EXPECT_FALSE(state.isStale);
}

TEST_F(SinceLastRunReader, ReadingLeavesTheDatabaseAsItWas) {
    long long const run = _seed.addRun("console", gc_First);
    std::string const before = QuorvexTest::readFile(_seed.path());
    read(run);
    EXPECT_EQ(before, QuorvexTest::readFile(_seed.path()));
    EXPECT_FALSE(QuorvexTest::fileExists(_seed.path() + "-journal"));
}

TEST_F(SinceLastRunReader, RunTheHistoryDoesNotHoldIsRefusedWithItsNumber) {
    _seed.addRun("console", gc_First);
    SinceLastRun const since = report::sinceLastRunFor(_seed.path(), 9, 3);
    EXPECT_EQ("cannot read the history " + _seed.path() + ": the history holds no run 9",
              since.unavailable.value_or("read"));
}

TEST(SinceLastRunFor, MissingDatabaseSaysWhy) {
    QuorvexTest::TemporaryDirectory folder;
    std::string const missing = folder.file("missing.sqlite");
    EXPECT_EQ("cannot read " + missing + ": No such file or directory",
              report::sinceLastRunFor(missing, 1, 3).unavailable.value_or("read"));
    EXPECT_FALSE(QuorvexTest::fileExists(missing));
}

TEST(SinceLastRunFor, FileThatIsNoDatabaseSaysSo) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file("h.sqlite"), std::string(4096, '\x5a'));
    EXPECT_EQ("cannot read the history " + folder.file("h.sqlite") + ": file is not a database",
              report::sinceLastRunFor(folder.file("h.sqlite"), 1, 3).unavailable.value_or("read"));
}

TEST(SinceLastRunFor, HistoryNotRecordedCarriesTheReason) {
    SinceLastRun const since = report::historyNotRecorded("cannot write /x: Read-only file system");
    EXPECT_EQ("cannot write /x: Read-only file system", since.unavailable.value_or(""));
}

TEST_F(SinceLastRunReader, NewestRunIsTheLastRecordedOfTheConsole) {
    _seed.addRun("console", gc_Fourth);
    long long const second = _seed.addRun("console", gc_First);
    _seed.addRun("other console", gc_Second);
    EXPECT_EQ(second, report::newestRunOf(_seed.path(), "console").value_or(0));
    EXPECT_FALSE(report::newestRunOf(_seed.path(), "unknown console"));
}

} // namespace
