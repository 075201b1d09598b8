#include "report/RunSummary.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>

namespace {

using Json = nlohmann::ordered_json;
using report::Outcome;
using report::PartitionSummary;

PartitionSummary partition(Outcome outcome, std::string const& returnCode) {
    PartitionSummary summary;
    summary.host = "aurora";
    summary.ip = "10.0.0.1";
    summary.outcome = outcome;
    summary.statusText = "Ok";
    summary.returnCode = returnCode;
    return summary;
}

report::RunSummary oneMachine(std::vector<PartitionSummary> partitions) {
    report::RunSummary run;
    run.tool = "quorvex-survey report";
    run.machines.push_back(
        {"1-A_S", "/v/x.status", std::nullopt, std::move(partitions), std::nullopt});
    return run;
}

std::vector<std::string> keysOf(Json const& object) {
    std::vector<std::string> keys;
    auto const items = object.items();
    std::transform(items.begin(), items.end(), std::back_inserter(keys),
                   [](auto const& item) { return item.key(); });
    return keys;
}

TEST(RunSummary, RunAndMachineKeysComeInTheSchemasOrder) {
    Json const document = report::summaryDocument(oneMachine({}));
    EXPECT_EQ(keysOf(document["machines"][0]),
              (std::vector<std::string>{"identity", "return_code", "status_file", "trace_file",
                                        "counts", "partitions"}));
    EXPECT_EQ(
        keysOf(document),
        (std::vector<std::string>{"schema_version", "tool", "version", "console_host", "started",
                                  "ended", "elapsed_seconds", "options", "interrupted",
                                  "return_code", "exit_status", "history", "totals", "machines"}));
}

TEST(RunSummary, UnknownPartitionFactsAreNullAndNoStopMeansNoTimeLimit) {
    Json const document = report::summaryDocument(oneMachine({partition(Outcome::Surveyed, "0")}));
    EXPECT_EQ(R"({"id":null,"host":"aurora","ip":"10.0.0.1","active_status":null,)"
              R"("outcome":"surveyed","status_text":"Ok","return_code":"0","rc":null,)"
              R"("rc_cmd":null,"document":null,"reason":null,"seconds":null})",
              document["machines"][0]["partitions"][0].dump());
}

TEST(RunSummary, StoppedActionBecomesTheTimeLimitObject) {
    PartitionSummary stopped = partition(Outcome::TimedOut, "8");
    stopped.stoppedAction = report::StoppedAction{report::RemoteAction::GetFile, 2.5};
    Json const document = report::summaryDocument(oneMachine({stopped}));
    EXPECT_EQ(R"({"action":"getFileFromPartition","stopped_after_seconds":2.5})",
              document["machines"][0]["partitions"][0]["time_limit"].dump());
}

TEST(RunSummary, CountsAndCodesAreDerivedFromThePartitions) {
    Json const document = report::summaryDocument(
        oneMachine({partition(Outcome::Surveyed, "0"), partition(Outcome::FetchFailure, "8")}));
    Json const& machine = document["machines"][0];
    EXPECT_EQ("4", machine["return_code"]);
    EXPECT_EQ(
        R"({"partitions":2,"surveyed":1,"inactive":0,"channel_failure":0,)"
        R"("client_failure":0,"fetch_failure":1,"timed_out":0,"interrupted":0,"worker_died":0})",
        machine["counts"].dump());
    EXPECT_EQ(
        R"({"machines":1,"partitions":2,"surveyed":1,"inactive":0,"channel_failure":0,)"
        R"("client_failure":0,"fetch_failure":1,"timed_out":0,"interrupted":0,"worker_died":0})",
        document["totals"].dump());
    EXPECT_EQ("4", document["return_code"]);
}

TEST(RunSummary, RunWithoutMachinesHasCodeEightAndZeroTotals) {
    report::RunSummary run;
    Json const document = report::summaryDocument(run);
    EXPECT_EQ("8", document["return_code"]);
    EXPECT_EQ(0, document["totals"]["machines"]);
    EXPECT_EQ(0, document["totals"]["partitions"]);
    EXPECT_EQ(Json::array(), document["machines"]);
}

TEST(RunSummary, ElapsedSecondsKeepWholeOrFractionalForm) {
    report::RunSummary run;
    run.elapsedSeconds = 60LL;
    EXPECT_EQ("60", report::summaryDocument(run)["elapsed_seconds"].dump());
    run.elapsedSeconds = 60.0;
    EXPECT_EQ("60.0", report::summaryDocument(run)["elapsed_seconds"].dump());
}

TEST(RunSummary, OptionsAndRunFactsUnknownToTheWriterAreNull) {
    report::RunSummary run;
    run.options.identities = {"1-A_S"};
    Json const document = report::summaryDocument(run);
    EXPECT_EQ(R"({"jobs":null,"timeout_seconds":null,"all":false,"identities":["1-A_S"]})",
              document["options"].dump());
    EXPECT_EQ(nullptr, document["interrupted"]);
    EXPECT_EQ(nullptr, document["exit_status"]);
}

TEST(RunSummary, RunWithoutHistoryHasANullHistory) {
    EXPECT_EQ("null", report::summaryDocument(report::RunSummary{})["history"].dump());
}

TEST(RunSummary, RecordedRunGivesItsFileAndId) {
    report::RunSummary run;
    run.history = report::HistoryRecord{"/var/lib/h.sqlite", 42, true, std::nullopt};
    EXPECT_EQ(R"({"file":"/var/lib/h.sqlite","run_id":42,"recorded":true,"error":null})",
              report::summaryDocument(run)["history"].dump());
}

TEST(RunSummary, RunNotRecordedGivesWhy) {
    report::RunSummary run;
    run.history = report::HistoryRecord{"/h.sqlite", std::nullopt, false, "locked"};
    EXPECT_EQ(R"({"file":"/h.sqlite","run_id":null,"recorded":false,"error":"locked"})",
              report::summaryDocument(run)["history"].dump());
}

TEST(RunSummary, TextReplacesBytesThatAreNotUtf8) {
    Json const summary = {{"console_host", "c\xFF"}};
    EXPECT_EQ("{\n  \"console_host\": \"c\xEF\xBF\xBD\"\n}\n", report::summaryText(summary));
}

TEST(RunSummary, ListingFailuresComeLastInTheirObjectOnlyWhenThereIsOne) {
    report::RunSummary run = oneMachine({});
    run.machines.front().listingFailure =
        report::ListingFailure{"/opt/vtc/bin/lspartition -ix -c X", 1, "not found"};
    run.listingFailure = report::ListingFailure{"/opt/lsvtc/bin/lsvtc -t0", std::nullopt, "hung"};
    Json const document = report::summaryDocument(run);
    EXPECT_EQ(keysOf(document["machines"][0]).back(), "listing_failure");
    EXPECT_EQ(R"({"command":"/opt/vtc/bin/lspartition -ix -c X","exit_status":1,)"
              R"("message":"not found"})",
              document["machines"][0]["listing_failure"].dump());
    EXPECT_EQ(keysOf(document).back(), "listing_failure");
    EXPECT_EQ(document["listing_failure"]["exit_status"].dump(), "null");
}

} // namespace
