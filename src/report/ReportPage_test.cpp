#include "report/ReportPage.h"

#include "QuorvexTest.h"
#include "report/Outcome.h"
#include "report/PageAssets.h"
#include "report/PageSkeleton.h"

#include <gtest/gtest.h>

#include <regex>
#include <set>

namespace {

using Json = nlohmann::ordered_json;

Json partitionEntry(std::string const& id, std::string const& host, std::string const& outcome) {
    return {{"id", id},
            {"host", host},
            {"ip", "10.0.0." + id},
            {"active_status", nullptr},
            {"outcome", outcome},
            {"status_text", outcome == "surveyed" ? "Ok" : "RELAY Failed, rc = 1"},
            {"return_code", outcome == "surveyed" ? "0" : "8"},
            {"rc", nullptr},
            {"rc_cmd", nullptr},
            {"document", "VPD/quorvexPYLON_VPD_Survey_ClientPartition_1-A_S-" + id + ".VPD.xml"},
            {"reason", outcome == "surveyed" ? Json(nullptr) : Json("why <not> & \"so\"\n\n\n")},
            {"seconds", 2.46}};
}

Json summary(Json partitions) {
    Json counts = {{"partitions", partitions.size()},
                   {"surveyed", 1},
                   {"inactive", 0},
                   {"channel_failure", 1},
                   {"client_failure", 0},
                   {"fetch_failure", 0},
                   {"timed_out", 0},
                   {"interrupted", 0}};
    Json machine = {{"identity", "1-A_S"}, {"return_code", "4"}, {"counts", counts}};
    machine["partitions"] = std::move(partitions);
    Json totals = counts;
    totals["machines"] = 1;
    return {
        {"tool", "quorvex-survey"},
        {"version", "4.0.11"},
        {"console_host", "console<1>"},
        {"started", "2026-11-23T14:05:09+01:00"},
        {"ended", "2026-11-23T14:06:10+01:00"},
        {"elapsed_seconds", 61.04},
        {"options",
         {{"jobs", 8}, {"timeout_seconds", 1800}, {"all", true}, {"identities", Json::array()}}},
        {"interrupted", nullptr},
        {"return_code", "4"},
        {"totals", totals},
        {"machines", Json::array({machine})}};
}

// Every document named is linked, as though each had been copied.
std::set<std::string> documentsOf(Json const& partitions) {
    std::set<std::string> documents;
    for (Json const& partition : partitions) {
        documents.insert(partition["document"].get<std::string>());
    }
    return documents;
}

std::string page(Json const& partitions) {
    return report::reportPage(summary(partitions), documentsOf(partitions));
}

std::size_t occurrences(std::string const& text, std::string const& what) {
    std::size_t count = 0;
    for (auto at = text.find(what); at != std::string::npos; at = text.find(what, at + 1)) {
        ++count;
    }
    return count;
}

TEST(ReportPage, IsOneDocumentWithStyleAndScriptInlineAndNothingFetched) {
    std::string const html = page(Json::array({partitionEntry("1", "a", "surveyed")}));
    EXPECT_EQ(0U, html.find("<!DOCTYPE html>\n"));
    EXPECT_NE(std::string::npos, html.find("<style>"));
    EXPECT_NE(std::string::npos, html.find("<script>"));
    EXPECT_EQ(std::string::npos, html.find("src="));
    EXPECT_EQ(std::string::npos, html.find("http:"));
    EXPECT_EQ(std::string::npos, html.find("https:"));
    EXPECT_EQ(std::string::npos, html.find("<link"));
}

TEST(ReportPage, HeaderShowsConsoleTimesOptionsAndTotals) {
    std::string const html = page(Json::array({partitionEntry("1", "a", "surveyed")}));
    EXPECT_NE(std::string::npos, html.find("of console console&lt;1&gt;</span>"));
    EXPECT_NE(std::string::npos,
              html.find("Started <b><time datetime=\"2026-11-23T14:05:09+01:00\">Mon 23 Nov 2026 "
                        "14:05:09 UTC+01:00</time></b>, ended <b><time "
                        "datetime=\"2026-11-23T14:06:10+01:00\">Mon 23 Nov 2026 14:06:10 "
                        "UTC+01:00</time></b> (61.0&nbsp;s)"));
    EXPECT_NE(std::string::npos,
              html.find("<title>Partition survey of console&lt;1&gt;, Mon 23 Nov 2026 14:05:09 "
                        "UTC+01:00</title>"));
    EXPECT_NE(std::string::npos, html.find("options: <b class=\"options\"><span>-j 8</span> "
                                           "<span>-t 1800</span> <span>--all</span></b>"));
    EXPECT_NE(
        std::string::npos,
        html.find("<li class=\"c\" data-outcome=\"channel_failure\"><b>1</b>channel failure"));
}

TEST(ReportPage, HostNameMarkupShowsAsTextEverywhere) {
    std::string const html =
        page(Json::array({partitionEntry("1", "<img src=x onerror=alert(1)>", "channel_failure")}));
    EXPECT_EQ(std::string::npos, html.find("<img"));
    EXPECT_NE(std::string::npos, html.find("<td>&lt;img src=x onerror=alert(1)&gt;<td>"));
    EXPECT_NE(std::string::npos, html.find("<pre>why &lt;not&gt; &amp; &quot;so&quot;</pre>"));
}

TEST(ReportPage, OneRowPerPartitionWithOutcomeClassAndMachineAnchorOnTheFirst) {
    std::string const html = page(Json::array(
        {partitionEntry("1", "a", "surveyed"), partitionEntry("2", "b", "channel_failure")}));
    EXPECT_NE(std::string::npos,
              html.find("<tr id=m0 class=s><td>1-A_S<td class=number>1<td>a<td>10.0.0.1"
                        "<td class=outcome>surveyed<td>Ok<td class=number>2.5<td>"));
    EXPECT_NE(std::string::npos, html.find("<tr class=c><td>1-A_S<td class=number>2<td>b"));
    EXPECT_NE(std::string::npos, html.find("<a href=\"#m0\" data-machine=\"1-A_S\">1-A_S</a>"));
}

TEST(ReportPage, OutcomeTheTableLacksShowsAsUnknown) {
    std::string const html = page(Json::array({partitionEntry("1", "a", "teleported")}));
    EXPECT_NE(std::string::npos,
              html.find("<tr id=m0 class=u><td>1-A_S<td class=number>1<td>a<td>10.0.0.1"
                        "<td class=outcome>unknown<td>"));
}

TEST(ReportPage, FullTableIsInsideNoscriptForTheScriptToRead) {
    std::string const html = page(Json::array({partitionEntry("1", "a", "surveyed")}));
    std::size_t const start = html.find(R"(<noscript id="partition-rows"><table class="parts">)");
    std::size_t const row = html.find("<tr id=m0 class=s>");
    std::size_t const end = html.find("</tbody>\n</table></noscript>");
    EXPECT_LT(start, row);
    EXPECT_LT(row, end);
    EXPECT_NE(std::string::npos, end);
    EXPECT_LT(html.find("<div id=\"live-rows\"></div>"), start);
}

TEST(ReportPage, TimeThatIsNoIsoTimeShowsAsItIs) {
    Json odd = summary(Json::array());
    odd["started"] = "yesterday <noon>";
    std::string const html = report::reportPage(odd, {});
    EXPECT_NE(std::string::npos,
              html.find("Started <b><time datetime=\"yesterday &lt;noon&gt;\">yesterday "
                        "&lt;noon&gt;</time></b>"));
}

TEST(ReportPage, DocumentsLinkToTheirCopiesBesideThePage) {
    std::string const html = page(Json::array({partitionEntry("1", "a", "surveyed")}));
    EXPECT_NE(std::string::npos,
              html.find("<a href=\"documents/quorvexPYLON_VPD_Survey_ClientPartition_1-A_S-1.VPD."
                        "xml\">XML</a>"));
}

TEST(ReportPage, DocumentWithoutACopyHasNoLink) {
    Json const partitions = Json::array({partitionEntry("1", "a", "surveyed")});
    std::string const html = report::reportPage(summary(partitions), {});
    EXPECT_EQ(std::string::npos, html.find("XML</a>"));
    EXPECT_NE(std::string::npos, html.find("<td class=number>2.5<td><td>"));
}

TEST(ReportPage, DocumentLinkEncodesCharactersThatAreSpecialInUrls) {
    Json odd = partitionEntry("1", "a", "surveyed");
    odd["document"] = "VPD/x #?%\"<.VPD.xml";
    std::string const html = page(Json::array({odd}));
    EXPECT_NE(std::string::npos, html.find("href=\"documents/x%20%23%3F%25%22%3C.VPD.xml\""));
}

TEST(ReportPage, ReasonOnlyOnDemandAndOnlyForFailures) {
    std::string const html = page(Json::array(
        {partitionEntry("1", "a", "surveyed"), partitionEntry("2", "b", "channel_failure")}));
    EXPECT_EQ(1U, occurrences(html, "<details><summary>reason</summary>"));
}

TEST(ReportPage, MachineBarHasOneSegmentPerOutcomePresent) {
    std::string const html = page(Json::array(
        {partitionEntry("1", "a", "surveyed"), partitionEntry("2", "b", "channel_failure")}));
    EXPECT_NE(std::string::npos,
              html.find("<div class=\"bar\"><i class=\"s\" style=\"width:50.000%\" title=\"1 "
                        "surveyed\"></i><i class=\"c\" style=\"width:50.000%\" title=\"1 channel "
                        "failure\"></i></div><p class=\"counts\"><span><span class=\"key "
                        "s\"></span>1 surveyed</span> <span><span class=\"key c\"></span>1 "
                        "channel failure</span></p>"));
}

TEST(ReportPage, MachineWhoseListingFailedShowsTheConsolesMessageInPlaceOfCounts) {
    Json failed = summary(Json::array());
    failed["machines"][0]["listing_failure"] = {{"command", "/opt/vtc/bin/lspartition -ix -c X"},
                                                {"exit_status", 1},
                                                {"message", "managed system <not> found"}};
    std::string const html = report::reportPage(failed, {});
    EXPECT_NE(std::string::npos, html.find("<tr class=\"listing-failed\"><th scope=\"row\">1-A_S"));
    EXPECT_NE(std::string::npos,
              html.find("<div class=\"bar listing-failed\"></div><p class=\"counts\"><b>listing "
                        "failed</b>: /opt/vtc/bin/lspartition -ix -c X exited with status 1: "
                        "managed system &lt;not&gt; found</p>"));
}

TEST(ReportPage, MachineWithoutListingFailureHasCountsAndNoMark) {
    Json listed = summary(Json::array());
    listed["machines"][0]["listing_failure"] = nullptr;
    std::string const html = report::reportPage(listed, {});
    EXPECT_EQ(std::string::npos, html.find("<tr class=\"listing-failed\">"));
    EXPECT_EQ(std::string::npos, html.find("<div class=\"bar listing-failed\">"));
    EXPECT_NE(std::string::npos, html.find("<tr><th scope=\"row\">1-A_S"));
}

TEST(ReportPage, SummaryWithFieldsMissingStillGivesAPage) {
    std::string const html = report::reportPage(Json::object(), {});
    EXPECT_NE(std::string::npos, html.find("</html>"));
    EXPECT_NE(std::string::npos, html.find("read from the files earlier runs left"));
}

TEST(ReportPage, EveryPlaceholderOfTheSkeletonIsFilled) {
    std::string const full = page(Json::array({partitionEntry("1", "a", "surveyed")}));
    std::string const empty = report::reportPage(Json::object(), {});
    EXPECT_FALSE(report::placeholderNames(report::gc_PageSkeleton).empty());
    EXPECT_EQ(std::string::npos, full.find("<!--{{"));
    EXPECT_EQ(std::string::npos, empty.find("<!--{{"));
}

TEST(ReportPage, StyleAndScriptAreTheEmbeddedPageFiles) {
    std::string const html = page(Json::array({partitionEntry("1", "a", "surveyed")}));
    EXPECT_NE(std::string::npos,
              html.find("<style>" + std::string(report::gc_PageStyle) + "</style>"));
    EXPECT_NE(std::string::npos,
              html.find("<script>" + std::string(report::gc_PageScript) + "</script>"));
}

// The outcome table gives each outcome its page class; the style sheet gives
// the class its colour. A new outcome, or a renamed class, without its rule
// would show uncoloured.
TEST(ReportPage, StyleSheetGivesEveryOutcomesPageClassItsColour) {
    std::string const style(report::gc_PageStyle);
    for (report::OutcomeText const& outcome : report::outcomeTable()) {
        std::regex const rule(std::string(R"((^|[\s,}])\.)") + outcome.pageClass +
                              R"(\s*\{[^}]*--outcome-colour\s*:\s*#[0-9a-fA-F]{3,6}\s*;)");
        EXPECT_TRUE(std::regex_search(style, rule)) << outcome.name << " ." << outcome.pageClass;
    }
}

void expectOutcomeMarkup(std::string const& html, report::OutcomeText const& outcome) {
    std::string const pageClass(outcome.pageClass);
    std::string const name(outcome.name);
    EXPECT_NE(std::string::npos,
              html.find("<li class=\"" + pageClass + "\" data-outcome=\"" + name + "\"><b>"))
        << name;
    EXPECT_NE(std::string::npos,
              html.find("<span class=\"key " + pageClass + "\"></span>" + outcome.label))
        << name;
    EXPECT_NE(std::string::npos,
              html.find("value=\"" + pageClass + "\" data-outcome=\"" + name + "\" checked>"))
        << name;
}

TEST(ReportPage, TotalsKeysAndFiltersCarryEveryOutcomesClassNameAndLabel) {
    std::string const html = page(Json::array({partitionEntry("1", "a", "surveyed")}));
    for (report::OutcomeText const& outcome : report::outcomeTable()) {
        expectOutcomeMarkup(html, outcome);
    }
}

TEST(ReportPage, RowMarkupStaysSmallForLargeConsoles) {
    Json partitions = Json::array();
    for (int i = 0; i < 1000; ++i) {
        partitions.push_back(partitionEntry(std::to_string(i), "host-" + std::to_string(i),
                                            i % 4 == 0 ? "channel_failure" : "surveyed"));
    }
    // 50 machines of 1,000 partitions must stay under 20 MB.
    EXPECT_LT(page(partitions).size(), 20U * 1000 * 1000 / 50);
}

TEST(ReportPage, ARunWhoseMachineListingFailedSaysSoBesideItsTimes) {
    Json run = summary(Json::array());
    run["machines"] = Json::array();
    run["listing_failure"] = {
        {"command", "/opt/lsvtc/bin/lsvtc -t0"}, {"exit_status", 127}, {"message", "not found"}};
    std::string const html = report::reportPage(run, {});
    EXPECT_NE(std::string::npos, html.find("<b>listing failed</b>: /opt/lsvtc/bin/lsvtc -t0 exited "
                                           "with status 127: not found"));
}

// The page of a run without history is the page as it was before the
// history existed, byte for byte: the history adds to it only when it is
// given.
TEST(ReportPage, PageWithoutHistoryIsThePageOfBefore) {
    std::string const html = page(Json::array(
        {partitionEntry("1", "a", "surveyed"), partitionEntry("2", "b", "channel_failure")}));
    EXPECT_TRUE(QuorvexTest::matchesExpectedFile(
        html, QuorvexTest::expectedOutputFile("report/page-without-history.html")));
}

} // namespace
