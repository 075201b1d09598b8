#include "estate/EstatePage.h"

#include "QuorvexTest.h"
#include "estate/EstateRows.h"
#include "estate/EstateTotals.h"

#include <gtest/gtest.h>

namespace {

using QuorvexTest::CollectFolder;

estate::ConsoleRun consoleRun(std::string const& name, estate::RecordKind kind,
                              std::string const& message) {
    estate::ConsoleRun run;
    run.record.console = name;
    run.record.kind = kind;
    run.record.message = message;
    return run;
}

std::string pageOf(estate::Estate const& estate) {
    estate::EstateTotals totals;
    estate::EstateRows rows;
    estate::EstatePage page;
    for (estate::ConsoleRun const& console : estate.consoles) {
        totals.add(console, std::nullopt);
        rows.add(console, std::nullopt);
        page.add(console, std::nullopt);
    }
    return page.text(estate, totals.document(), rows.scriptText());
}

TEST(EstatePage, ConsolesNotCollectedAreListedBeforeTheConsolesWithTheirReason) {
    estate::Estate estate;
    estate.collected = "2026-11-24T18:00:00+00:00";
    estate.consoles.push_back(
        consoleRun("down", estate::RecordKind::Unreachable, "Connection refused"));
    std::string const page = pageOf(estate);
    std::size_t const notCollected = page.find("<section id=\"not-collected\">");
    std::size_t const consoles = page.find("<section id=\"consoles\">");
    ASSERT_NE(std::string::npos, notCollected);
    EXPECT_LT(notCollected, consoles);
    std::size_t const reason = page.find("<td>Connection refused</td>", notCollected);
    EXPECT_LT(reason, consoles);
}

TEST(EstatePage, EveryConsoleCollectedSaysSo) {
    estate::Estate estate;
    estate.consoles.push_back(consoleRun("up", estate::RecordKind::Collected, ""));
    EXPECT_NE(std::string::npos, pageOf(estate).find("Every console was collected."));
}

TEST(EstatePage, ConsoleTextsAreEscaped) {
    estate::Estate estate;
    estate.consoles.push_back(
        consoleRun("<img src=x onerror=alert(1)>", estate::RecordKind::ToolError, "a & <b>"));
    std::string const page = pageOf(estate);
    EXPECT_EQ(std::string::npos, page.find("<img"));
    EXPECT_EQ(std::string::npos, page.find("<b>a"));
    EXPECT_NE(std::string::npos, page.find("a &amp; &lt;b&gt;"));
}

TEST(EstateRows, DataHoldsNoLessThanSignSoNoTextEndsItsScriptElement) {
    estate::ConsoleRun console = consoleRun("c", estate::RecordKind::Collected, "");
    console.summaryFile = "summary.json";
    estate::EstateRows rows;
    rows.add(console,
             nlohmann::ordered_json::parse(CollectFolder::summary(
                 {CollectFolder::partition("1", "</script><b>", "channel_failure", "x < y")})));
    std::string const text = rows.scriptText();
    EXPECT_EQ(std::string::npos, text.find('<'));
    auto const data = nlohmann::json::parse(text);
    EXPECT_EQ("</script><b>", data["host"][0]);
    EXPECT_EQ("x < y", data["texts"][data["reason"][0].get<std::size_t>()]);
    EXPECT_EQ("consoles/c/index.html", data["consoles"][0]["report"]);
}

TEST(EstateRows, EveryColumnHasOneEntryPerRowAndAListingFailureIsARow) {
    std::string summary = CollectFolder::summary({CollectFolder::partition("1", "h1", "surveyed")});
    auto document = nlohmann::ordered_json::parse(summary);
    document["machines"].push_back(
        {{"identity", "8286-42A_10XYZ99"},
         {"return_code", "8"},
         {"partitions", nlohmann::ordered_json::array()},
         {"listing_failure",
          {{"command", "lspartition"}, {"exit_status", 1}, {"message", "not found"}}}});
    estate::EstateRows rows;
    rows.add(consoleRun("c", estate::RecordKind::Collected, ""), document);
    auto const data = nlohmann::json::parse(rows.scriptText());
    for (char const* column :
         {"machine", "id", "host", "ip", "outcome", "status", "reason", "seconds"}) {
        EXPECT_EQ(2U, data[column].size()) << column;
    }
    std::size_t const outcome = data["outcome"][1].get<std::size_t>();
    EXPECT_EQ("listing_failed", data["outcomes"][outcome][0]);
    EXPECT_EQ("lspartition exited with status 1: not found",
              data["texts"][data["reason"][1].get<std::size_t>()]);
}

} // namespace
