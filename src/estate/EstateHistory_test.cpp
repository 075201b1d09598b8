#include "estate/EstateCommand.h"

#include "QuorvexTest.h"

#include <SQLiteCpp/SQLiteCpp.h>
#include <nlohmann/json.hpp>

#include <gtest/gtest.h>

#include <algorithm>
#include <sstream>

namespace {

using QuorvexTest::CollectFolder;

struct Ending {
    int status;
    std::string errors;
    nlohmann::json estate;
};

Ending runEstate(std::string const& collectFolder, std::string const& reportFolder,
                 std::string const& historyFile) {
    std::ostringstream out;
    std::ostringstream errors;
    int const status =
        estate::runEstateSubcommand({collectFolder, reportFolder, historyFile}, out, errors);
    std::string const document = QuorvexTest::readFile(reportFolder + "/estate.json");
    return {status, errors.str(), nlohmann::json::parse(document, nullptr, false)};
}

// A summary of host's run started at the given minute past 17:00, its
// partitions as given.
std::string summaryOf(std::string const& host, std::string const& minute,
                      std::vector<std::string> const& partitions) {
    std::string summary = CollectFolder::summary(partitions);
    summary.replace(summary.find("pylon.example"), 13, host);
    summary.replace(summary.find("17:55:00"), 8, "17:" + minute + ":00");
    return summary;
}

// Consoles a and b collected, down unreachable; a's partition h1 ends with
// outcome.
void layDownEstate(CollectFolder const& folder, std::string const& minute,
                   std::string const& outcome) {
    folder.addBundle(
        "a",
        summaryOf("a.example", minute, {CollectFolder::partition("1", "h1", outcome, "no answer")}),
        {"h1.VPD.xml"});
    folder.addBundle(
        "b", summaryOf("b.example", minute, {CollectFolder::partition("1", "h2", "surveyed")}),
        {"h2.VPD.xml"});
    folder.writeRecords(CollectFolder::records(
        {CollectFolder::record("a", "collected", true, "null", "0"),
         CollectFolder::record("b", "collected", true, "null", "0"),
         CollectFolder::record("down", "unreachable", false, "\"Connection refused\"")}));
}

std::vector<std::string> recordedConsoles(std::string const& historyFile) {
    SQLite::Database database(historyFile, SQLite::OPEN_READONLY);
    SQLite::Statement query(database, "SELECT console FROM runs ORDER BY id");
    std::vector<std::string> consoles;
    while (query.executeStep()) {
        consoles.push_back(query.getColumn(0).getString());
    }
    return consoles;
}

// The console's entry of estate.json by its inventory name.
nlohmann::json const& consoleEntry(nlohmann::json const& estate, std::string const& name) {
    nlohmann::json const& consoles = estate["consoles"];
    auto const found =
        std::find_if(consoles.begin(), consoles.end(),
                     [&name](nlohmann::json const& console) { return console["console"] == name; });
    if (found != consoles.end()) {
        return *found;
    }
    throw std::runtime_error("no console " + name + " in estate.json");
}

TEST(EstateHistory, EachCollectedConsolesRunIsRecordedOnceByItsInventoryName) {
    CollectFolder const folder;
    layDownEstate(folder, "55", "surveyed");
    QuorvexTest::TemporaryDirectory const work;
    Ending const ending = runEstate(folder.path(), work.file("report"), work.file("h.sqlite"));
    EXPECT_EQ(0, ending.status) << ending.errors;
    EXPECT_EQ((std::vector<std::string>{"a", "b"}), recordedConsoles(work.file("h.sqlite")));
    nlohmann::json const& a = consoleEntry(ending.estate, "a")["since_last_run"];
    EXPECT_EQ(1, a["run_id"]);
    EXPECT_TRUE(a["previous_run_id"].is_null());
    EXPECT_TRUE(a["error"].is_null());
    EXPECT_TRUE(consoleEntry(ending.estate, "down")["since_last_run"].is_null());
}

// The history keeps the summary saying where it is recorded; the console's
// own report keeps the bundle's summary as it came.
TEST(EstateHistory, HistoryKeepsTheSummaryWithItsHistoryMemberAndTheReportTheBundlesOwn) {
    CollectFolder const folder;
    layDownEstate(folder, "55", "surveyed");
    QuorvexTest::TemporaryDirectory const work;
    ASSERT_EQ(0, runEstate(folder.path(), work.file("report"), work.file("h.sqlite")).status);
    SQLite::Database database(work.file("h.sqlite"), SQLite::OPEN_READONLY);
    nlohmann::json const kept = nlohmann::json::parse(
        database.execAndGet("SELECT summary FROM runs WHERE console = 'a'").getString());
    EXPECT_EQ(work.file("h.sqlite"), kept["history"]["file"]);
    EXPECT_EQ(true, kept["history"]["recorded"]);
    nlohmann::json const bundled =
        nlohmann::json::parse(QuorvexTest::readFile(folder.path() + "/consoles/a/summary.json"));
    nlohmann::json const reported = nlohmann::json::parse(
        QuorvexTest::readFile(work.file("report") + "/consoles/a/summary.json"));
    EXPECT_EQ(bundled, reported);
    EXPECT_FALSE(reported.contains("history"));
}

TEST(EstateHistory, ConsolesOwnHistoryMemberStaysInItsReport) {
    CollectFolder const folder;
    std::string summary =
        summaryOf("a.example", "55", {CollectFolder::partition("1", "h1", "surveyed")});
    summary.replace(summary.find('{'), 1,
                    R"({"history": {"file": "/var/lib/quorvex-survey/history.sqlite",)"
                    R"( "run_id": 7, "recorded": true, "error": null}, )");
    folder.addBundle("a", summary, {"h1.VPD.xml"});
    folder.writeRecords(
        CollectFolder::records({CollectFolder::record("a", "collected", true, "null", "0")}));
    QuorvexTest::TemporaryDirectory const work;
    ASSERT_EQ(0, runEstate(folder.path(), work.file("report"), work.file("h.sqlite")).status);
    nlohmann::json const reported = nlohmann::json::parse(
        QuorvexTest::readFile(work.file("report") + "/consoles/a/summary.json"));
    EXPECT_EQ(7, reported["history"]["run_id"]);
    EXPECT_EQ(nlohmann::json::parse(summary), reported);
}

TEST(EstateHistory, TheSameBundlesMergedAgainRecordNothingNew) {
    CollectFolder const folder;
    layDownEstate(folder, "55", "surveyed");
    QuorvexTest::TemporaryDirectory const work;
    ASSERT_EQ(0, runEstate(folder.path(), work.file("first"), work.file("h.sqlite")).status);
    Ending const again = runEstate(folder.path(), work.file("again"), work.file("h.sqlite"));
    EXPECT_EQ(0, again.status) << again.errors;
    EXPECT_EQ(2U, recordedConsoles(work.file("h.sqlite")).size());
    EXPECT_EQ(1, consoleEntry(again.estate, "a")["since_last_run"]["run_id"]);
    EXPECT_EQ(2, consoleEntry(again.estate, "b")["since_last_run"]["run_id"]);
}

TEST(EstateHistory, ASecondCollectionShowsEachConsolesChangesSinceItsOwnLastRun) {
    CollectFolder const first;
    layDownEstate(first, "55", "surveyed");
    CollectFolder const second;
    layDownEstate(second, "59", "client_failure");
    QuorvexTest::TemporaryDirectory const work;
    ASSERT_EQ(0, runEstate(first.path(), work.file("first"), work.file("h.sqlite")).status);
    Ending const ending = runEstate(second.path(), work.file("second"), work.file("h.sqlite"));
    EXPECT_EQ(0, ending.status) << ending.errors;
    nlohmann::json const& a = consoleEntry(ending.estate, "a")["since_last_run"];
    EXPECT_EQ(3, a["run_id"]);
    EXPECT_EQ(1, a["previous_run_id"]);
    EXPECT_EQ(1, a["new_failures"]);
    nlohmann::json const& b = consoleEntry(ending.estate, "b")["since_last_run"];
    EXPECT_EQ(2, b["previous_run_id"]);
    EXPECT_EQ(0, b["new_failures"]);
    std::string const page = QuorvexTest::readFile(work.file("second/index.html"));
    EXPECT_NE(std::string::npos,
              page.find("1 new failure, 0 recoveries, 0 inventory changes</td>"));
    EXPECT_NE(std::string::npos,
              QuorvexTest::readFile(work.file("second/consoles/a/index.html")).find("h1"));
}

TEST(EstateHistory, AStaleConsoleIsRecordedAndAToolErrorIsNot) {
    CollectFolder const folder;
    folder.addBundle(
        "old", summaryOf("old.example", "10", {CollectFolder::partition("1", "h1", "surveyed")}));
    folder.addBundle("failed", summaryOf("failed.example", "10",
                                         {CollectFolder::partition("1", "h1", "surveyed")}));
    folder.writeRecords(CollectFolder::records(
        {CollectFolder::record("old", "stale", true, "\"older than 1 h\"", "0", "7200"),
         CollectFolder::record("failed", "tool_error", true, "\"killed\"", "137")}));
    QuorvexTest::TemporaryDirectory const work;
    Ending const ending = runEstate(folder.path(), work.file("report"), work.file("h.sqlite"));
    EXPECT_EQ(0, ending.status) << ending.errors;
    EXPECT_EQ(std::vector<std::string>{"old"}, recordedConsoles(work.file("h.sqlite")));
    EXPECT_TRUE(consoleEntry(ending.estate, "failed")["since_last_run"].is_null());
}

TEST(EstateHistory, NoHistoryRecordsNothingAndShowsNoChanges) {
    CollectFolder const folder;
    layDownEstate(folder, "55", "surveyed");
    QuorvexTest::TemporaryDirectory const work;
    Ending const ending = runEstate(folder.path(), work.file("report"), "");
    EXPECT_EQ(0, ending.status) << ending.errors;
    EXPECT_TRUE(consoleEntry(ending.estate, "a")["since_last_run"].is_null());
    EXPECT_FALSE(QuorvexTest::fileExists(work.file("h.sqlite")));
}

TEST(EstateHistory, AHistoryThatCannotBeWrittenIsExit74WithEveryOutputWritten) {
    CollectFolder const folder;
    layDownEstate(folder, "55", "surveyed");
    QuorvexTest::TemporaryDirectory const work;
    QuorvexTest::writeFile(work.file("file"), "");
    Ending const ending = runEstate(folder.path(), work.file("report"), work.file("file/h.sqlite"));
    EXPECT_EQ(estate::gc_ExitHistoryNotRecorded, ending.status);
    std::string const cause = "cannot create " + work.file("file") + ": Not a directory\n";
    EXPECT_EQ("quorvex-survey: estate: console down: unreachable: Connection refused\n"
              "quorvex-survey: estate: cannot record console a's run in " +
                  work.file("file/h.sqlite") + ": " + cause +
                  "quorvex-survey: estate: cannot record console b's run in " +
                  work.file("file/h.sqlite") + ": " + cause,
              ending.errors);
    EXPECT_FALSE(consoleEntry(ending.estate, "a")["since_last_run"]["error"].is_null());
    for (char const* name : {"index.html", "estate.csv", "consoles/a/index.html"}) {
        EXPECT_TRUE(QuorvexTest::fileExists(work.file("report/") + name)) << name;
    }
}

TEST(EstateHistory, ASummaryTheHistoryCannotTakeIsThatConsolesFailure) {
    CollectFolder const folder;
    folder.addBundle(
        "odd", summaryOf("odd.example", "10", {CollectFolder::partition("1", "h1", "vanished")}));
    folder.writeRecords(
        CollectFolder::records({CollectFolder::record("odd", "collected", true, "null", "0")}));
    QuorvexTest::TemporaryDirectory const work;
    Ending const ending = runEstate(folder.path(), work.file("report"), work.file("h.sqlite"));
    EXPECT_EQ(estate::gc_ExitHistoryNotRecorded, ending.status);
    EXPECT_EQ("quorvex-survey: estate: cannot record console odd's run in " +
                  work.file("h.sqlite") + ": the summary names an unknown outcome vanished\n",
              ending.errors);
}

// Consoles simulated on one machine, or a host name reused, report one
// console_host: each is still a console of its own.
TEST(EstateHistory, TwoConsolesReportingOneHostNameAreTwoConsoles) {
    CollectFolder const folder;
    for (char const* name : {"a", "b"}) {
        folder.addBundle(name, summaryOf("same.example", "10",
                                         {CollectFolder::partition("1", "h1", "surveyed")}));
    }
    folder.writeRecords(
        CollectFolder::records({CollectFolder::record("a", "collected", true, "null", "0"),
                                CollectFolder::record("b", "collected", true, "null", "0")}));
    QuorvexTest::TemporaryDirectory const work;
    ASSERT_EQ(0, runEstate(folder.path(), work.file("report"), work.file("h.sqlite")).status);
    EXPECT_EQ((std::vector<std::string>{"a", "b"}), recordedConsoles(work.file("h.sqlite")));
}

} // namespace
