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

} // namespace
