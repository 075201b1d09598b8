#include "history/RunRecorder.h"

#include "QuorvexTest.h"
#include "history/HistoryDatabase.h"

#include <SQLiteCpp/Statement.h>
#include <SQLiteCpp/Transaction.h>

#include <gtest/gtest.h>

#include <string>
#include <utility>
#include <vector>

namespace {

using report::Outcome;

report::PartitionSummary partition(std::string const& host, Outcome outcome) {
    report::PartitionSummary summary;
    summary.host = host;
    summary.ip = "10.0.0." + std::to_string(host.size());
    summary.outcome = outcome;
    summary.statusText = outcome == Outcome::Surveyed ? "Ok" : "Failed";
    summary.returnCode = outcome == Outcome::Surveyed ? "0" : "8";
    return summary;
}

// Two machines: one with five partitions (db1 twice), one whose listing
// failed.
report::RunSummary twoMachines() {
    report::PartitionSummary surveyed = partition("db1", Outcome::Surveyed);
    surveyed.id = "3";
    surveyed.document = "/var/adm/quorvex/VPD/x-3.VPD.xml";
    surveyed.seconds = 2.5;
    report::PartitionSummary timedOut = partition("app1", Outcome::TimedOut);
    timedOut.reason = "stopped by the time limit";
    report::RunSummary summary;
    summary.tool = "quorvex-survey";
    summary.consoleHost = "console1";
    summary.started = "2023-11-14T23:13:20+01:00";
    summary.ended = "2023-11-14T23:20:00+01:00";
    summary.exitStatus = 4;
    summary.machines.push_back(
        {"9119-MHE_21ABCDE",
         "/s1",
         std::nullopt,
         {surveyed, timedOut, partition("db1", Outcome::Interrupted),
          partition("web", Outcome::Inactive), partition("x", Outcome::WorkerDied)},
         std::nullopt});
    summary.machines.push_back({"8286-42A_0000001",
                                "/s2",
                                std::nullopt,
                                {},
                                report::ListingFailure{"lspartition -c 8286", 1, "not found"}});
    return summary;
}

class RunRecorderTest : public ::testing::Test {
protected:
    long long _record(report::RunSummary const& summary, nlohmann::ordered_json document = {}) {
        SQLite::Transaction transaction(_database.connection(),
                                        SQLite::TransactionBehavior::IMMEDIATE);
        long long const runId = history::RunRecorder(_database.connection())
                                    .record(summary, std::move(document), 1700000500);
        transaction.commit();
        return runId;
    }

    // The rows of a query, each row's columns joined by "|" (NULL as "-").
    std::vector<std::string> _rows(char const* query) {
        SQLite::Statement statement(_database.connection(), query);
        std::vector<std::string> rows;
        while (statement.executeStep()) {
            std::string row;
            for (int column = 0; column < statement.getColumnCount(); ++column) {
                SQLite::Column const value = statement.getColumn(column);
                row += (column == 0 ? "" : "|") + (value.isNull() ? "-" : value.getString());
            }
            rows.push_back(row);
        }
        return rows;
    }

    QuorvexTest::TemporaryDirectory _work;
    history::HistoryDatabase _database{_work.file("h.sqlite")};
};

TEST_F(RunRecorderTest, RunRowCountsAndTimes) {
    EXPECT_EQ(_record(twoMachines()), 1);
    EXPECT_EQ(_rows("SELECT id, console, tool, started, ended, started_unix, recorded_unix, "
                    "exit_status, return_code, interrupted, partitions, surveyed, failed "
                    "FROM runs"),
              std::vector<std::string>{
                  "1|console1|quorvex-survey|2023-11-14T23:13:20+01:00|2023-11-14T23:20:00+01:00|"
                  "1700000000|1700000500|4|4|-|5|1|2"});
}

TEST_F(RunRecorderTest, MachineRowsWithTheListingFailureAsJson) {
    _record(twoMachines());
    EXPECT_EQ(_rows("SELECT * FROM machine_results ORDER BY machine"),
              (std::vector<std::string>{
                  R"(1|8286-42A_0000001|8|{"command":"lspartition -c 8286","exit_status":1,)"
                  R"("message":"not found"})",
                  "1|9119-MHE_21ABCDE|4|-"}));
}

TEST_F(RunRecorderTest, PartitionRowsNamedByHostWithTheDerivedColumnsLeftEmpty) {
    _record(twoMachines());
    EXPECT_EQ(_rows("SELECT * FROM partition_results ORDER BY partition"),
              (std::vector<std::string>{
                  std::string("1|9119-MHE_21ABCDE|app1|-|10.0.0.4|timed_out|Failed|") +
                      "stopped by the time limit|-|-|none|-|-|-|-|-",
                  std::string("1|9119-MHE_21ABCDE|db1|3|10.0.0.3|surveyed|Ok|-|2.5|") +
                      "/var/adm/quorvex/VPD/x-3.VPD.xml|none|-|-|-|-|-",
                  "1|9119-MHE_21ABCDE|db1 #2|-|10.0.0.3|interrupted|Failed|-|-|-|none|-|-|-|-|-",
                  "1|9119-MHE_21ABCDE|web|-|10.0.0.3|inactive|Failed|-|-|-|none|-|-|-|-|-",
                  "1|9119-MHE_21ABCDE|x|-|10.0.0.1|worker_died|Failed|-|-|-|none|-|-|-|-|-"}));
}

TEST_F(RunRecorderTest, SummaryKeptCompactWithTheRunIdInItsHistoryMember) {
    _record(twoMachines());
    _record(twoMachines(),
            {{"tool", "quorvex-survey"}, {"history", {{"file", "/h"}, {"run_id", nullptr}}}});
    EXPECT_EQ(_rows("SELECT summary FROM runs ORDER BY id"),
              (std::vector<std::string>{
                  "null", R"({"tool":"quorvex-survey","history":{"file":"/h","run_id":2}})"}));
}

TEST_F(RunRecorderTest, NullHistoryMemberStaysNull) {
    _record(twoMachines(), {{"history", nullptr}});
    EXPECT_EQ(_rows("SELECT summary FROM runs"), std::vector<std::string>{R"({"history":null})"});
}

TEST_F(RunRecorderTest, TextThatIsNotUtf8IsKeptReplaced) {
    _record(twoMachines(), {{"console_host", "c\xFF"}});
    EXPECT_EQ(_rows("SELECT summary FROM runs"),
              std::vector<std::string>{"{\"console_host\":\"c\xEF\xBF\xBD\"}"});
}

TEST_F(RunRecorderTest, StartThatIsNoTimeTextCountsFromTheRecording) {
    report::RunSummary summary = twoMachines();
    summary.started = "";
    _record(summary);
    EXPECT_EQ(_rows("SELECT started_unix FROM runs"), std::vector<std::string>{"1700000500"});
}

TEST_F(RunRecorderTest, IdsFollowRecordingOrderAndAreNeverGivenAgainAfterAPrune) {
    EXPECT_EQ(_record(twoMachines()), 1);
    EXPECT_EQ(_record(twoMachines()), 2);
    _database.connection().exec("DELETE FROM runs WHERE id = 2");
    EXPECT_EQ(_record(twoMachines()), 3);
    EXPECT_EQ(_rows("SELECT count(*) FROM partition_results WHERE run_id = 2"),
              std::vector<std::string>{"0"})
        << "the pruned run's partitions went with it";
}

TEST_F(RunRecorderTest, RunOfAllMachinesSaysSo) {
    report::RunSummary all = twoMachines();
    all.options.all = true;
    _record(all);
    _record(twoMachines());
    EXPECT_EQ(_rows("SELECT all_machines FROM runs ORDER BY id"),
              (std::vector<std::string>{"1", "0"}));
}

// With no machine listing, the run cannot tell which machines are gone.
TEST_F(RunRecorderTest, RunOfAllMachinesWhoseListingFailedListedNone) {
    report::RunSummary summary;
    summary.tool = "quorvex-survey";
    summary.options.all = true;
    summary.listingFailure = report::ListingFailure{"lsvtc -t0", 5, "busy"};
    _record(summary);
    EXPECT_EQ(_rows("SELECT all_machines FROM runs"), std::vector<std::string>{"0"});
}

TEST_F(RunRecorderTest, RunWithoutMachines) {
    report::RunSummary summary;
    summary.tool = "quorvex-survey";
    summary.listingFailure = report::ListingFailure{"lsvtc -t0", 5, "busy"};
    _record(summary);
    EXPECT_EQ(_rows("SELECT return_code, partitions, surveyed, failed, exit_status FROM runs"),
              std::vector<std::string>{"8|0|0|0|-"});
}

} // namespace
