#include "report/PartitionsCsv.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

namespace {

using Json = nlohmann::ordered_json;

constexpr char header[] = "machine,machine_return_code,partition_id,host,ip,active_status,outcome,"
                          "status_text,return_code,rc,rc_cmd,seconds,document,reason\r\n";

Json summaryWith(Json partition) {
    Json machine = {{"identity", "1234-ABC_10ABCDE"}, {"return_code", "8"}};
    machine["partitions"] = Json::array({std::move(partition)});
    Json summary;
    summary["machines"] = Json::array({std::move(machine)});
    return summary;
}

TEST(PartitionsCsv, HeaderAloneForNoMachines) {
    EXPECT_EQ(header, report::partitionsCsv(Json::object()));
    EXPECT_EQ(header, report::partitionsCsv(Json{{"machines", Json::array()}}));
}

TEST(PartitionsCsv, OneRowPerPartitionNullsEmpty) {
    Json const partition = {{"id", "3"},
                            {"host", "host3"},
                            {"ip", "10.1.1.13"},
                            {"active_status", "3"},
                            {"outcome", "surveyed"},
                            {"status_text", "Ok"},
                            {"return_code", "0"},
                            {"rc", nullptr},
                            {"rc_cmd", 0},
                            {"seconds", 1.5},
                            {"document", "VPD/x.VPD.xml"},
                            {"reason", nullptr}};
    EXPECT_EQ(std::string(header) +
                  "1234-ABC_10ABCDE,8,3,host3,10.1.1.13,3,surveyed,Ok,0,,0,1.5,VPD/x.VPD.xml,\r\n",
              report::partitionsCsv(summaryWith(partition)));
}

TEST(PartitionsCsv, QuotesFieldsWithCommaQuoteOrLineEnds) {
    Json const partition = {
        {"host", "a,b"}, {"ip", "say \"hi\""}, {"status_text", "x\ny"}, {"reason", "cr\r"}};
    EXPECT_EQ(std::string(header) +
                  "1234-ABC_10ABCDE,8,,\"a,b\",\"say \"\"hi\"\"\",,,\"x\ny\",,,,,,\"cr\r\"\r\n",
              report::partitionsCsv(summaryWith(partition)));
}

TEST(PartitionsCsv, MarkupStaysAsItIs) {
    Json const partition = {{"host", "<img src=x onerror=alert(1)>"}};
    EXPECT_NE(std::string::npos,
              report::partitionsCsv(summaryWith(partition)).find(",<img src=x onerror=alert(1)>,"));
}

TEST(PartitionsCsv, BytesThatAreNotUtf8AreReplaced) {
    Json const partition = {{"host", "h\xFE"}};
    EXPECT_NE(std::string::npos,
              report::partitionsCsv(summaryWith(partition)).find(",h\xEF\xBF\xBD,"));
}

Json const gc_Failure = {{"command", "/opt/vtc/bin/lspartition -ix -c 1-A_B"},
                         {"exit_status", 1},
                         {"message", "managed system not found, really"}};

TEST(PartitionsCsv, AMachineWhoseListingFailedHasARowSayingListingFailed) {
    Json summary = summaryWith(Json::object());
    summary["machines"][0]["partitions"] = Json::array();
    summary["machines"][0]["listing_failure"] = gc_Failure;
    EXPECT_EQ(std::string(header) +
                  "1234-ABC_10ABCDE,8,,,,,listing_failed,,,,,,,\"/opt/vtc/bin/lspartition -ix -c "
                  "1-A_B exited with status 1: managed system not found, really\"\r\n",
              report::partitionsCsv(summary));
}

TEST(PartitionsCsv, ARunWhoseMachineListingFailedHasOneRowWithoutMachine) {
    Json const summary = {{"machines", Json::array()},
                          {"listing_failure",
                           {{"command", "/opt/lsvtc/bin/lsvtc -t0"},
                            {"exit_status", nullptr},
                            {"message", "stopped after the time limit of 1 s"}}}};
    EXPECT_EQ(std::string(header) + ",,,,,,listing_failed,,,,,,,/opt/lsvtc/bin/lsvtc -t0: "
                                    "stopped after the time limit of 1 s\r\n",
              report::partitionsCsv(summary));
}

// Without history the CSV is what it was before the history existed.
TEST(PartitionsCsv, CsvWithoutHistoryIsTheCsvOfBefore) {
    Json const partition = {{"id", "3"},
                            {"host", "host3"},
                            {"ip", "10.1.1.13"},
                            {"outcome", "channel_failure"},
                            {"status_text", "RELAY Failed, rc = 1"},
                            {"return_code", "8"},
                            {"reason", "why,\n\"so\""}};
    EXPECT_TRUE(QuorvexTest::matchesExpectedFile(
        report::partitionsCsv(summaryWith(partition)),
        QuorvexTest::expectedOutputFile("report/partitions-without-history.csv")));
}

} // namespace
