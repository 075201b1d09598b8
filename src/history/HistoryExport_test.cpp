#include "history/HistoryExport.h"

#include "HistoryFixture.h"
#include "Lines.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <sstream>

namespace {

using QuorvexTest::ExampleHistory;

std::string exported(SQLite::Database& database, history::ExportSelection const& selection) {
    std::ostringstream out;
    history::writeExport(database, selection, out);
    return out.str();
}

history::ExportSelection selection(std::string const& format, std::string const& what) {
    history::ExportSelection chosen;
    chosen.format = format;
    chosen.what = what;
    return chosen;
}

// The fields of an RFC 4180 text, row by row: quoted fields may hold
// commas, doubled quotes and line ends; every row ends with CRLF.
std::vector<std::vector<std::string>> csvRows(std::string const& text) {
    std::vector<std::vector<std::string>> rows(1, std::vector<std::string>(1));
    bool quoted = false;
    for (std::size_t i = 0; i < text.size(); ++i) {
        char const c = text[i];
        if (quoted && c == '"' && i + 1 < text.size() && text[i + 1] == '"') {
            rows.back().back() += '"';
            ++i;
        } else if (c == '"') {
            quoted = !quoted;
        } else if (!quoted && c == ',') {
            rows.back().emplace_back();
        } else if (!quoted && c == '\r' && i + 1 < text.size() && text[i + 1] == '\n') {
            rows.emplace_back(1);
            ++i;
        } else {
            rows.back().back() += c;
        }
    }
    rows.pop_back();
    return rows;
}

TEST(HistoryExport, CsvOfRunsHasAHeaderRowAndOneRowPerRunEndingInCrLf) {
    ExampleHistory example;
    std::string const csv = exported(example.database(), selection("csv", "runs"));
    EXPECT_EQ(csv.substr(0, csv.find("\r\n") + 2),
              "id,console,started,ended,seconds,exit_status,return_code,interrupted,partitions,"
              "surveyed,failed,new_failures,recoveries,inventory_changes\r\n");
    std::vector<std::vector<std::string>> const rows = csvRows(csv);
    ASSERT_EQ(rows.size(), 6U);
    EXPECT_EQ(rows[4], (std::vector<std::string>{"4", "cons-a", "2026-11-03T02:00:00+01:00",
                                                 "2026-11-03T02:00:41+01:00", "41", "143", "0",
                                                 "SIGTERM", "3", "1", "1", "0", "0", "1"}));
}

TEST(HistoryExport, CsvQuotesAValueHoldingCommasAndQuotes) {
    ExampleHistory example;
    std::vector<std::vector<std::string>> const rows =
        csvRows(exported(example.database(), selection("csv", "changes")));
    ASSERT_EQ(rows.size(), 13U);
    EXPECT_EQ(rows[6][3], "property_changed");
    EXPECT_EQ(rows[6][10], "1.1, \"service pack\"");
    for (std::vector<std::string> const& row : rows) {
        EXPECT_EQ(row.size(), rows[0].size());
    }
}

TEST(HistoryExport, JsonOfPartitionsSinceADateKeepsTypesAndNulls) {
    ExampleHistory example;
    history::ExportSelection chosen = selection("json", "partitions");
    chosen.sinceUnix = 1793667600; // 2026-11-03T02:00:00+01:00
    chosen.sinceText = "2026-11-03T02:00+01:00";
    chosen.console = "cons-a";
    nlohmann::ordered_json const document =
        nlohmann::ordered_json::parse(exported(example.database(), chosen));
    EXPECT_EQ(document["schema_version"], 1);
    EXPECT_EQ(document["what"], "partitions");
    EXPECT_EQ(document["since"], "2026-11-03T02:00+01:00");
    EXPECT_EQ(document["console"], "cons-a");
    ASSERT_EQ(document["rows"].size(), 6U);
    EXPECT_EQ(document["rows"][1], nlohmann::ordered_json::parse(R"({
        "run": 4, "console": "cons-a", "machine": "8233-E8B_10ABCDE", "partition": "lpar2",
        "partition_id": null, "ip": "10.1.1.1", "outcome": "client_failure",
        "status_text": "client_failure", "reason": "the client ended with 12", "seconds": null,
        "document": null, "inventory": "none", "inventory_problem": null,
        "document_hash": null, "failing_since_run": 2, "runs_failing": 2,
        "last_surveyed_run": null})"));
}

// The same row as the CSV's, with numbers as numbers and a missing value
// as null.
TEST(HistoryExport, JsonOfRunsHasOneTypedRowPerRun) {
    ExampleHistory example;
    nlohmann::ordered_json const document =
        nlohmann::ordered_json::parse(exported(example.database(), selection("json", "runs")));
    EXPECT_EQ(document["what"], "runs");
    ASSERT_EQ(document["rows"].size(), 5U);
    EXPECT_EQ(document["rows"][3], nlohmann::ordered_json::parse(R"({
        "id": 4, "console": "cons-a", "started": "2026-11-03T02:00:00+01:00",
        "ended": "2026-11-03T02:00:41+01:00", "seconds": 41, "exit_status": 143,
        "return_code": "0", "interrupted": "SIGTERM", "partitions": 3, "surveyed": 1,
        "failed": 1, "new_failures": 0, "recoveries": 0, "inventory_changes": 1})"));
    EXPECT_TRUE(document["rows"][4]["interrupted"].is_null());
}

TEST(HistoryExport, JsonOfChangesKeepsAValueHoldingCommasAndQuotesAsItIs) {
    ExampleHistory example;
    nlohmann::ordered_json const document =
        nlohmann::ordered_json::parse(exported(example.database(), selection("json", "changes")));
    EXPECT_EQ(document["what"], "changes");
    ASSERT_EQ(document["rows"].size(), 12U);
    nlohmann::ordered_json const& changed = document["rows"][5];
    EXPECT_EQ(changed["kind"], "property_changed");
    EXPECT_EQ(changed["new_value"], "1.1, \"service pack\"");
    for (nlohmann::ordered_json const& row : document["rows"]) {
        EXPECT_EQ(row.size(), document["rows"][0].size());
        EXPECT_TRUE(row["run"].is_number_integer());
    }
}

TEST(HistoryExport, JsonOfNothingHasNoRow) {
    ExampleHistory example;
    history::ExportSelection chosen = selection("json", "changes");
    chosen.console = "cons-b";
    nlohmann::ordered_json const document =
        nlohmann::ordered_json::parse(exported(example.database(), chosen));
    EXPECT_EQ(document["rows"], nlohmann::ordered_json::array());
    EXPECT_TRUE(document["since"].is_null());
}

} // namespace
