#include "monitoring/JunitReport.h"

#include <gtest/gtest.h>

namespace {

using report::Outcome;

report::PartitionSummary partition(std::string host, Outcome outcome, double seconds) {
    report::PartitionSummary summary;
    summary.id = "7";
    summary.host = std::move(host);
    summary.outcome = outcome;
    summary.statusText = "VPD Survey - status";
    summary.seconds = seconds;
    return summary;
}

report::RunSummary emptyRun() {
    report::RunSummary summary;
    summary.tool = "quorvex-survey";
    summary.consoleHost = "hmc1";
    summary.started = "2026-11-24T13:32:10+00:00";
    summary.elapsedSeconds = 12.5;
    return summary;
}

report::MachineSummary machine(std::string identity,
                               std::vector<report::PartitionSummary> partitions) {
    report::MachineSummary summary;
    summary.identity = std::move(identity);
    summary.partitions = std::move(partitions);
    return summary;
}

TEST(JunitReport, EveryOutcomeHasItsCaseAndTheCountsAddUp) {
    report::RunSummary summary = emptyRun();
    report::PartitionSummary failed = partition("b", Outcome::ChannelFailure, 0.5);
    failed.reason = "runCmdOnPartition failed, Rc 1";
    report::PartitionSummary died = partition("e", Outcome::WorkerDied, 2);
    // A partition without host name goes by its identity.
    report::PartitionSummary nameless = partition("", Outcome::Surveyed, 0.25);
    summary.machines = {
        machine("9119-MHE_21ABCDE", {partition("a", Outcome::Surveyed, 1.25), failed,
                                     partition("c", Outcome::Inactive, 0),
                                     partition("d", Outcome::Interrupted, 0.125), died, nameless})};
    EXPECT_EQ(monitoring::junitText(summary),
              "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
              "<testsuites name=\"quorvex-survey\" tests=\"6\" failures=\"2\" errors=\"0\" "
              "skipped=\"2\" time=\"12.500\" timestamp=\"2026-11-24T13:32:10+00:00\">\n"
              "  <testsuite name=\"9119-MHE_21ABCDE\" tests=\"6\" failures=\"2\" errors=\"0\" "
              "skipped=\"2\" time=\"4.125\" hostname=\"hmc1\">\n"
              "    <testcase classname=\"9119-MHE_21ABCDE\" name=\"a\" time=\"1.250\" />\n"
              "    <testcase classname=\"9119-MHE_21ABCDE\" name=\"b\" time=\"0.500\">\n"
              "      <failure message=\"runCmdOnPartition failed, Rc 1\" "
              "type=\"channel_failure\">runCmdOnPartition failed, Rc 1</failure>\n"
              "    </testcase>\n"
              "    <testcase classname=\"9119-MHE_21ABCDE\" name=\"c\" time=\"0.000\">\n"
              "      <skipped message=\"inactive: VPD Survey - status\" />\n"
              "    </testcase>\n"
              "    <testcase classname=\"9119-MHE_21ABCDE\" name=\"d\" time=\"0.125\">\n"
              "      <skipped message=\"interrupted: VPD Survey - status\" />\n"
              "    </testcase>\n"
              "    <testcase classname=\"9119-MHE_21ABCDE\" name=\"e\" time=\"2.000\">\n"
              "      <failure message=\"VPD Survey - status\" type=\"worker_died\">VPD Survey - "
              "status</failure>\n"
              "    </testcase>\n"
              "    <testcase classname=\"9119-MHE_21ABCDE\" name=\"9119-MHE_21ABCDE-7\" "
              "time=\"0.250\" />\n"
              "  </testsuite>\n"
              "</testsuites>\n");
}

TEST(JunitReport, MachineWhoseListingFailedIsOneFailingCase) {
    report::RunSummary summary = emptyRun();
    summary.machines = {machine("8286-42A_10XYZ99", {})};
    summary.machines[0].listingFailure =
        report::ListingFailure{"/opt/vtc/bin/lspartition -ix -c x", 1, "managed system not found"};
    EXPECT_EQ(monitoring::junitText(summary),
              "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
              "<testsuites name=\"quorvex-survey\" tests=\"1\" failures=\"1\" errors=\"0\" "
              "skipped=\"0\" time=\"12.500\" timestamp=\"2026-11-24T13:32:10+00:00\">\n"
              "  <testsuite name=\"8286-42A_10XYZ99\" tests=\"1\" failures=\"1\" errors=\"0\" "
              "skipped=\"0\" time=\"0.000\" hostname=\"hmc1\">\n"
              "    <testcase classname=\"8286-42A_10XYZ99\" name=\"partition listing\" "
              "time=\"0.000\">\n"
              "      <failure message=\"/opt/vtc/bin/lspartition -ix -c x exited with status 1: "
              "managed system not found\" type=\"listing_failed\">/opt/vtc/bin/lspartition -ix "
              "-c x exited with status 1: managed system not found</failure>\n"
              "    </testcase>\n"
              "  </testsuite>\n"
              "</testsuites>\n");
}

TEST(JunitReport, ConsoleWhoseMachineListingFailedIsOneFailingSuite) {
    report::RunSummary summary = emptyRun();
    summary.listingFailure = report::ListingFailure{"/opt/lsvtc/bin/lsvtc -t0", 127, "not found"};
    EXPECT_EQ(monitoring::junitText(summary),
              "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
              "<testsuites name=\"quorvex-survey\" tests=\"1\" failures=\"1\" errors=\"0\" "
              "skipped=\"0\" time=\"12.500\" timestamp=\"2026-11-24T13:32:10+00:00\">\n"
              "  <testsuite name=\"machine listing\" tests=\"1\" failures=\"1\" errors=\"0\" "
              "skipped=\"0\" time=\"0.000\" hostname=\"hmc1\">\n"
              "    <testcase classname=\"machine listing\" name=\"hmc1\" time=\"0.000\">\n"
              "      <failure message=\"/opt/lsvtc/bin/lsvtc -t0 exited with status 127: not "
              "found\" type=\"listing_failed\">/opt/lsvtc/bin/lsvtc -t0 exited with status 127: "
              "not found</failure>\n"
              "    </testcase>\n"
              "  </testsuite>\n"
              "</testsuites>\n");
}

TEST(JunitReport, HostListedAgainOnTheMachineIsNumbered) {
    report::RunSummary summary = emptyRun();
    summary.machines = {
        machine("m", {partition("a", Outcome::Surveyed, 0), partition("a", Outcome::Surveyed, 0),
                      partition("a", Outcome::Surveyed, 0)})};
    std::string const text = monitoring::junitText(summary);
    EXPECT_NE(text.find("name=\"a\" "), std::string::npos) << text;
    EXPECT_NE(text.find("name=\"a #2\" "), std::string::npos) << text;
    EXPECT_NE(text.find("name=\"a #3\" "), std::string::npos) << text;
}

TEST(JunitReport, MarkupInNamesAndReasonsIsEscaped) {
    report::RunSummary summary = emptyRun();
    report::PartitionSummary failed = partition("<a&b \"c\" 'd'>", Outcome::ClientFailure, 0);
    failed.reason = "x < y & \"z\" > 'w' ]]>";
    summary.machines = {machine("m&<>", {failed})};
    std::string const text = monitoring::junitText(summary);
    // In a quoted attribute value, > and ' need no escape.
    EXPECT_NE(text.find("<testsuite name=\"m&amp;&lt;>\" "), std::string::npos) << text;
    EXPECT_NE(text.find("name=\"&lt;a&amp;b &quot;c&quot; 'd'>\" "), std::string::npos) << text;
    EXPECT_NE(text.find("<failure message=\"x &lt; y &amp; &quot;z&quot; > 'w' ]]>\" "
                        "type=\"client_failure\">x &lt; y &amp; \"z\" &gt; 'w' ]]&gt;</failure>"),
              std::string::npos)
        << text;
}

TEST(JunitReport, BytesThatAreNotUtf8AndControlCharactersBecomeReplacementCharacters) {
    report::RunSummary summary = emptyRun();
    report::PartitionSummary failed = partition("h\xC3\xA9\xFF", Outcome::ClientFailure, 0);
    failed.reason = std::string("a\x01"
                                "b\x00"
                                "c\td\x7f",
                                8);
    summary.machines = {machine("m", {failed})};
    std::string const text = monitoring::junitText(summary);
    EXPECT_NE(text.find("name=\"h\xC3\xA9\xEF\xBF\xBD\" "), std::string::npos) << text;
    EXPECT_NE(text.find("<failure message=\"a\xEF\xBF\xBD"
                        "b\xEF\xBF\xBD"
                        "c&#09;d\xEF\xBF\xBD\" "
                        "type=\"client_failure\">a\xEF\xBF\xBD"
                        "b\xEF\xBF\xBD"
                        "c\td\xEF\xBF\xBD</failure>"),
              std::string::npos)
        << text;
}

} // namespace
