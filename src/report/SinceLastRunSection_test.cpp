#include "report/SinceLastRunSection.h"

#include "report/PartitionsCsv.h"
#include "report/ReportPage.h"
#include "report/SinceLastRunReader.h"

#include <gtest/gtest.h>

namespace {

using report::SinceLastRun;
using Json = nlohmann::ordered_json;

constexpr char gc_Previous[] = "2026-11-22T08:00:00+01:00";
constexpr char gc_Since[] = "2026-11-20T08:00:00+01:00";

SinceLastRun compared() {
    SinceLastRun since;
    since.runId = 4;
    since.previousRunId = 3;
    since.previousStarted = gc_Previous;
    return since;
}

SinceLastRun::PartitionChange change(std::string const& partition, std::string const& outcome) {
    return {"9119-MHE_21ABCDE", partition, outcome, "", std::nullopt, 0};
}

std::size_t at(std::string const& text, std::string const& what) {
    std::size_t const found = text.find(what);
    EXPECT_NE(std::string::npos, found) << what;
    return found;
}

TEST(SinceLastRunSection, FirstRecordedRunSaysThereIsNothingToCompare) {
    SinceLastRun since;
    EXPECT_EQ("<section id=\"since-last-run\">\n<h2>Since the last run</h2>\n<p "
              "class=\"history-state\"><b>First recorded run</b> of this console: nothing to "
              "compare.</p>\n</section>\n",
              report::sinceLastRunSection(since));
}

TEST(SinceLastRunSection, HistoryNotRecordedSaysWhy) {
    std::string const section =
        report::sinceLastRunSection(report::historyNotRecorded("cannot write <db>: Disk full"));
    EXPECT_NE(std::string::npos,
              section.find("<b>History not recorded</b>: cannot write &lt;db&gt;: Disk full. What "
                           "changed cannot be shown."));
    EXPECT_FALSE(report::hasHistoryColumns(report::historyNotRecorded("x")));
}

TEST(SinceLastRunSection, CountsOfEveryKindComeBeforeTheLists) {
    SinceLastRun since = compared();
    since.newFailures = {change("a", "channel_failure")};
    since.recoveries = {change("b", "surveyed"), change("c", "surveyed")};
    std::string const section = report::sinceLastRunSection(since);
    EXPECT_NE(std::string::npos,
              section.find("Compared with the run started <time "
                           "datetime=\"2026-11-22T08:00:00+01:00\">Sun 22 Nov 2026 08:00:00 "
                           "UTC+01:00</time>."));
    std::size_t const counts = at(section, "<ul class=\"change-counts\">");
    at(section, "<li><b>1</b><a href=\"#new-failures\">New failures</a></li>");
    at(section, "<li><b>2</b><a href=\"#recoveries\">Recovered</a></li>");
    at(section, "<li class=\"none\"><b>0</b>Still failing</li>");
    at(section, "<li class=\"none\"><b>0</b>Machines disappeared</li>");
    std::size_t const list = at(section, "<h3 id=\"new-failures\">New failures</h3>");
    EXPECT_LT(counts, list);
    EXPECT_LT(list, at(section, "<h3 id=\"recoveries\">Recovered</h3>"));
    EXPECT_EQ(std::string::npos, section.find("<h3 id=\"still-failing\">"));
}

TEST(SinceLastRunSection, StillFailingSaysSinceWhenAndForHowManyRuns) {
    SinceLastRun since = compared();
    SinceLastRun::PartitionChange still = change("<b>x", "fetch_failure");
    still.failingSince = gc_Since;
    still.runsFailing = 3;
    still.reason = "file not found\n  second line\n\n";
    since.stillFailing = {still};
    EXPECT_NE(std::string::npos,
              report::sinceLastRunSection(since).find(
                  "<li><b>&lt;b&gt;x</b> on <span class=\"machine-name\">9119-MHE_21ABCDE</span>: "
                  "<span class=\"outcome-name\"><span class=\"key f\"></span>fetch "
                  "failure</span>, failing since <time datetime=\"2026-11-20T08:00:00+01:00\">Fri "
                  "20 Nov 2026 08:00:00 UTC+01:00</time> (3 runs) &middot; <q>file not found "
                  "second line</q></li>"));
}

TEST(SinceLastRunSection, LongReasonIsCutBetweenCharactersWithAnEllipsis) {
    SinceLastRun since = compared();
    SinceLastRun::PartitionChange failure = change("a", "channel_failure");
    failure.reason = std::string(159, 'x') + "\xC3\xA9tail";
    since.newFailures = {failure};
    EXPECT_NE(std::string::npos, report::sinceLastRunSection(since).find(
                                     "<q>" + std::string(159, 'x') + "\u2026</q>"));
}

TEST(SinceLastRunSection, OutcomeTheTableLacksShowsItsName) {
    SinceLastRun since = compared();
    since.newFailures = {change("a", "teleported")};
    EXPECT_NE(std::string::npos,
              report::sinceLastRunSection(since).find("9119-MHE_21ABCDE</span>: teleported</li>"));
}

TEST(SinceLastRunSection, InventoryChangesShowOldAndNewValues) {
    SinceLastRun since = compared();
    since.inventoryChanges = {
        {"replaced", "M", "a", "U1-C3", "Ethernet adapter", "", "Y1", "Y2"},
        {"property_changed", "M", "a", "U1-C3", "Ethernet adapter", "FW", "1.0", "1.1"},
        {"added", "M", "a", "U1-C4", "", "", "", ""}};
    std::string const section = report::sinceLastRunSection(since);
    at(section, "<b>Ethernet adapter</b> (U1-C3) replaced, serial number <span "
                "class=\"old-value\">Y1</span> &rarr; <span class=\"new-value\">Y2</span></li>");
    at(section, "<b>Ethernet adapter</b> (U1-C3) FW <span class=\"old-value\">1.0</span> "
                "&rarr; <span class=\"new-value\">1.1</span></li>");
    at(section, "<b>U1-C4</b> added</li>");
}

TEST(SinceLastRunSection, LongListShowsItsFirstHundredAndHowManyMore) {
    SinceLastRun since = compared();
    for (int i = 0; i < 130; ++i) {
        since.partitionsAppeared.push_back(change("p" + std::to_string(i), "surveyed"));
    }
    std::string const section = report::sinceLastRunSection(since);
    EXPECT_NE(std::string::npos, section.find("<b>p99</b>"));
    EXPECT_EQ(std::string::npos, section.find("<b>p100</b>"));
    EXPECT_NE(std::string::npos, section.find("<li class=\"more\">and 30 more</li>"));
}

TEST(SinceLastRunSection, CellsGiveFailingSinceLastSurveyedAndTheStaleMark) {
    SinceLastRun since = compared();
    since.partitions[{"M", "a"}] = {gc_Since, gc_Previous, 3, true};
    since.partitions[{"M", "b"}] = {std::nullopt, std::nullopt, 1, false};
    EXPECT_EQ("<td><time datetime=\"2026-11-22T08:00:00+01:00\" title=\"Sun 22 Nov 2026 08:00:00 "
              "UTC+01:00\">2026-11-22 08:00</time> <b class=stale title=\"not surveyed for 3 "
              "runs in a row\">stale</b><td><time datetime=\"2026-11-20T08:00:00+01:00\" "
              "title=\"Fri 20 Nov 2026 08:00:00 UTC+01:00\">2026-11-20 08:00</time>",
              report::historyCells(since, "M", "a"));
    EXPECT_EQ("<td>never<td>", report::historyCells(since, "M", "b"));
    EXPECT_EQ("<td><td>", report::historyCells(since, "M", "unknown"));
}

Json summaryOf(Json partitions) {
    Json machine = {{"identity", "M"}, {"return_code", "4"}, {"counts", Json::object()}};
    machine["partitions"] = std::move(partitions);
    return {{"tool", "quorvex-survey"}, {"machines", Json::array({machine})}};
}

Json partition(std::string const& host, std::string const& outcome) {
    return {{"id", "1"}, {"host", host}, {"ip", "10.0.0.1"}, {"outcome", outcome}};
}

// A host listed twice on one machine is "<host> #2" in the history.
SinceLastRun historyOfTwins() {
    SinceLastRun since = compared();
    since.partitions[{"M", "twin"}] = {gc_Since, std::nullopt, 2, false};
    since.partitions[{"M", "twin #2"}] = {std::nullopt, gc_Previous, 0, false};
    return since;
}

TEST(SinceLastRunSection, PageShowsTheSectionAboveTheTablesAndTheColumnsAfterOutcome) {
    Json const summary =
        summaryOf(Json::array({partition("twin", "timed_out"), partition("twin", "surveyed")}));
    std::string const html = report::reportPage(summary, {}, historyOfTwins());
    std::size_t const section = at(html, "<section id=\"since-last-run\">");
    EXPECT_LT(at(html, "<main>\n"), section);
    EXPECT_LT(section, at(html, "<section id=\"machines\">"));
    at(html, "<th data-column=\"outcome\">Outcome</th><th data-column=\"last-surveyed\">Last "
             "surveyed</th><th data-column=\"failing-since\">Failing since</th><th "
             "data-column=\"status\">");
    at(html, "<col class=\"outcome\"><col class=\"last-surveyed\"><col "
             "class=\"failing-since\"><col class=\"status\">");
    at(html, "<td class=outcome>timed out<td>never<td><time "
             "datetime=\"2026-11-20T08:00:00+01:00\"");
    at(html, "<td class=outcome>surveyed<td><time datetime=\"2026-11-22T08:00:00+01:00\"");
    at(html, ".stale {");
}

TEST(SinceLastRunSection, PageWhoseHistoryWasNotRecordedHasTheSectionButNoColumns) {
    std::string const html =
        report::reportPage(summaryOf(Json::array({partition("a", "surveyed")})), {},
                           report::historyNotRecorded("locked"));
    at(html, "<b>History not recorded</b>: locked.");
    EXPECT_EQ(std::string::npos, html.find("Failing since"));
}

TEST(SinceLastRunSection, CsvAppendsFailingSinceAndLastSurveyed) {
    Json const summary =
        summaryOf(Json::array({partition("twin", "timed_out"), partition("twin", "surveyed")}));
    std::string const csv = report::partitionsCsv(summary, historyOfTwins());
    EXPECT_EQ("machine,machine_return_code,partition_id,host,ip,active_status,outcome,"
              "status_text,return_code,rc,rc_cmd,seconds,document,reason,failing_since,"
              "last_surveyed\r\n"
              "M,4,1,twin,10.0.0.1,,timed_out,,,,,,,,2026-11-20T08:00:00+01:00,\r\n"
              "M,4,1,twin,10.0.0.1,,surveyed,,,,,,,,,2026-11-22T08:00:00+01:00\r\n",
              csv);
}

TEST(SinceLastRunSection, CsvListingFailureRowGetsEmptyHistoryFields) {
    Json summary = summaryOf(Json::array());
    summary["machines"][0]["listing_failure"] = {
        {"command", "lspartition"}, {"exit_status", 1}, {"message", "not found"}};
    std::string const csv = report::partitionsCsv(summary, compared());
    EXPECT_NE(std::string::npos,
              csv.find("\r\nM,4,,,,,listing_failed,,,,,,,lspartition exited with status 1: not "
                       "found,,\r\n"));
}

} // namespace
