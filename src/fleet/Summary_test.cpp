#include "fleet/Summary.h"

#include "QuorvexTest.h"
#include "utility/LocalTime.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>

namespace {

using fleet::MachineRecord;
using fleet::PartitionRecord;
using fleet::RunFacts;
using Json = nlohmann::ordered_json;
using Kind = Quorvex::PYLON::VPD::PartitionOutcomeKind;

// The interpreter that Debian's python3-jsonschema belongs to.
constexpr char gc_DebianPython[] = "/usr/bin/python3";

PartitionRecord finished(Kind kind, std::string const& code) {
    PartitionRecord record;
    record.partition.set_PartitionID("7");
    record.partition.set_HostName("aurora");
    record.partition.set_IP("10.20.30.41");
    record.partition.set_ActiveStatus("3");
    record.result.kind = kind;
    record.result.returnCode = code;
    record.outcome = report::outcomeOf(kind);
    return record;
}

// One partition of every outcome, a machine without partitions, and texts
// that are not UTF-8.
std::vector<MachineRecord> everyOutcome() {
    MachineRecord machine;
    machine.identity = "9119-MHE_21ABCDE";
    machine.listed = true;
    PartitionRecord surveyed = finished(Kind::Surveyed, "0");
    surveyed.result.fileName = "VPD/x-7.VPD.xml";
    surveyed.result.statusText = "Ok";
    surveyed.result.rc = 0;
    surveyed.result.rcCmd = 0;
    surveyed.seconds = 1.25;
    PartitionRecord inactive = finished(Kind::Inactive, "8");
    inactive.result.statusText = "Failed - Active Status < 3";
    inactive.partition.set_HostName("h\xff\xfe");
    PartitionRecord timedOut = finished(Kind::ChannelFailure, "8");
    timedOut.result.fileName = "VPD/x-7.VPD.xml";
    timedOut.result.reason = "Partition not surveyed, reason: \nRELAY Failed.\n\n\n\nStopped.\n";
    timedOut.stop = fleet::ActionStop{report::RemoteAction::RunCommand, 2.04, false};
    timedOut.outcome = report::Outcome::TimedOut;
    PartitionRecord interrupted;
    interrupted.partition.set_PartitionID("9");
    interrupted.result.returnCode = "8";
    interrupted.result.statusText = "Interrupted - not surveyed";
    interrupted.outcome = report::Outcome::Interrupted;
    machine.partitions = {surveyed,
                          inactive,
                          finished(Kind::ChannelFailure, "8"),
                          finished(Kind::ClientFailure, "8"),
                          finished(Kind::FetchFailure, "8"),
                          timedOut,
                          interrupted};
    MachineRecord empty;
    empty.identity = "8286-42A_10XYZ99";
    empty.listed = true;
    return {machine, empty};
}

RunFacts facts() {
    RunFacts run;
    run.options.identities = {"9119-MHE_21ABCDE", "8286-42A_10XYZ99"};
    run.consoleHost = "console";
    run.started = util::localTimeText(0);
    run.ended = util::localTimeText(60);
    run.elapsedSeconds = 60;
    run.interruptedBy = "SIGINT";
    run.exitStatus = 130;
    return run;
}

Json document(RunFacts const& run, std::vector<MachineRecord> const& machines) {
    return report::summaryDocument(fleet::runSummary(run, machines));
}

TEST(Summary, PartitionOutcomesAreTheRecordsOutcomes) {
    Json const summary = document(facts(), everyOutcome());
    Json const& partitions = summary["machines"][0]["partitions"];
    std::vector<std::string> outcomes;
    std::transform(partitions.begin(), partitions.end(), std::back_inserter(outcomes),
                   [](Json const& partition) { return partition["outcome"].get<std::string>(); });
    EXPECT_EQ(outcomes,
              (std::vector<std::string>{"surveyed", "inactive", "channel_failure", "client_failure",
                                        "fetch_failure", "timed_out", "interrupted"}));
}

TEST(Summary, PartitionWhoseSurveyNeverEndedIsInterrupted) {
    MachineRecord machine;
    machine.identity = "9119-MHE_21ABCDE";
    machine.partitions = {PartitionRecord{}};
    EXPECT_EQ(report::Outcome::Interrupted,
              fleet::runSummary(facts(), {machine}).machines[0].partitions[0].outcome);
}

TEST(Summary, RunFactsAndOptionsAreCarried) {
    Json const summary = document(facts(), everyOutcome());
    EXPECT_EQ(summary["tool"], "quorvex-survey");
    EXPECT_EQ(summary["interrupted"], "SIGINT");
    EXPECT_EQ(summary["exit_status"], 130);
    EXPECT_EQ(summary["return_code"], "4");
    EXPECT_EQ(summary["elapsed_seconds"].dump(), "60.0");
    EXPECT_EQ(summary["options"].dump(),
              R"({"jobs":8,"timeout_seconds":1800,"all":false,)"
              R"("identities":["9119-MHE_21ABCDE","8286-42A_10XYZ99"]})");
}

TEST(Summary, CountsAddUpPerMachineAndOverAll) {
    Json const summary = document(facts(), everyOutcome());
    Json const& counts = summary["machines"][0]["counts"];
    EXPECT_EQ(counts["partitions"], 7);
    for (char const* outcome : {"surveyed", "inactive", "channel_failure", "client_failure",
                                "fetch_failure", "timed_out", "interrupted"}) {
        EXPECT_EQ(counts[outcome], 1) << outcome;
    }
    EXPECT_EQ(summary["totals"]["machines"], 2);
    EXPECT_EQ(summary["totals"]["partitions"], 7);
    EXPECT_EQ(summary["machines"][0]["return_code"], "4");
    EXPECT_EQ(summary["machines"][1]["return_code"], "8");
    EXPECT_EQ(summary["machines"][1]["partitions"], Json::array());
}

TEST(Summary, PartitionCarriesItsRecordAndNullsWhereNothingIsKnown) {
    Json const summary = document(facts(), everyOutcome());
    Json const& surveyed = summary["machines"][0]["partitions"][0];
    EXPECT_EQ(surveyed["document"], "VPD/x-7.VPD.xml");
    EXPECT_EQ(surveyed["rc"], 0);
    EXPECT_EQ(surveyed["seconds"], 1.25);
    EXPECT_TRUE(surveyed["reason"].is_null());
    EXPECT_FALSE(surveyed.contains("time_limit"));
    Json const& inactive = summary["machines"][0]["partitions"][1];
    EXPECT_TRUE(inactive["document"].is_null());
    EXPECT_TRUE(inactive["rc"].is_null());
    EXPECT_TRUE(inactive["seconds"].is_null());
    Json const& timedOut = summary["machines"][0]["partitions"][5];
    EXPECT_EQ(timedOut["time_limit"]["action"], "runCmdOnPartition");
    EXPECT_EQ(timedOut["time_limit"]["stopped_after_seconds"], 2.04);
    EXPECT_EQ(summary["machines"][0]["trace_file"],
              "/var/adm/quorvex/Trace/quorvexPYLON_VPD_Survey_ClientPartition_9119-MHE_21ABCDE"
              ".Trace");
}

TEST(Summary, BytesThatAreNotUtf8AreReplaced) {
    std::string const text = report::summaryText(document(facts(), everyOutcome()));
    EXPECT_NE(text.find("\"h\xef\xbf\xbd\xef\xbf\xbd\""), std::string::npos);
}

// Checks the summary against the schema in docs/ with the JSON Schema
// validator of Debian's python3-jsonschema.
TEST(Summary, DocumentIsValidAgainstTheSchema) {
    QuorvexTest::TemporaryDirectory const folder;
    std::string const file = folder.file("summary.json");
    QuorvexTest::writeFile(file, report::summaryText(document(facts(), everyOutcome())));
    RunFacts uninterrupted = facts();
    uninterrupted.interruptedBy.clear();
    uninterrupted.exitStatus = 4;
    std::string const second = folder.file("second.json");
    QuorvexTest::writeFile(second, report::summaryText(document(uninterrupted, {})));
    std::string const check =
        "import json, sys, jsonschema\n"
        "schema = json.load(open(sys.argv[1]))\n"
        "jsonschema.Draft202012Validator.check_schema(schema)\n"
        "for name in sys.argv[2:]:\n"
        "    jsonschema.Draft202012Validator(schema).validate(json.load(open(name)))\n";
    QuorvexTest::CommandResult const result = QuorvexTest::runCommand(
        {gc_DebianPython, "-c", check, QuorvexTest::sourceRoot() + "/docs/summary.schema.json",
         file, second});
    EXPECT_EQ(result.exitStatus, 0) << result.stderrText;
}

TEST(Summary, SchemaCheckRejectsADocumentWithAnUnknownOutcome) {
    QuorvexTest::TemporaryDirectory const folder;
    Json summary = document(facts(), everyOutcome());
    summary["machines"][0]["partitions"][0]["outcome"] = "lost";
    std::string const file = folder.file("summary.json");
    QuorvexTest::writeFile(file, report::summaryText(summary));
    std::string const check = "import json, sys, jsonschema\n"
                              "schema = json.load(open(sys.argv[1]))\n"
                              "jsonschema.Draft202012Validator(schema).validate("
                              "json.load(open(sys.argv[2])))\n";
    QuorvexTest::CommandResult const result =
        QuorvexTest::runCommand({gc_DebianPython, "-c", check,
                                 QuorvexTest::sourceRoot() + "/docs/summary.schema.json", file});
    EXPECT_NE(result.exitStatus, 0);
}

} // namespace
