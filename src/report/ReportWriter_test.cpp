#include "report/ReportWriter.h"

#include "report/FolderReader.h"
#include "report/PartitionsCsv.h"
#include "report/RunSummary.h"
#include "utility/SystemError.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <filesystem>

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

} // namespace
