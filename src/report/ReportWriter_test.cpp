#include "report/ReportWriter.h"

#include "report/FolderReader.h"
#include "report/PartitionsCsv.h"
#include "report/RunSummary.h"
#include "utility/SystemError.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <filesystem>
#include <regex>
#include <vector>

namespace {

namespace fs = std::filesystem;
using Json = nlohmann::ordered_json;

TEST(ReportWriter, WritesThePageTheCsvAndTheSummaryIntoANewFolder) {
    QuorvexTest::TemporaryDirectory root;
    fs::create_directories(root.file("VPD"));
    QuorvexTest::writeFile(root.file("VPD/quorvexPYLON_VPD_Survey_ClientPartition_1-A_S.status"),
                           "h [1] - VPD Survey - Ok\n");
    Json const summary = report::readSummaryFromFolder(root.file("VPD"));
    report::writeReport(summary, root.file("VPD"), root.file("report/today"));
    EXPECT_EQ(report::summaryText(summary),
              QuorvexTest::readFile(root.file("report/today/summary.json")));
    EXPECT_EQ(report::partitionsCsv(summary),
              QuorvexTest::readFile(root.file("report/today/partitions.csv")));
    EXPECT_TRUE(QuorvexTest::fileExists(root.file("report/today/index.html")));
    EXPECT_EQ(3, std::distance(fs::directory_iterator(root.file("report/today")),
                               fs::directory_iterator()));
}

TEST(ReportWriter, PageLinksDocumentsRelativeToTheReportFolder) {
    QuorvexTest::TemporaryDirectory root;
    fs::create_directories(root.file("VPD"));
    Json summary;
    summary["machines"] =
        Json::array({{{"identity", "1-A_S"},
                      {"partitions",
                       Json::array({{{"outcome", "surveyed"}, {"document", "VPD/d.VPD.xml"}}})}}});
    report::writeReport(summary, root.file("VPD"), root.file("out/report"));
    EXPECT_NE(std::string::npos, QuorvexTest::readFile(root.file("out/report/index.html"))
                                     .find("<a href=\"../../VPD/d.VPD.xml\">"));
}

TEST(ReportWriter, FolderUnderARegularFileThrowsCreateWithThePathAndEnotdir) {
    QuorvexTest::TemporaryDirectory root;
    QuorvexTest::writeFile(root.file("file"), "x");
    std::string const folder = root.file("file/report");
    auto const error = QuorvexTest::thrownBy<util::SystemError>(
        [&] { report::writeReport(Json::object(), root.path(), folder); });
    ASSERT_TRUE(error);
    EXPECT_EQ(ENOTDIR, error->errorNumber());
    EXPECT_EQ("cannot create " + folder + ": Not a directory", std::string(error->what()));
}

Json startedAt(std::string const& started) {
    Json summary;
    summary["started"] = started;
    summary["machines"] = Json::array();
    return summary;
}

TEST(ReportWriter, APreviousReportIsKeptUnderTheTimeItsRunStarted) {
    QuorvexTest::TemporaryDirectory root;
    report::writeReport(startedAt("2026-11-24T10:00:00+01:00"), root.file("VPD"),
                        root.file("report"));
    std::string const firstPage = QuorvexTest::readFile(root.file("report/index.html"));
    report::writeReport(startedAt("2026-11-24T11:00:00+01:00"), root.file("VPD"),
                        root.file("report"));
    EXPECT_EQ(firstPage,
              QuorvexTest::readFile(root.file("report/index-2026-11-24T100000+0100.html")));
    EXPECT_TRUE(QuorvexTest::fileExists(root.file("report/partitions-2026-11-24T100000+0100.csv")));
    EXPECT_NE(std::string::npos,
              QuorvexTest::readFile(root.file("report/summary-2026-11-24T100000+0100.json"))
                  .find("10:00:00"));
    EXPECT_NE(std::string::npos,
              QuorvexTest::readFile(root.file("report/summary.json")).find("11:00:00"));
    EXPECT_EQ(6,
              std::distance(fs::directory_iterator(root.file("report")), fs::directory_iterator()));
}

TEST(ReportWriter, TwoKeptReportsOfOneRunTimeAreNumberedNeverReplaced) {
    QuorvexTest::TemporaryDirectory root;
    for (int run = 0; run < 3; ++run) {
        report::writeReport(startedAt("2026-11-24T10:00:00Z"), root.file("VPD"),
                            root.file("report"));
    }
    EXPECT_TRUE(QuorvexTest::fileExists(root.file("report/index-2026-11-24T100000Z.html")));
    EXPECT_TRUE(QuorvexTest::fileExists(root.file("report/index-2026-11-24T100000Z-2.html")));
    EXPECT_EQ(9,
              std::distance(fs::directory_iterator(root.file("report")), fs::directory_iterator()));
}

TEST(ReportWriter, APreviousPageWithoutSummaryIsKeptUnderItsModificationTime) {
    QuorvexTest::TemporaryDirectory root;
    fs::create_directories(root.file("report"));
    QuorvexTest::writeFile(root.file("report/index.html"), "old page");
    report::writeReport(startedAt("2026-11-24T11:00:00Z"), root.file("VPD"), root.file("report"));
    std::vector<std::string> kept;
    for (auto const& entry : fs::directory_iterator(root.file("report"))) {
        if (QuorvexTest::readFile(entry.path().string()) == "old page") {
            kept.push_back(entry.path().filename().string());
        }
    }
    ASSERT_EQ(kept.size(), 1U);
    EXPECT_TRUE(
        std::regex_match(kept.front(), std::regex(R"(index-\d{4}-\d\d-\d\dT\d{6}[-+]\d{4}\.html)")))
        << kept.front();
}

} // namespace
