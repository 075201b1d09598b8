#include "estate/EstateCommand.h"

#include "QuorvexTest.h"

#include <nlohmann/json.hpp>

#include <gtest/gtest.h>

#include <sstream>
#include <sys/stat.h>

namespace {

using QuorvexTest::CollectFolder;

struct Ending {
    int status;
    std::string out;
    std::string errors;
};

Ending runEstate(std::string const& collectFolder, std::string const& reportFolder) {
    std::ostringstream out;
    std::ostringstream errors;
    int const status = estate::runEstateSubcommand({collectFolder, reportFolder, ""}, out, errors);
    return {status, out.str(), errors.str()};
}

void layDownTwoConsoles(CollectFolder const& folder) {
    folder.addBundle("up",
                     CollectFolder::summary({CollectFolder::partition("1", "h1", "surveyed")}),
                     {"h1.VPD.xml"});
    folder.writeRecords(CollectFolder::records(
        {CollectFolder::record("up", "collected", true, "null", "0"),
         CollectFolder::record("down", "unreachable", false, "\"Connection refused\"")}));
}

TEST(EstateCommand, WritesTheEstateAndNamesEachConsoleNotCollected) {
    CollectFolder const folder;
    layDownTwoConsoles(folder);
    QuorvexTest::TemporaryDirectory const report;
    Ending const ending = runEstate(folder.path(), report.file("estate"));
    EXPECT_EQ(0, ending.status);
    EXPECT_EQ(report.file("estate") + "/index.html\n", ending.out);
    EXPECT_EQ("quorvex-survey: estate: console down: unreachable: Connection refused\n",
              ending.errors);
    for (char const* name : {"index.html", "estate.csv", "estate.json", "consoles/up/index.html",
                             "consoles/up/documents/h1.VPD.xml"}) {
        EXPECT_TRUE(QuorvexTest::fileExists(report.file("estate") + "/" + name)) << name;
    }
}

// A copy of each document, flushed one by one, would cost the estate one disk
// flush per partition.
TEST(EstateCommand, ConsolesDocumentIsLinkedToTheBundlesOwn) {
    CollectFolder const folder;
    layDownTwoConsoles(folder);
    QuorvexTest::TemporaryDirectory const report;
    ASSERT_EQ(0, runEstate(folder.path(), report.path()).status);
    struct stat bundled {};
    struct stat shown {};
    ASSERT_EQ(0, ::stat((folder.path() + "/consoles/up/VPD/h1.VPD.xml").c_str(), &bundled));
    ASSERT_EQ(0, ::stat(report.file("consoles/up/documents/h1.VPD.xml").c_str(), &shown));
    EXPECT_EQ(bundled.st_ino, shown.st_ino);
    EXPECT_EQ("<doc/>", QuorvexTest::readFile(report.file("consoles/up/documents/h1.VPD.xml")));
}

TEST(EstateCommand, EstateJsonListsEveryConsoleOnceWithItsRecord) {
    CollectFolder const folder;
    layDownTwoConsoles(folder);
    QuorvexTest::TemporaryDirectory const report;
    ASSERT_EQ(0, runEstate(folder.path(), report.path()).status);
    auto const document = nlohmann::json::parse(QuorvexTest::readFile(report.file("estate.json")));
    ASSERT_EQ(2U, document["consoles"].size());
    EXPECT_EQ("down", document["consoles"][0]["console"]);
    EXPECT_EQ("unreachable", document["consoles"][0]["record"]);
    EXPECT_TRUE(document["consoles"][0]["summary"].is_null());
    EXPECT_EQ("up", document["consoles"][1]["console"]);
    EXPECT_EQ("consoles/up/index.html", document["consoles"][1]["report"]);
    EXPECT_EQ("h1", document["consoles"][1]["summary"]["machines"][0]["partitions"][0]["host"]);
    EXPECT_EQ(1, document["totals"]["records"]["unreachable"]);
    EXPECT_EQ(1, document["totals"]["outcomes"]["surveyed"]);
}

TEST(EstateCommand, AnEstateWithoutConsolesHasTheCsvHeaderAlone) {
    CollectFolder const folder;
    folder.writeRecords(CollectFolder::records({}));
    QuorvexTest::TemporaryDirectory const report;
    Ending const ending = runEstate(folder.path(), report.file("estate"));
    EXPECT_EQ(0, ending.status) << ending.errors;
    EXPECT_EQ("console,record,record_message,console_host,machine,machine_return_code,"
              "partition_id,host,ip,active_status,outcome,status_text,return_code,rc,rc_cmd,"
              "seconds,document,reason\r\n",
              QuorvexTest::readFile(report.file("estate") + "/estate.csv"));
}

TEST(EstateCommand, AFolderWithoutRecordsIsExit66WritingNothing) {
    CollectFolder const folder;
    QuorvexTest::TemporaryDirectory const report;
    Ending const ending = runEstate(folder.path(), report.file("estate"));
    EXPECT_EQ(estate::gc_ExitNoRecords, ending.status);
    EXPECT_EQ("quorvex-survey: estate: cannot read " + folder.path() +
                  "/records.json: No such file or directory\n",
              ending.errors);
    EXPECT_FALSE(QuorvexTest::fileExists(report.file("estate")));
}

TEST(EstateCommand, MalformedRecordsAreExit65WritingNothing) {
    CollectFolder const folder;
    folder.writeRecords("not json");
    QuorvexTest::TemporaryDirectory const report;
    Ending const ending = runEstate(folder.path(), report.file("estate"));
    EXPECT_EQ(estate::gc_ExitMalformedRecords, ending.status);
    EXPECT_EQ("quorvex-survey: estate: " + folder.path() + "/records.json: not a JSON object\n",
              ending.errors);
    EXPECT_FALSE(QuorvexTest::fileExists(report.file("estate")));
}

TEST(EstateCommand, AReportFolderThatCannotBeMadeIsExit73) {
    CollectFolder const folder;
    layDownTwoConsoles(folder);
    QuorvexTest::TemporaryDirectory const report;
    QuorvexTest::writeFile(report.file("file"), "");
    Ending const ending = runEstate(folder.path(), report.file("file/estate"));
    EXPECT_EQ(73, ending.status);
    EXPECT_EQ("quorvex-survey: estate: cannot create " + report.file("file/estate") +
                  ": Not a directory\n",
              ending.errors);
}

} // namespace
