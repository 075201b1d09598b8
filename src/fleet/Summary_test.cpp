#include "fleet/Summary.h"

#include "QuorvexTest.h"
#include "utility/LocalTime.h"

#include <gtest/gtest.h>

namespace {

using Fleet::MachineRecord;
using Fleet::PartitionRecord;
using Fleet::RunFacts;
using Fleet::Summary;
using Kind = Quorvex::PYLON::VPD::PartitionOutcomeKind;

// The interpreter that Debian's python3-jsonschema belongs to.
constexpr char gc_DebianPython[] = "/usr/bin/python3";

PartitionRecord finished(Kind kind, std::string const& code) {
    PartitionRecord record;
    record.partition.set_PartitionID("7");
    record.partition.set_HostName("aurora");
    record.partition.set_IP("10.20.30.41");
    record.partition.set_ActiveStatus("3");
    record.outcome.kind = kind;
    record.outcome.returnCode = code;
    record.finished = true;
    return record;
}

// One partition of every outcome, a machine without partitions, and texts
// that are not UTF-8.
std::vector<MachineRecord> everyOutcome() {
    MachineRecord machine;
    machine.identity = "9119-MHE_21ABCDE";
    machine.listed = true;
    PartitionRecord surveyed = finished(Kind::Surveyed, "0");
    surveyed.outcome.fileName = "VPD/x-7.VPD.xml";
    surveyed.outcome.statusText = "Ok";
    surveyed.outcome.rc = 0;
    surveyed.outcome.rcCmd = 0;
    surveyed.seconds = 1.25;
    PartitionRecord inactive = finished(Kind::Inactive, "8");
    inactive.outcome.statusText = "Failed - Active Status < 3";
    inactive.partition.set_HostName("h\xff\xfe");
    PartitionRecord timedOut = finished(Kind::ChannelFailure, "8");
    timedOut.outcome.fileName = "VPD/x-7.VPD.xml";
    timedOut.outcome.reason = "Partition not surveyed, reason: \nRELAY Failed.\n\n\n\nStopped.\n";
    timedOut.timedOut = true;
    timedOut.stop = Fleet::ActionStop{"runCmdOnPartition", 2.04};
    PartitionRecord interrupted;
    interrupted.partition.set_PartitionID("9");
    interrupted.outcome.returnCode = "8";
    interrupted.outcome.statusText = "Interrupted - not surveyed";
    interrupted.interrupted = true;
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
    run.returnCode = "4";
    run.exitStatus = 130;
    return run;
}

TEST(Summary, OutcomeNamesFollowTheKindUnlessStopped) {
    EXPECT_EQ(Summary::outcomeName(finished(Kind::Surveyed, "0")), "surveyed");
    EXPECT_EQ(Summary::outcomeName(finished(Kind::Inactive, "8")), "inactive");
    EXPECT_EQ(Summary::outcomeName(finished(Kind::ChannelFailure, "8")), "channel_failure");
    EXPECT_EQ(Summary::outcomeName(finished(Kind::ClientFailure, "8")), "client_failure");
    EXPECT_EQ(Summary::outcomeName(finished(Kind::FetchFailure, "8")), "fetch_failure");
    PartitionRecord stopped = finished(Kind::FetchFailure, "8");
    stopped.timedOut = true;
    EXPECT_EQ(Summary::outcomeName(stopped), "timed_out");
    stopped.interrupted = true;
    EXPECT_EQ(Summary::outcomeName(stopped), "interrupted");
}

TEST(Summary, CountsAddUpPerMachineAndOverAll) {
    nlohmann::json const summary = Summary::build(facts(), everyOutcome());
    nlohmann::json const& counts = summary["machines"][0]["counts"];
    EXPECT_EQ(counts["partitions"], 7);
    for (char const* outcome : {"surveyed", "inactive", "channel_failure", "client_failure",
                                "fetch_failure", "timed_out", "interrupted"}) {
        EXPECT_EQ(counts[outcome], 1) << outcome;
    }
    EXPECT_EQ(summary["totals"]["machines"], 2);
    EXPECT_EQ(summary["totals"]["partitions"], 7);
    EXPECT_EQ(summary["machines"][0]["return_code"], "4");
    EXPECT_EQ(summary["machines"][1]["return_code"], "8");
    EXPECT_EQ(summary["machines"][1]["partitions"], nlohmann::json::array());
}

TEST(Summary, PartitionCarriesItsRecordAndNullsWhereNothingIsKnown) {
    nlohmann::json const summary = Summary::build(facts(), everyOutcome());
    nlohmann::json const& surveyed = summary["machines"][0]["partitions"][0];
    EXPECT_EQ(surveyed["document"], "VPD/x-7.VPD.xml");
    EXPECT_EQ(surveyed["rc"], 0);
    EXPECT_EQ(surveyed["seconds"], 1.25);
    EXPECT_TRUE(surveyed["reason"].is_null());
    EXPECT_FALSE(surveyed.contains("time_limit"));
    nlohmann::json const& inactive = summary["machines"][0]["partitions"][1];
    EXPECT_TRUE(inactive["document"].is_null());
    EXPECT_TRUE(inactive["rc"].is_null());
    EXPECT_TRUE(inactive["seconds"].is_null());
    nlohmann::json const& timedOut = summary["machines"][0]["partitions"][5];
    EXPECT_EQ(timedOut["time_limit"]["action"], "runCmdOnPartition");
    EXPECT_EQ(timedOut["time_limit"]["stopped_after_seconds"], 2.04);
    EXPECT_EQ(summary["machines"][0]["trace_file"],
              "/var/adm/quorvex/Trace/quorvexPYLON_VPD_Survey_ClientPartition_9119-MHE_21ABCDE"
              ".Trace");
}

TEST(Summary, BytesThatAreNotUtf8AreReplaced) {
    std::string const text = Summary::text(Summary::build(facts(), everyOutcome()));
    EXPECT_NE(text.find("\"h\xef\xbf\xbd\xef\xbf\xbd\""), std::string::npos);
}

// Checks the summary against the schema in docs/ with the JSON Schema
// validator of Debian's python3-jsonschema.
TEST(Summary, DocumentIsValidAgainstTheSchema) {
    QuorvexTest::TemporaryDirectory const folder;
    std::string const document = folder.file("summary.json");
    QuorvexTest::writeFile(document, Summary::text(Summary::build(facts(), everyOutcome())));
    RunFacts uninterrupted = facts();
    uninterrupted.interruptedBy.clear();
    uninterrupted.exitStatus = 4;
    std::string const second = folder.file("second.json");
    QuorvexTest::writeFile(second, Summary::text(Summary::build(uninterrupted, {})));
    std::string const check =
        "import json, sys, jsonschema\n"
        "schema = json.load(open(sys.argv[1]))\n"
        "jsonschema.Draft202012Validator.check_schema(schema)\n"
        "for name in sys.argv[2:]:\n"
        "    jsonschema.Draft202012Validator(schema).validate(json.load(open(name)))\n";
    QuorvexTest::CommandResult const result = QuorvexTest::runCommand(
        {gc_DebianPython, "-c", check, QuorvexTest::sourceRoot() + "/docs/summary.schema.json",
         document, second});
    EXPECT_EQ(result.exitStatus, 0) << result.stderrText;
}

TEST(Summary, SchemaCheckRejectsADocumentWithAnUnknownOutcome) {
    QuorvexTest::TemporaryDirectory const folder;
    nlohmann::json summary = Summary::build(facts(), everyOutcome());
    summary["machines"][0]["partitions"][0]["outcome"] = "lost";
    std::string const document = folder.file("summary.json");
    QuorvexTest::writeFile(document, Summary::text(summary));
    std::string const check = "import json, sys, jsonschema\n"
                              "schema = json.load(open(sys.argv[1]))\n"
                              "jsonschema.Draft202012Validator(schema).validate("
                              "json.load(open(sys.argv[2])))\n";
    QuorvexTest::CommandResult const result = QuorvexTest::runCommand(
        {gc_DebianPython, "-c", check, QuorvexTest::sourceRoot() + "/docs/summary.schema.json",
         document});
    EXPECT_NE(result.exitStatus, 0);
}

} // namespace
