#include "report/FolderReader.h"

#include "QuorvexTest.h"
#include "utility/SystemError.h"

#include <gtest/gtest.h>

#include <filesystem>

namespace {

namespace fs = std::filesystem;
using Json = nlohmann::ordered_json;

constexpr char gc_Prefix[] = "quorvexPYLON_VPD_Survey_ClientPartition_";

std::string expectedVpd(std::string const& scenario) {
    return QuorvexTest::sourceRoot() + "/tests/e2e/scenarios/" + scenario + "/expected/VPD";
}

// The files a finished run of the single-machine tool left.
void copyRun(std::string const& scenario, QuorvexTest::TemporaryDirectory const& folder) {
    for (auto const& entry : fs::directory_iterator(expectedVpd(scenario))) {
        fs::copy_file(entry.path(), folder.file(entry.path().filename().string()));
    }
}

std::string defaultDocument(std::string const& machine, std::string const& id,
                            std::string const& host, std::string const& reason) {
    return "<Resource displayName=\"" + host + "\" uniqueId=\"" + machine + "-" + id +
           "\">\n<Property displayName=\"HostName\" name=\"HN\">\nHN\n<Value type=\"string\">" +
           host +
           "</Value>\n</Property>\n<Property displayName=\"VD\" name=\"VD\">\nVD\n"
           "<Value type=\"string\">" +
           reason + "</Value>\n</Property>\n";
}

std::string fetchedDocument(std::string const& host) {
    return "<Property displayName=\"HostName\" name=\"HN\">\nHN\n<Value type=\"string\">" + host +
           "</Value>\n</Property>\n";
}

constexpr char gc_ChannelReason[] = "Partition not surveyed, reason: \nRELAY Failed.\n\n"
                                    "[     Rc] = 4294967295\n\n\n";

TEST(FolderReader, RunWithEveryFailureKindGivesEachPartitionItsFacts) {
    QuorvexTest::TemporaryDirectory folder;
    copyRun("all-failed", folder);
    Json const summary = report::readSummaryFromFolder(folder.path());
    ASSERT_EQ(1U, summary["machines"].size());
    Json const& machine = summary["machines"][0];
    EXPECT_EQ("1234-ABC_10ABCDE", machine["identity"]);
    EXPECT_EQ("8", machine["return_code"]);
    EXPECT_EQ(folder.file(std::string(gc_Prefix) + "1234-ABC_10ABCDE.status"),
              machine["status_file"]);
    EXPECT_EQ(nullptr, machine["trace_file"]);
    Json const& partitions = machine["partitions"];
    ASSERT_EQ(4U, partitions.size());

    EXPECT_EQ(
        R"({"id":"1","host":"host1","ip":"10.1.1.11","active_status":null,)"
        R"("outcome":"channel_failure","status_text":"RELAY Failed, rc = 4",)"
        R"("return_code":"8","rc":4,"rc_cmd":0,)"
        R"("document":"VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE-1.VPD.xml",)"
        R"("reason":"Partition not surveyed, reason: \nRELAY Failed.\n\n[     Rc] = 4\n)"
        R"([  RcCmd] = 0\n[RetStr1] = no route\n[RetStr2] = \n\n\n","seconds":null})",
        partitions[0].dump());
    EXPECT_EQ("client_failure", partitions[1]["outcome"]);
    EXPECT_EQ(0, partitions[1]["rc"]);
    EXPECT_EQ(9, partitions[1]["rc_cmd"]);
    EXPECT_EQ("fetch_failure", partitions[2]["outcome"]);
    EXPECT_EQ("3", partitions[2]["id"]);
    EXPECT_EQ(2, partitions[2]["rc"]);
    EXPECT_EQ(nullptr, partitions[2]["rc_cmd"]);
    EXPECT_EQ(R"({"id":null,"host":"host4","ip":"10.1.1.14","active_status":null,)"
              R"("outcome":"inactive","status_text":"Failed - Active Status < 3",)"
              R"("return_code":"8","rc":null,"rc_cmd":null,"document":null,"reason":null,)"
              R"("seconds":null})",
              partitions[3].dump());
    EXPECT_EQ(
        R"({"partitions":4,"surveyed":0,"inactive":1,"channel_failure":1,)"
        R"("client_failure":1,"fetch_failure":1,"timed_out":0,"interrupted":0,"worker_died":0})",
        machine["counts"].dump());
}

TEST(FolderReader, ShippedDemoRunIsReadWithSurveyedDocumentsMatched) {
    QuorvexTest::TemporaryDirectory folder;
    copyRun("shipped-demo", folder);
    Json const summary = report::readSummaryFromFolder(folder.path());
    Json const& partitions = summary["machines"][0]["partitions"];
    ASSERT_EQ(7U, partitions.size());
    EXPECT_EQ("1", partitions[0]["id"]);
    EXPECT_EQ("surveyed", partitions[0]["outcome"]);
    EXPECT_EQ(nullptr, partitions[0]["reason"]);
    EXPECT_EQ("6", partitions[5]["id"]);
    EXPECT_EQ("fetch_failure", partitions[5]["outcome"]);
    EXPECT_EQ("", partitions[6]["host"]);
    EXPECT_EQ("surveyed", partitions[6]["outcome"]);
    EXPECT_EQ("4", summary["return_code"]);
    EXPECT_EQ(
        R"({"machines":1,"partitions":7,"surveyed":3,"inactive":1,"channel_failure":1,)"
        R"("client_failure":1,"fetch_failure":1,"timed_out":0,"interrupted":0,"worker_died":0})",
        summary["totals"].dump());
}

TEST(FolderReader, SummaryHeadSaysWhatFilesCannotTell) {
    QuorvexTest::TemporaryDirectory folder;
    copyRun("all-surveyed", folder);
    Json const summary = report::readSummaryFromFolder(folder.path());
    EXPECT_EQ(1, summary["schema_version"]);
    EXPECT_EQ("quorvex-survey report", summary["tool"]);
    EXPECT_EQ(
        R"({"jobs":null,"timeout_seconds":null,"all":false,"identities":["1234-ABC_10ABCDE"]})",
        summary["options"].dump());
    EXPECT_EQ(nullptr, summary["exit_status"]);
    EXPECT_EQ(nullptr, summary["interrupted"]);
    EXPECT_EQ("0", summary["return_code"]);
    EXPECT_GE(summary["elapsed_seconds"].get<long long>(), 0);
    EXPECT_EQ(25U, summary["started"].get<std::string>().size());
}

TEST(FolderReader, MarkupInHostNamesIsCarriedAsWritten) {
    QuorvexTest::TemporaryDirectory folder;
    copyRun("markup-characters", folder);
    Json const summary = report::readSummaryFromFolder(folder.path());
    Json const& partitions = summary["machines"][0]["partitions"];
    EXPECT_EQ("a&b<c\"d", partitions[0]["host"]);
    EXPECT_EQ("1", partitions[0]["id"]);
    EXPECT_EQ("<host2>", partitions[1]["host"]);
    EXPECT_EQ("2", partitions[1]["id"]);
}

TEST(FolderReader, MachineWithoutActivePartitionsHasNoneListed) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + "1234-ABC_10ABCDE.status"),
                           "No ACTIVE Partition Found.\n");
    Json const summary = report::readSummaryFromFolder(folder.path());
    Json const& machine = summary["machines"][0];
    EXPECT_EQ(0U, machine["partitions"].size());
    EXPECT_EQ("8", machine["return_code"]);
}

TEST(FolderReader, TimeLimitLineMakesTheFailureTimedOut) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + "1-A_S.status"),
                           "slow [10.0.0.1] - VPD Survey - RELAY Failed, rc = 4294967295\n");
    QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + "1-A_S-3.VPD.xml"),
                           defaultDocument("1-A-S", "3", "slow",
                                           std::string(gc_ChannelReason) +
                                               "Stopped by the time limit of 2 s after 2.0 s.\n"));
    Json const summary = report::readSummaryFromFolder(folder.path());
    Json const& partition = summary["machines"][0]["partitions"][0];
    EXPECT_EQ("timed_out", partition["outcome"]);
    EXPECT_EQ("3", partition["id"]);
    EXPECT_EQ(R"({"action":"runCmdOnPartition","stopped_after_seconds":2.0})",
              partition["time_limit"].dump());
}

TEST(FolderReader, SummaryModelCarriesTheOutcomeAndTheStoppedAction) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + "1-A_S.status"),
                           "slow [10.0.0.1] - VPD Survey - 2et result Failed, rc = \n");
    QuorvexTest::writeFile(
        folder.file(std::string(gc_Prefix) + "1-A_S-3.VPD.xml"),
        defaultDocument("1-A-S", "3", "slow",
                        "Unable to get File From Partition : \n\n[     Rc] = 2\n\n"
                        "Stopped by the time limit of 5 s after 5.1 s.\n"));
    report::RunSummary const run = report::readRunSummaryFromFolder(folder.path());
    ASSERT_EQ(1U, run.machines.size());
    ASSERT_EQ(1U, run.machines[0].partitions.size());
    report::PartitionSummary const& partition = run.machines[0].partitions[0];
    EXPECT_EQ(report::Outcome::TimedOut, partition.outcome);
    EXPECT_EQ(std::optional<std::string>("3"), partition.id);
    EXPECT_EQ(std::optional<long long>(2), partition.rc);
    EXPECT_EQ(std::nullopt, partition.rcCmd);
    ASSERT_TRUE(partition.stoppedAction.has_value());
    EXPECT_EQ(report::RemoteAction::GetFile, partition.stoppedAction->action);
    EXPECT_DOUBLE_EQ(5.1, partition.stoppedAction->afterSeconds);
    EXPECT_EQ(std::nullopt, run.interruptedBy);
    EXPECT_EQ("quorvex-survey report", run.tool);
}

TEST(FolderReader, InterruptedPartitionsWithAndWithoutDocument) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + "1-A_S.status"),
                           "busy [10.0.0.1] - VPD Survey - Interrupted - not surveyed\n"
                           "later [10.0.0.2] - VPD Survey - Interrupted - not surveyed\n");
    QuorvexTest::writeFile(
        folder.file(std::string(gc_Prefix) + "1-A_S-1.VPD.xml"),
        defaultDocument("1-A-S", "1", "busy",
                        std::string(gc_ChannelReason) + "Stopped by SIGINT after 0.7 s.\n"));
    Json const summary = report::readSummaryFromFolder(folder.path());
    Json const& partitions = summary["machines"][0]["partitions"];
    EXPECT_EQ("interrupted", partitions[0]["outcome"]);
    EXPECT_EQ("1", partitions[0]["id"]);
    EXPECT_DOUBLE_EQ(0.7, partitions[0]["time_limit"]["stopped_after_seconds"].get<double>());
    EXPECT_EQ("interrupted", partitions[1]["outcome"]);
    EXPECT_EQ(nullptr, partitions[1]["document"]);
    EXPECT_EQ("SIGINT", summary["interrupted"]);
    EXPECT_EQ(2, summary["totals"]["interrupted"]);
}

TEST(FolderReader, SameHostTwiceTakesDocumentsInIdOrder) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + "1-A_S.status"),
                           "twin [10.0.0.1] - VPD Survey - RELAY Failed, rc = 4294967295\n"
                           "twin [10.0.0.2] - VPD Survey - RELAY Failed, rc = 4294967295\n");
    for (std::string const id : {"10", "9"}) {
        QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + "1-A_S-" + id + ".VPD.xml"),
                               defaultDocument("1-A-S", id, "twin", gc_ChannelReason));
    }
    Json const summary = report::readSummaryFromFolder(folder.path());
    Json const& partitions = summary["machines"][0]["partitions"];
    EXPECT_EQ("9", partitions[0]["id"]);
    EXPECT_EQ("10", partitions[1]["id"]);
}

TEST(FolderReader, DocumentOfAnotherKindIsNotTaken) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + "1-A_S.status"),
                           "aurora [10.0.0.1] - VPD Survey - Ok\n");
    QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + "1-A_S-1.VPD.xml"),
                           defaultDocument("1-A-S", "1", "aurora", gc_ChannelReason));
    Json const summary = report::readSummaryFromFolder(folder.path());
    Json const& partition = summary["machines"][0]["partitions"][0];
    EXPECT_EQ("surveyed", partition["outcome"]);
    EXPECT_EQ(nullptr, partition["id"]);
    EXPECT_EQ(nullptr, partition["document"]);
}

TEST(FolderReader, DocumentGoesToTheMachineWithTheLongestMatchingIdentity) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + "1-A_S.status"),
                           "a [1] - VPD Survey - Ok\n");
    QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + "1-A_S-B.status"),
                           "b [2] - VPD Survey - Ok\n");
    QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + "1-A_S-B-7.VPD.xml"),
                           fetchedDocument("b"));
    Json const summary = report::readSummaryFromFolder(folder.path());
    EXPECT_EQ("1-A_S", summary["machines"][0]["identity"]);
    EXPECT_EQ(nullptr, summary["machines"][0]["partitions"][0]["id"]);
    EXPECT_EQ("1-A_S-B", summary["machines"][1]["identity"]);
    EXPECT_EQ("7", summary["machines"][1]["partitions"][0]["id"]);
}

TEST(FolderReader, UnknownStatusTextIsListedAsAFailureOfItsDocumentsKind) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + "1-A_S.status"),
                           "odd [1] - VPD Survey - something else\n");
    Json const summary = report::readSummaryFromFolder(folder.path());
    Json const& partition = summary["machines"][0]["partitions"][0];
    EXPECT_EQ("client_failure", partition["outcome"]);
    EXPECT_EQ("something else", partition["status_text"]);
    EXPECT_EQ("8", partition["return_code"]);
}

TEST(FolderReader, HostWithSeparatorsSplitsAtTheLastOnes) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + "1-A_S.status"),
                           "x [y] - VPD Survey - z [10.0.0.1] - VPD Survey - Ok\n");
    Json const summary = report::readSummaryFromFolder(folder.path());
    Json const& partition = summary["machines"][0]["partitions"][0];
    EXPECT_EQ("x [y] - VPD Survey - z", partition["host"]);
    EXPECT_EQ("10.0.0.1", partition["ip"]);
    EXPECT_EQ("Ok", partition["status_text"]);
}

TEST(FolderReader, LinesThatAreNoStatusLinesAreSkipped) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + "1-A_S.status"),
                           "garbage\n\na [1] - VPD Survey - Ok\n");
    EXPECT_EQ(1U, report::readSummaryFromFolder(folder.path())["machines"][0]["partitions"].size());
}

TEST(FolderReader, BytesThatAreNotUtf8BecomeReplacementCharacters) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + "1-A_S.status"),
                           "h\xFFst [1] - VPD Survey - Ok\n");
    Json const summary = report::readSummaryFromFolder(folder.path());
    EXPECT_EQ("h\xEF\xBF\xBDst", summary["machines"][0]["partitions"][0]["host"]);
}

TEST(FolderReader, OtherFilesAndOrphanDocumentsAreIgnored) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file("notes.txt"), "x");
    QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + "9-Z_Q-1.VPD.xml"),
                           fetchedDocument("z"));
    fs::create_directory(folder.file(std::string(gc_Prefix) + "dir.status"));
    Json const summary = report::readSummaryFromFolder(folder.path());
    EXPECT_EQ(0U, summary["machines"].size());
    EXPECT_EQ("8", summary["return_code"]);
}

// The message of the failure reading folder throws.
std::string failureReading(std::string const& folder) {
    try {
        report::readSummaryFromFolder(folder);
    } catch (util::SystemError const& failure) {
        return failure.what();
    }
    return "(read)";
}

TEST(FolderReader, MissingFolderOrAFileIsAFailureNamingItAndItsCause) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file("file"), "x");
    EXPECT_EQ("cannot read " + folder.file("missing") + ": No such file or directory",
              failureReading(folder.file("missing")));
    EXPECT_EQ("cannot read " + folder.file("file") + ": Not a directory",
              failureReading(folder.file("file")));
}

TEST(FolderReader, EmptyFolderGivesNoMachine) {
    QuorvexTest::TemporaryDirectory folder;
    EXPECT_EQ(0U, report::readSummaryFromFolder(folder.path())["machines"].size());
}

TEST(FolderReader, SurveyedPartitionWhoseDocumentNamesNoHostGetsTheIdOfItsFileName) {
    QuorvexTest::TemporaryDirectory folder;
    copyRun("worked-run", folder);
    Json const summary = report::readSummaryFromFolder(folder.path());
    Json const& partitions = summary["machines"][0]["partitions"];
    ASSERT_EQ(3U, partitions.size());
    EXPECT_EQ(nullptr, partitions[0]["id"]);
    EXPECT_EQ("2", partitions[1]["id"]);
    EXPECT_EQ(
        R"({"id":"3","host":"host3","ip":"10.1.1.13","active_status":null,)"
        R"("outcome":"surveyed","status_text":"Ok","return_code":"0","rc":null,)"
        R"("rc_cmd":null,)"
        R"("document":"VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE-3.VPD.xml",)"
        R"("reason":null,"seconds":null})",
        partitions[2].dump());
}

TEST(FolderReader, EmptyHostNameInTheDocumentNamesNoHost) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + "1-A_S.status"),
                           "aurora [10.0.0.1] - VPD Survey - Ok\n");
    QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + "1-A_S-12.VPD.xml"),
                           fetchedDocument(""));
    Json const summary = report::readSummaryFromFolder(folder.path());
    EXPECT_EQ("12", summary["machines"][0]["partitions"][0]["id"]);
}

TEST(FolderReader, SurveyedPartitionsWithDocumentsNamingNoHostGetNoIdWhenTheyCouldBeSwapped) {
    QuorvexTest::TemporaryDirectory folder;
    copyRun("all-surveyed", folder);
    Json const summary = report::readSummaryFromFolder(folder.path());
    Json const& partitions = summary["machines"][0]["partitions"];
    ASSERT_EQ(3U, partitions.size());
    for (Json const& partition : partitions) {
        EXPECT_EQ("surveyed", partition["outcome"]);
        EXPECT_EQ(nullptr, partition["id"]);
        EXPECT_EQ(nullptr, partition["document"]);
    }
}

TEST(FolderReader, DocumentNamingAHostNoLineListsIsNotTaken) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + "1-A_S.status"),
                           "aurora [10.0.0.1] - VPD Survey - Ok\n");
    QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + "1-A_S-4.VPD.xml"),
                           fetchedDocument("boreas"));
    Json const summary = report::readSummaryFromFolder(folder.path());
    EXPECT_EQ(nullptr, summary["machines"][0]["partitions"][0]["id"]);
    EXPECT_EQ(nullptr, summary["machines"][0]["partitions"][0]["document"]);
}

TEST(FolderReader, MachinesComeInIdentityOrder) {
    QuorvexTest::TemporaryDirectory folder;
    for (std::string const identity : {"9-Z_1", "1-A_2", "5-M_3"}) {
        QuorvexTest::writeFile(folder.file(std::string(gc_Prefix) + identity + ".status"),
                               "h [1] - VPD Survey - Ok\n");
    }
    Json const summary = report::readSummaryFromFolder(folder.path());
    EXPECT_EQ(R"(["1-A_2","5-M_3","9-Z_1"])", summary["options"]["identities"].dump());
    EXPECT_EQ("1-A_2", summary["machines"][0]["identity"]);
}

TEST(FolderReader, TraceOfTheMachineBesideTheVpdFolderIsNamed) {
    QuorvexTest::TemporaryDirectory root;
    fs::create_directories(root.file("VPD"));
    fs::create_directories(root.file("Trace"));
    QuorvexTest::writeFile(root.file("VPD/" + std::string(gc_Prefix) + "1-A_S.status"),
                           "h [1] - VPD Survey - Ok\n");
    QuorvexTest::writeFile(root.file("Trace/" + std::string(gc_Prefix) + "1-A_S.Trace"), "t");
    Json const summary = report::readSummaryFromFolder(root.file("VPD"));
    EXPECT_EQ(root.file("Trace/" + std::string(gc_Prefix) + "1-A_S.Trace"),
              summary["machines"][0]["trace_file"]);
}

TEST(FolderReader, AMachineWhoseTraceShowsAFailedListingIsListingFailed) {
    QuorvexTest::TemporaryDirectory root;
    fs::create_directories(root.file("VPD"));
    fs::create_directories(root.file("Trace"));
    for (char const* identity : {"1-A_S", "2-B_T"}) {
        QuorvexTest::writeFile(root.file("VPD/" + std::string(gc_Prefix) + identity + ".status"),
                               "No ACTIVE Partition Found.\n");
    }
    std::string const block = "PYLON_VPD_Survey_ClientPartition::main\n\n"
                              "****** ShellCommand::execute ******\n"
                              "/opt/vtc/bin/lspartition -ix -c 1-A_S > /tmp/a 2> /tmp/b\n";
    QuorvexTest::writeFile(root.file("Trace/" + std::string(gc_Prefix) + "1-A_S.Trace"),
                           block + "RC = 1\nSTDOUT\n\nSTDERR\nnot found\n\n\n\n");
    QuorvexTest::writeFile(root.file("Trace/" + std::string(gc_Prefix) + "2-B_T.Trace"),
                           block + "RC = 0\nSTDOUT\n\nSTDERR\n\n\n\n");
    Json const summary = report::readSummaryFromFolder(root.file("VPD"));
    EXPECT_EQ(R"({"command":"/opt/vtc/bin/lspartition -ix -c 1-A_S","exit_status":1,)"
              R"("message":"not found"})",
              summary["machines"][0]["listing_failure"].dump());
    EXPECT_FALSE(summary["machines"][1].contains("listing_failure"));
}

} // namespace
