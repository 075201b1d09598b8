#include "history/ChangeRecorder.h"

#include "QuorvexTest.h"

#include <SQLiteCpp/SQLiteCpp.h>
#include <gtest/gtest.h>

#include <sys/stat.h>

#include <cstdint>
#include <string>
#include <vector>

namespace {

// An adapter of a partition's document.
struct Card {
    std::string name;
    std::string serial;
    std::string location;
};

std::string property(std::string const& keyword, std::string const& value) {
    return "               <Property displayName=\"" + keyword + "\" name=\"" + keyword + "\">\n" +
           "                  " + keyword + "\n                  <Value type=\"string\">" + value +
           "</Value>\n               </Property>\n";
}

std::string cardResource(Card const& card) {
    return "<Resource displayName=\"" + card.name + "\" uniqueId=\"M-1-" + card.name + "\">\n" +
           card.name + "\n" + property("SN", card.serial) + property("YL", card.location) +
           "</Resource>\n";
}

std::string documentHead(std::string const& host) {
    return "<?xml version=\"1.0\" encoding=\"UTF-8\"?><com.zor.inventory version=\"1.0\">\n"
           "<ResourceSet class=\"com.zor.inventory.Hardware\" timestamp=\"1\" type=\"Hardware\""
           " version=\"1.0\">\n"
           "<Resource displayName=\"M\" uniqueId=\"M\">\nM\n"
           "<ResourceList displayName=\"Partitions\">\n"
           "<Resource displayName=\"" +
           host + "\" uniqueId=\"M-" + host + "\">\n" + host + "\n";
}

std::string documentTail() {
    return "</Resource>\n</ResourceList>\n</Resource>\n</ResourceSet>\n</com.zor.inventory>\n";
}

// A client document as the survey fetches it: the partition with its code
// level and its adapters.
std::string clientDocument(std::string const& host, std::string const& firmware,
                           std::vector<Card> const& cards) {
    std::string text = documentHead(host) + property("CL", firmware) + property("HN", host) +
                       "<ResourceList displayName=\"Adapters\">\n";
    for (Card const& card : cards) {
        text += cardResource(card);
    }
    return text + "</ResourceList>\n" + documentTail();
}

std::string defaultDocument(std::string const& host) {
    return documentHead(host) + property("HN", host) +
           property("VD", "Partition not surveyed, reason: \nRELAY Failed.\n") + documentTail();
}

std::vector<Card> const gc_Cards{{"ent0", "Y050", "U1-P1-C6"}, {"fcs0", "YA50", "U1-P1-C3"}};

// One partition result of a run to record.
struct Partition {
    std::string machine;
    std::string name;
    std::string outcome;
    // The document's text; none when the run wrote no document.
    std::optional<std::string> document;
};

class HistoryChangeRecorder : public ::testing::Test {
protected:
    QuorvexTest::TemporaryDirectory _folder;
    SQLite::Database _db{_folder.file("history.sqlite"),
                         SQLite::OPEN_READWRITE | SQLite::OPEN_CREATE};

    HistoryChangeRecorder() {
        // Tests need no durability: a run's commit waits for no disk.
        _db.exec("PRAGMA foreign_keys = ON; PRAGMA synchronous = OFF");
        _db.exec(QuorvexTest::readFile(QuorvexTest::sourceRoot() +
                                       "/src/history/migrations/0001-history.sql"));
        EXPECT_EQ(0, mkdir(_folder.file("VPD").c_str(), 0700));
    }

    long long record(std::vector<Partition> const& partitions,
                     std::vector<std::string> const& failedListings = {},
                     std::string const& console = "console-a", long long startedUnix = 1000) {
        return _record(partitions, failedListings, console, startedUnix, true);
    }

    // A run of the machines named by hand, not of every machine (--all).
    long long recordNamed(std::vector<Partition> const& partitions) {
        return _record(partitions, {}, "console-a", 1000, false);
    }

    // The run's events, one line each: scope, kind, machine, partition and
    // every other column that has a value.
    std::vector<std::string> events(long long run) {
        SQLite::Statement select(
            _db, "SELECT scope, kind, machine, partition, component, property, old_value,"
                 " new_value, failing_since_run, runs_failing FROM events"
                 " WHERE run_id = ? ORDER BY id");
        select.bind(1, static_cast<std::int64_t>(run));
        std::vector<std::string> lines;
        while (select.executeStep()) {
            std::string line;
            for (int index = 0; index < select.getColumnCount(); ++index) {
                if (!select.getColumn(index).isNull()) {
                    line += (line.empty() ? "" : " ") + select.getColumn(index).getString();
                }
            }
            lines.push_back(line);
        }
        return lines;
    }

    // A column of one partition result, "null" for none.
    std::string column(long long run, std::string const& partition, std::string const& name) {
        SQLite::Statement select(_db, "SELECT " + name +
                                          " FROM partition_results"
                                          " WHERE run_id = ? AND partition = ?");
        select.bind(1, static_cast<std::int64_t>(run));
        select.bind(2, partition);
        EXPECT_TRUE(select.executeStep());
        return select.getColumn(0).isNull() ? "null" : select.getColumn(0).getString();
    }

    long long count(std::string const& table) {
        return _db.execAndGet("SELECT count(*) FROM " + table).getInt64();
    }

private:
    long long _record(std::vector<Partition> const& partitions,
                      std::vector<std::string> const& failedListings, std::string const& console,
                      long long startedUnix, bool allMachines) {
        SQLite::Transaction transaction(_db);
        long long const run = _insertRun(console, startedUnix, allMachines);
        _insertMachines(run, partitions, failedListings);
        for (Partition const& partition : partitions) {
            _insertPartition(run, partition);
        }
        history::ChangeRecorder(_folder.file("VPD")).record(_db, run);
        transaction.commit();
        return run;
    }

    long long _insertRun(std::string const& console, long long startedUnix, bool allMachines) {
        SQLite::Statement insert(
            _db, "INSERT INTO runs (console, tool, started, ended, started_unix, recorded_unix,"
                 " exit_status, return_code, partitions, surveyed, failed, summary, all_machines)"
                 " VALUES (?, 'quorvex-survey', 's', 'e', ?, ?, 0, '0', 0, 0, 0, '{}', ?)");
        insert.bind(1, console);
        insert.bind(2, static_cast<std::int64_t>(startedUnix));
        insert.bind(3, static_cast<std::int64_t>(startedUnix));
        insert.bind(4, allMachines ? 1 : 0);
        insert.exec();
        return _db.getLastInsertRowid();
    }

    void _insertMachines(long long run, std::vector<Partition> const& partitions,
                         std::vector<std::string> const& failedListings) {
        SQLite::Statement insert(_db, "INSERT OR IGNORE INTO machine_results (run_id, machine,"
                                      " return_code, listing_failure) VALUES (?, ?, ?, ?)");
        for (std::string const& machine : failedListings) {
            insert.bind(1, static_cast<std::int64_t>(run));
            insert.bind(2, machine);
            insert.bind(3, "8");
            insert.bind(4, R"({"command":"lspartition","exit_status":1,"message":"system busy"})");
            insert.exec();
            insert.reset();
        }
        for (Partition const& partition : partitions) {
            insert.bind(1, static_cast<std::int64_t>(run));
            insert.bind(2, partition.machine);
            insert.bind(3, "0");
            insert.bind(4);
            insert.exec();
            insert.reset();
        }
    }

    void _insertPartition(long long run, Partition const& partition) {
        SQLite::Statement insert(
            _db, "INSERT INTO partition_results (run_id, machine, partition, ip, outcome,"
                 " status_text, reason, document, inventory) VALUES (?, ?, ?, '10.0.0.1', ?,"
                 " 'text', ?, ?, 'none')");
        insert.bind(1, static_cast<std::int64_t>(run));
        insert.bind(2, partition.machine);
        insert.bind(3, partition.name);
        insert.bind(4, partition.outcome);
        if (partition.outcome != "surveyed" && partition.outcome != "inactive") {
            insert.bind(5, "why " + partition.name);
        }
        if (partition.document) {
            std::string const name = partition.machine + "-" + partition.name + ".VPD.xml";
            QuorvexTest::writeFile(_folder.file("VPD/" + name), *partition.document);
            insert.bind(6, "/var/adm/quorvex/VPD/" + name);
        }
        insert.exec();
    }
};

Partition surveyed(std::string const& name, std::string const& firmware = "FW1",
                   std::vector<Card> const& cards = gc_Cards) {
    return {"M", name, "surveyed", clientDocument(name, firmware, cards)};
}

Partition failing(std::string const& name, std::string const& outcome = "channel_failure") {
    return {"M", name, outcome, defaultDocument(name)};
}

Partition interrupted(std::string const& name) {
    return {"M", name, "interrupted", std::nullopt};
}

Partition inactive(std::string const& name) {
    return {"M", name, "inactive", std::nullopt};
}

// A partition of the second machine, N.
Partition onOtherMachine(Partition partition) {
    partition.machine = "N";
    return partition;
}

using Lines = std::vector<std::string>;

TEST_F(HistoryChangeRecorder, FirstRunOfAConsoleHasNoEventsAndStartsStreaks) {
    long long const run = record({surveyed("a"), failing("b")});
    EXPECT_EQ(Lines{}, events(run));
    EXPECT_EQ("1", column(run, "b", "failing_since_run"));
    EXPECT_EQ("1", column(run, "b", "runs_failing"));
    EXPECT_EQ("null", column(run, "b", "last_surveyed_run"));
    EXPECT_EQ("1", column(run, "a", "last_surveyed_run"));
    EXPECT_EQ("null", column(run, "a", "failing_since_run"));
    EXPECT_EQ("null", column(run, "a", "runs_failing"));
}

TEST_F(HistoryChangeRecorder, FailingStreakCountsItsRunsAndEndsWithRecovery) {
    record({surveyed("a")});
    long long const first = record({failing("a")});
    EXPECT_EQ((Lines{"partition newly_failing M a 2 1"}), events(first));
    EXPECT_EQ((Lines{"partition still_failing M a 2 2"}), events(record({failing("a")})));
    long long const third = record({failing("a", "timed_out")});
    EXPECT_EQ((Lines{"partition still_failing M a 2 3"}), events(third));
    EXPECT_EQ("1", column(third, "a", "last_surveyed_run"));
    long long const recovery = record({surveyed("a")});
    EXPECT_EQ((Lines{"partition recovered M a"}), events(recovery));
    EXPECT_EQ("null", column(recovery, "a", "failing_since_run"));
    EXPECT_EQ("null", column(recovery, "a", "runs_failing"));
    EXPECT_EQ(std::to_string(recovery), column(recovery, "a", "last_surveyed_run"));
}

TEST_F(HistoryChangeRecorder, InterruptedRunCarriesTheFailingStreakOn) {
    record({surveyed("a"), surveyed("b")});
    record({failing("a"), surveyed("b")});
    long long const cut = record({interrupted("a"), interrupted("b")});
    EXPECT_EQ(Lines{}, events(cut));
    EXPECT_EQ("2", column(cut, "a", "failing_since_run"));
    EXPECT_EQ("1", column(cut, "a", "runs_failing"));
    EXPECT_EQ("1", column(cut, "a", "last_surveyed_run"));
    EXPECT_EQ("2", column(cut, "b", "last_surveyed_run"));
    EXPECT_EQ("null", column(cut, "b", "failing_since_run"));
    EXPECT_EQ((Lines{"partition still_failing M a 2 2"}),
              events(record({failing("a"), surveyed("b")})));
}

TEST_F(HistoryChangeRecorder, InterruptedRunNeitherRecoversNorBreaksAStreak) {
    record({surveyed("a")});
    record({failing("a")});
    record({interrupted("a")});
    EXPECT_EQ((Lines{"partition recovered M a"}), events(record({surveyed("a")})));
}

TEST_F(HistoryChangeRecorder, InactiveIsNoFailureAndIsNewOnlyOnce) {
    record({surveyed("a"), failing("b")});
    long long const run = record({inactive("a"), inactive("b")});
    EXPECT_EQ((Lines{"partition newly_inactive M a", "partition newly_inactive M b"}), events(run));
    EXPECT_EQ("null", column(run, "b", "failing_since_run"));
    EXPECT_EQ(Lines{}, events(record({inactive("a"), interrupted("b")})));
    EXPECT_EQ(Lines{}, events(record({inactive("a"), inactive("b")})));
}

TEST_F(HistoryChangeRecorder, PartitionsAndMachinesAppearAndDisappear) {
    record({surveyed("a"), surveyed("b")});
    Partition other = surveyed("c");
    other.machine = "N";
    EXPECT_EQ((Lines{"machine appeared N", "partition disappeared M b", "partition appeared N c"}),
              events(record({surveyed("a"), other})));
    EXPECT_EQ((Lines{"machine disappeared N", "partition disappeared N c"}),
              events(record({surveyed("a")})));
}

TEST_F(HistoryChangeRecorder, RunOfOneMachineLeavesTheOthersAlone) {
    Partition const other = onOtherMachine(surveyed("c"));
    record({surveyed("a"), failing("b"), other});
    long long const named = recordNamed({other});
    EXPECT_EQ(Lines{}, events(named));
    long long const all = record({surveyed("a"), failing("b"), other});
    EXPECT_EQ((Lines{"partition still_failing M b 1 2"}), events(all));
    EXPECT_EQ("3", column(all, "a", "last_surveyed_run"));
}

TEST_F(HistoryChangeRecorder, StreakGoesOnAcrossARunOfAnotherMachine) {
    Partition const other = onOtherMachine(surveyed("c"));
    record({surveyed("a"), other});
    EXPECT_EQ((Lines{"partition newly_failing M a 2 1"}), events(record({failing("a"), other})));
    long long const named = recordNamed({other});
    EXPECT_EQ("3", column(named, "c", "last_surveyed_run"));
    long long const all = record({failing("a"), other});
    EXPECT_EQ((Lines{"partition still_failing M a 2 2"}), events(all));
    EXPECT_EQ("1", column(all, "a", "last_surveyed_run"));
    EXPECT_EQ((Lines{"partition recovered M a"}), events(recordNamed({surveyed("a")})));
}

TEST_F(HistoryChangeRecorder, MachineDisappearsOnlyFromARunOfAllMachines) {
    record({surveyed("a"), onOtherMachine(surveyed("c"))});
    EXPECT_EQ(Lines{}, events(recordNamed({surveyed("a")})));
    EXPECT_EQ((Lines{"machine disappeared N", "partition disappeared N c"}),
              events(record({surveyed("a")})));
    EXPECT_EQ(Lines{}, events(record({surveyed("a")})));
}

TEST_F(HistoryChangeRecorder, MachineAppearsOnlyWhenNoEarlierRunListedIt) {
    Partition const other = onOtherMachine(surveyed("c"));
    record({surveyed("a")});
    EXPECT_EQ((Lines{"machine appeared N", "partition appeared N c"}),
              events(recordNamed({other})));
    EXPECT_EQ(Lines{}, events(record({surveyed("a"), other})));
}

TEST_F(HistoryChangeRecorder, MachineNamedByHandAndNotListedByTheNextRunOfAllDisappears) {
    record({surveyed("a")});
    recordNamed({onOtherMachine(surveyed("c"))});
    EXPECT_EQ((Lines{"machine disappeared N", "partition disappeared N c"}),
              events(record({surveyed("a")})));
}

TEST_F(HistoryChangeRecorder, ListingOfAMachineRecoversAcrossARunOfAnother) {
    Partition const other = onOtherMachine(surveyed("c"));
    record({surveyed("a"), other});
    EXPECT_EQ((Lines{"machine listing_failed N"}), events(record({surveyed("a")}, {"N"})));
    EXPECT_EQ(Lines{}, events(recordNamed({surveyed("a")})));
    EXPECT_EQ((Lines{"machine listing_recovered N"}), events(record({surveyed("a"), other})));
}

TEST_F(HistoryChangeRecorder, ComponentsCompareWithTheMachinesPreviousRecord) {
    Partition const other = onOtherMachine(surveyed("c"));
    record({surveyed("a"), other});
    recordNamed({other});
    EXPECT_EQ((Lines{"component property_changed M a M-a CL FW1 FW2"}),
              events(record({surveyed("a", "FW2"), other})));
}

// A document the machine's previous record holds takes what reading it gave
// there, though the console's latest run did not list the machine.
TEST_F(HistoryChangeRecorder, DocumentOfTheMachinesPreviousRecordIsNotReadAgain) {
    Partition const other = onOtherMachine(surveyed("c"));
    record({surveyed("a"), other});
    recordNamed({other});
    _db.exec("UPDATE partition_results SET inventory_problem = 'kept'");
    long long const run = record({surveyed("a"), other});
    EXPECT_EQ("kept", column(run, "a", "inventory_problem"));
}

TEST_F(HistoryChangeRecorder, FailingPartitionThatAppearsIsNewlyFailing) {
    record({surveyed("a")});
    EXPECT_EQ((Lines{"partition appeared M b", "partition newly_failing M b 2 1"}),
              events(record({surveyed("a"), failing("b")})));
}

TEST_F(HistoryChangeRecorder, PartitionBackAfterAGapKnowsWhenItWasLastSurveyed) {
    record({surveyed("a"), surveyed("b")});
    record({surveyed("a")});
    long long const back = record({surveyed("a"), failing("b")});
    EXPECT_EQ("1", column(back, "b", "last_surveyed_run"));
}

TEST_F(HistoryChangeRecorder, ListingThatFailsAndRecoversHidesNoPartitionChange) {
    Partition other = surveyed("c");
    other.machine = "N";
    record({surveyed("a"), other});
    EXPECT_EQ((Lines{"machine listing_failed N"}), events(record({surveyed("a")}, {"N"})));
    EXPECT_EQ((Lines{"machine listing_recovered N"}), events(record({surveyed("a"), other})));
}

// The history command's table of machine listings shows it, as the JUnit
// file and the report word the failure.
TEST_F(HistoryChangeRecorder, FailedListingsEventCarriesTheCommandItsStatusAndTheMessage) {
    record({surveyed("a")});
    long long const run = record({}, {"M"});
    EXPECT_EQ(_db.execAndGet("SELECT group_concat(kind || ': ' || coalesce(reason, 'null'), '; ')"
                             " FROM events WHERE run_id = " +
                             std::to_string(run))
                  .getString(),
              "listing_failed: lspartition exited with status 1: system busy");
}

// The listing failure hides whether the partition came back in that run or
// in this one, not that it came back: the run before the failure did not
// list it.
TEST_F(HistoryChangeRecorder, PartitionGoneBeforeAListingFailureAppearsWhenListedAgain) {
    Partition gone = surveyed("c");
    gone.machine = "N";
    Partition staying = surveyed("d");
    staying.machine = "N";
    record({gone, staying});
    EXPECT_EQ((Lines{"partition disappeared N c"}), events(record({staying})));
    EXPECT_EQ((Lines{"machine listing_failed N"}), events(record({}, {"N"})));
    EXPECT_EQ((Lines{"machine listing_recovered N", "partition appeared N c"}),
              events(record({gone, staying})));
}

// Its partitions were never listed before: they are new.
TEST_F(HistoryChangeRecorder, PartitionsOfANewMachineWhoseFirstListingFailedAppearOnceListed) {
    Partition other = surveyed("c");
    other.machine = "N";
    record({surveyed("a")});
    EXPECT_EQ((Lines{"machine appeared N", "machine listing_failed N"}),
              events(record({surveyed("a")}, {"N"})));
    EXPECT_EQ((Lines{"machine listing_recovered N", "partition appeared N c"}),
              events(record({surveyed("a"), other})));
}

// The console's first run listed nothing of the machine: there is nothing
// to compare its partitions with, as in a console's first run.
TEST_F(HistoryChangeRecorder, PartitionsListedAfterAListingFailedInTheConsolesFirstRunDoNotAppear) {
    Partition other = surveyed("c");
    other.machine = "N";
    record({surveyed("a")}, {"N"});
    EXPECT_EQ((Lines{"machine listing_recovered N"}), events(record({surveyed("a"), other})));
}

TEST_F(HistoryChangeRecorder, RunsOfAnotherConsoleAreNoPreviousRun) {
    record({surveyed("a")});
    record({failing("z")}, {}, "console-b");
    EXPECT_EQ((Lines{"partition newly_failing M a 3 1"}), events(record({failing("a")})));
}

TEST_F(HistoryChangeRecorder, ClockThatWentBackwardsStillComparesWithThePreviousRecordedRun) {
    record({surveyed("a")}, {}, "console-a", 5000);
    record({failing("a")}, {}, "console-a", 9000);
    long long const run = record({failing("a")}, {}, "console-a", 100);
    EXPECT_EQ((Lines{"partition still_failing M a 2 2"}), events(run));
}

TEST_F(HistoryChangeRecorder, NewSerialAtTheSameLocationIsOneReplacedEvent) {
    record({surveyed("a")});
    long long const run =
        record({surveyed("a", "FW1", {{"ent0", "Y999", "U1-P1-C6"}, gc_Cards[1]})});
    EXPECT_EQ((Lines{"component replaced M a U1-P1-C6 Y050 Y999"}), events(run));
}

TEST_F(HistoryChangeRecorder, NewFirmwareLevelIsAPropertyChange) {
    record({surveyed("a")});
    EXPECT_EQ((Lines{"component property_changed M a M-a CL FW1 FW2"}),
              events(record({surveyed("a", "FW2")})));
}

TEST_F(HistoryChangeRecorder, ComponentsAddedAndRemoved) {
    record({surveyed("a")});
    EXPECT_EQ((Lines{"component added M a U1-P1-C9", "component removed M a U1-P1-C3"}),
              events(record({surveyed("a", "FW1", {gc_Cards[0], {"sas0", "YL30", "U1-P1-C9"}})})));
}

TEST_F(HistoryChangeRecorder, ComponentsCompareWithTheLastReadableInventoryAcrossFailures) {
    record({surveyed("a")});
    record({failing("a")});
    Partition broken = surveyed("a", "FW3");
    broken.document = broken.document->substr(0, 300);
    record({broken});
    EXPECT_EQ((Lines{"component property_changed M a M-a CL FW1 FW2"}),
              events(record({surveyed("a", "FW2")})));
}

TEST_F(HistoryChangeRecorder, DocumentsAreRecordedWithTheirInventoryState) {
    long long const run = record({surveyed("a"), failing("b"), inactive("c")});
    EXPECT_EQ("read", column(run, "a", "inventory"));
    EXPECT_EQ("null", column(run, "a", "inventory_problem"));
    EXPECT_EQ(32u, column(run, "a", "document_hash").size());
    EXPECT_EQ("default", column(run, "b", "inventory"));
    EXPECT_EQ("none", column(run, "c", "inventory"));
    EXPECT_EQ("null", column(run, "c", "document_hash"));
}

TEST_F(HistoryChangeRecorder, DocumentGoneFromTheFolderIsMissingWithItsCause) {
    SQLite::Transaction transaction(_db);
    _db.exec("INSERT INTO runs (console, tool, started, ended, started_unix, recorded_unix,"
             " return_code, partitions, surveyed, failed, summary)"
             " VALUES ('c', 't', 's', 'e', 1, 1, '0', 1, 1, 0, '{}')");
    _db.exec("INSERT INTO partition_results (run_id, machine, partition, ip, outcome,"
             " status_text, document, inventory) VALUES (1, 'M', 'a', '', 'surveyed', 'Ok',"
             " '/var/adm/quorvex/VPD/gone.VPD.xml', 'none')");
    history::ChangeRecorder(_folder.file("VPD")).record(_db, 1);
    EXPECT_EQ("missing", column(1, "a", "inventory"));
    EXPECT_EQ("cannot read " + _folder.file("VPD/gone.VPD.xml") + ": No such file or directory",
              column(1, "a", "inventory_problem"));
    EXPECT_EQ("null", column(1, "a", "document_hash"));
}

struct Malformed {
    char const* name;
    // cppcheck-suppress unusedStructMember ; read through GetParam()
    std::string text;
    // cppcheck-suppress unusedStructMember ; read through GetParam()
    char const* problem;
};

void PrintTo(Malformed const& malformed, std::ostream* out) {
    *out << malformed.name;
}

class HistoryMalformedDocument : public HistoryChangeRecorder,
                                 public ::testing::WithParamInterface<Malformed> {};

TEST_P(HistoryMalformedDocument, IsUnreadableAtItsLineAndKeepsWhatWasRead) {
    Partition partition = surveyed("a");
    partition.document = GetParam().text;
    long long const run = record({partition});
    EXPECT_EQ("unreadable", column(run, "a", "inventory"));
    EXPECT_EQ(GetParam().problem, column(run, "a", "inventory_problem"));
}

std::string const gc_Whole = clientDocument("a", "FW1", gc_Cards);

INSTANTIATE_TEST_SUITE_P(
    Ways, HistoryMalformedDocument,
    ::testing::Values(
        Malformed{"Truncated", gc_Whole.substr(0, gc_Whole.find("<Resource displayName=\"fcs0\"")),
                  "document unreadable at line 28: no element found"},
        Malformed{"NotXml", "this is no document\n", "document unreadable at line 1: syntax error"},
        Malformed{"Empty", "", "document unreadable at line 1: no element found"},
        Malformed{"CutInsideATag", gc_Whole.substr(0, gc_Whole.find("uniqueId=\"M-1-fcs0")),
                  "document unreadable at line 28: not well-formed (invalid token)"}),
    [](::testing::TestParamInfo<Malformed> const& info) { return info.param.name; });

TEST_F(HistoryChangeRecorder, BareAmpersandAndLessThanInAValueAreRead) {
    long long const run = record({surveyed("a", "FW<1 & 2")});
    EXPECT_EQ("read", column(run, "a", "inventory"));
    EXPECT_EQ((Lines{"component property_changed M a M-a CL FW<1 & 2 FW2"}),
              events(record({surveyed("a", "FW2")})));
}

TEST_F(HistoryChangeRecorder, TruncatedDocumentKeepsTheComponentsBeforeTheCut) {
    Partition partition = surveyed("a");
    partition.document = gc_Whole.substr(0, gc_Whole.find("<Resource displayName=\"fcs0\""));
    record({partition});
    std::string const components = _db.execAndGet("SELECT components FROM documents").getString();
    EXPECT_NE(std::string::npos, components.find("U1-P1-C6\tent0\tAdapters\n"));
    EXPECT_EQ(std::string::npos, components.find("fcs0"));
}

TEST_F(HistoryChangeRecorder, UnreadableInventoryIsNotComparedWith) {
    record({surveyed("a")});
    Partition partition = surveyed("a", "FW2");
    partition.document = partition.document->substr(0, 400);
    EXPECT_EQ(Lines{}, events(record({partition})));
}

TEST_F(HistoryChangeRecorder, DefaultDocumentIsNoInventoryAndBringsNoComponentEvents) {
    record({surveyed("a")});
    long long const run = record({failing("a")});
    EXPECT_EQ("default", column(run, "a", "inventory"));
    EXPECT_EQ((Lines{"partition newly_failing M a 2 1"}), events(run));
    EXPECT_EQ(Lines{"partition recovered M a"}, events(record({surveyed("a")})));
}

TEST_F(HistoryChangeRecorder, UnchangedDocumentIsStoredOnceAndNotReadAgain) {
    record({surveyed("a"), surveyed("b")});
    EXPECT_EQ(2, count("documents"));
    // What the previous run's reading gave is what a run uses for a content
    // it holds: were the document read again, its inventory would say "read".
    _db.exec("UPDATE partition_results SET inventory = 'unreadable',"
             " inventory_problem = 'kept'");
    long long const run = record({surveyed("a"), surveyed("b")});
    EXPECT_EQ(2, count("documents"));
    EXPECT_EQ("unreadable", column(run, "a", "inventory"));
    EXPECT_EQ("kept", column(run, "b", "inventory_problem"));
}

TEST_F(HistoryChangeRecorder, PartitionsWithTheSameDocumentShareOneRow) {
    Partition one = surveyed("a");
    Partition two = surveyed("b");
    two.document = one.document;
    record({one, two});
    EXPECT_EQ(1, count("documents"));
}

TEST_F(HistoryChangeRecorder, ManyDocumentsAreReadOnSeveralThreadsIntoTheSameRecord) {
    std::vector<Partition> partitions;
    partitions.reserve(300);
    for (int index = 0; index < 300; ++index) {
        partitions.push_back(surveyed("p" + std::to_string(index), "FW" + std::to_string(index)));
    }
    partitions[7].document = "not xml";
    record(partitions);
    partitions[9].document = clientDocument("p9", "FW-new", gc_Cards);
    long long const run = record(partitions);
    EXPECT_EQ(301, count("documents"));
    EXPECT_EQ("unreadable", column(run, "p7", "inventory"));
    EXPECT_EQ(299, _db.execAndGet("SELECT count(*) FROM partition_results WHERE run_id = 2"
                                  " AND inventory = 'read'")
                       .getInt64());
    EXPECT_EQ((Lines{"component property_changed M p9 M-p9 CL FW9 FW-new"}), events(run));
}

TEST_F(HistoryChangeRecorder, PruningRunsLeavesNoOrphanDocuments) {
    record({surveyed("a"), surveyed("b")});
    record({surveyed("a", "FW2"), surveyed("b")});
    record({surveyed("a", "FW3"), surveyed("b")});
    EXPECT_EQ(4, count("documents"));
    _db.exec("DELETE FROM runs WHERE id < 3");
    EXPECT_EQ(2, count("documents"));
    _db.exec("DELETE FROM runs");
    EXPECT_EQ(0, count("documents"));
    EXPECT_EQ(0, count("events"));
    EXPECT_EQ(0, count("partition_results"));
}

TEST_F(HistoryChangeRecorder, UnknownRunIsRefused) {
    EXPECT_THROW(history::ChangeRecorder(_folder.path()).record(_db, 42), std::invalid_argument);
}

} // namespace
