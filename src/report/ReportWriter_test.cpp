#include "report/ReportWriter.h"

#include "report/FolderReader.h"
#include "report/PartitionsCsv.h"
#include "report/RunSummary.h"
#include "utility/SystemError.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cerrno>
#include <filesystem>
#include <iterator>
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
    EXPECT_TRUE(fs::is_directory(root.file("report/today/documents")));
    EXPECT_EQ(4, std::distance(fs::directory_iterator(root.file("report/today")),
                               fs::directory_iterator()));
}

TEST(ReportWriter, PageLinksTheDocumentsCopiedBesideIt) {
    QuorvexTest::TemporaryDirectory root;
    fs::create_directories(root.file("VPD"));
    QuorvexTest::writeFile(root.file("VPD/d.VPD.xml"), "<d/>");
    Json summary;
    summary["machines"] =
        Json::array({{{"identity", "1-A_S"},
                      {"partitions",
                       Json::array({{{"outcome", "surveyed"}, {"document", "VPD/d.VPD.xml"}},
                                    {{"outcome", "surveyed"}, {"document", "VPD/e.VPD.xml"}}})}}});
    report::writeReport(summary, root.file("VPD"), root.file("out/report"));
    std::string const page = QuorvexTest::readFile(root.file("out/report/index.html"));
    EXPECT_NE(std::string::npos, page.find("<a href=\"documents/d.VPD.xml\">"));
    EXPECT_EQ(std::string::npos, page.find("e.VPD.xml"));
    EXPECT_EQ("<d/>", QuorvexTest::readFile(root.file("out/report/documents/d.VPD.xml")));
}

TEST(ReportWriter, DocumentsFolderThatIsAFileThrowsCreateWithItsPath) {
    QuorvexTest::TemporaryDirectory root;
    fs::create_directories(root.file("report"));
    QuorvexTest::writeFile(root.file("report/documents"), "x");
    auto const error = QuorvexTest::thrownBy<util::SystemError>(
        [&] { report::writeReport(Json::object(), root.path(), root.file("report")); });
    ASSERT_TRUE(error);
    EXPECT_EQ(ENOTDIR, error->errorNumber());
    EXPECT_EQ("create", error->operation());
    EXPECT_EQ(root.file("report") + "/documents", error->object());
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
    // Three files of each report, and the documents' folder.
    EXPECT_EQ(7,
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
    EXPECT_EQ(10,
              std::distance(fs::directory_iterator(root.file("report")), fs::directory_iterator()));
}

TEST(ReportWriter, APreviousPageWithoutSummaryIsKeptUnderItsModificationTime) {
    QuorvexTest::TemporaryDirectory root;
    fs::create_directories(root.file("report"));
    QuorvexTest::writeFile(root.file("report/index.html"), "old page");
    report::writeReport(startedAt("2026-11-24T11:00:00Z"), root.file("VPD"), root.file("report"));
    std::vector<std::string> const names = QuorvexTest::listFolder(root.file("report"));
    std::vector<std::string> kept;
    std::copy_if(names.begin(), names.end(), std::back_inserter(kept),
                 [](std::string const& name) { return name.rfind("index-", 0) == 0; });
    ASSERT_EQ(kept.size(), 1U);
    EXPECT_EQ(QuorvexTest::readFile(root.file("report/" + kept.front())), "old page");
    EXPECT_TRUE(
        std::regex_match(kept.front(), std::regex(R"(index-\d{4}-\d\d-\d\dT\d{6}[-+]\d{4}\.html)")))
        << kept.front();
}

} // namespace
