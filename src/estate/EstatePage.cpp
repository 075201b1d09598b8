#include "estate/EstatePage.h"

#include "estate/EstateAssets.h"
#include "report/JsonMember.h"
#include "report/Outcome.h"
#include "report/OutcomeMarks.h"
#include "report/PageAssets.h"
#include "report/PageSkeleton.h"
#include "report/PageText.h"
#include "utility/TextSafety.h"

namespace estate {

using Json = nlohmann::ordered_json;
using report::Placeholder;
using report::textPlaceholder;
using util::escapeHtml;

namespace {

std::string numberText(std::optional<long long> const& number) {
    return number ? std::to_string(*number) : "";
}

std::string consoleName(ConsoleRun const& console) {
    std::optional<std::string> const report = consoleReportPath(console);
    std::string const name = escapeHtml(console.record.console);
    return report ? "<a href=\"" + escapeHtml(*report) + "\">" + name + "</a>" : name;
}

// "2 h 5 min" for the age of a stale console's newest run.
std::string ageText(std::optional<long long> const& seconds) {
    if (!seconds) {
        return "";
    }
    long long const minutes = *seconds / 60;
    if (minutes < 60) {
        return std::to_string(minutes) + " min";
    }
    long long const hours = minutes / 60;
    return hours < 48 ? std::to_string(hours) + " h " + std::to_string(minutes % 60) + " min"
                      : std::to_string(hours / 24) + " d " + std::to_string(hours % 24) + " h";
}

std::string countText(std::size_t count, char const* one, char const* many) {
    return std::to_string(count) + " " + (count == 1 ? one : many);
}

// "2 new failures, 1 recovery, 0 inventory changes"; what the history says
// instead when there is nothing to compare; empty for a run not recorded.
std::string changesText(std::optional<ConsoleChanges> const& changes) {
    if (!changes) {
        return "";
    }
    if (changes->unavailable) {
        return "not recorded: " + escapeHtml(*changes->unavailable);
    }
    if (!changes->previousRunId) {
        return "first recorded run";
    }
    return countText(changes->newFailures, "new failure", "new failures") + ", " +
           countText(changes->recoveries, "recovery", "recoveries") + ", " +
           countText(changes->inventoryChanges, "inventory change", "inventory changes");
}

void appendNotCollected(std::string& page, Estate const& estate) {
    std::string rows;
    for (ConsoleRun const& console : estate.consoles) {
        if (console.record.kind == RecordKind::Collected) {
            continue;
        }
        rows += "<tr><th scope=\"row\">" + consoleName(console) + "</th><td class=\"record\">" +
                textOf(console.record.kind).label + "</td><td>" +
                escapeHtml(console.record.message) + "</td><td class=\"number\">" +
                numberText(console.record.exitStatus) + "</td><td class=\"number\">" +
                ageText(console.record.ageSeconds) + "</td></tr>\n";
    }
    if (rows.empty()) {
        page += "<p class=\"none\">Every console was collected.</p>";
        return;
    }
    page += "<div class=\"table-scroll\"><table class=\"not-collected\"><thead><tr><th>Console</th>"
            "<th>Record</th><th>Reason</th><th class=\"number\">Exit status</th>"
            "<th class=\"number\">Age of its newest run</th></tr></thead><tbody>\n" +
            rows + "</tbody></table></div>";
}

void appendRecordTotals(std::string& page, Json const& totals) {
    for (RecordText const& row : recordTable()) {
        long long const count = report::countOf(totals, row.name);
        bool const bad = row.kind != RecordKind::Collected && count > 0;
        page += std::string("<li class=\"record-totals") + (bad ? " bad" : "") + "\"><b>" +
                std::to_string(count) + "</b>" + row.label + "</li>\n";
    }
}

void appendConsoleLinks(std::string& page, Estate const& estate) {
    for (ConsoleRun const& console : estate.consoles) {
        page += "<li>" + consoleName(console) + " (" + textOf(console.record.kind).label + ")</li>";
    }
}

void appendOutcomeOptions(std::string& page) {
    for (report::OutcomeText const& outcome : report::outcomeTable()) {
        page +=
            "<option value=\"" + std::string(outcome.name) + "\">" + outcome.label + "</option>";
    }
    page += "<option value=\"listing_failed\">listing failed</option>";
}

void appendConsoleOptions(std::string& page, Estate const& estate) {
    for (std::size_t index = 0; index < estate.consoles.size(); ++index) {
        page += "<option value=\"" + std::to_string(index) + "\">" +
                escapeHtml(estate.consoles[index].record.console) + "</option>";
    }
}

std::vector<Placeholder> headerPlaceholders(Estate const& estate, Json const& totals) {
    Json const collected(estate.collected);
    return {
        textPlaceholder("console-count", std::to_string(estate.consoles.size())),
        textPlaceholder("collected-text", report::timeText(collected)),
        textPlaceholder("collected", report::timeElement(collected)),
        textPlaceholder("machine-count", std::to_string(report::countOf(totals, "machines"))),
        textPlaceholder("partition-count", std::to_string(report::countOf(totals, "partitions"))),
        {"record-totals",
         [&totals](std::string& page) { appendRecordTotals(page, totals["records"]); }},
        {"outcome-totals",
         [&totals](std::string& page) { report::appendOutcomeTotals(page, totals["outcomes"]); }},
        textPlaceholder("report-style", std::string(report::gc_PageStyle)),
        textPlaceholder("style", std::string(gc_EstateStyle)),
        textPlaceholder("tool", "quorvex-survey estate"),
        textPlaceholder("version", QUORVEX_VERSION),
        textPlaceholder("script", std::string(gc_EstateScript)),
    };
}

} // namespace

void EstatePage::add(ConsoleRun const& console, std::optional<Json> const& summary) {
    Json const none;
    Json const& totals = summary ? report::member(*summary, "totals") : none;
    auto const count = [&](char const* name) {
        return summary ? std::to_string(report::countOf(totals, name)) : std::string();
    };
    _consoleRows += "<tr><th scope=\"row\">" + consoleName(console) + "</th><td>" +
                    textOf(console.record.kind).label + "</td><td>" +
                    escapeHtml(console.consoleHost) + "</td><td>" +
                    report::timeElement(summary ? report::member(*summary, "started") : none) +
                    "</td><td class=\"number\">" +
                    report::htmlText(summary ? report::member(*summary, "exit_status") : none) +
                    "</td><td class=\"number\">" + count("machines") +
                    "</td><td class=\"number\">" + count("partitions") +
                    "</td><td class=\"bar-cell\">" + (summary ? report::outcomeBar(totals) : "") +
                    "</td><td>" + changesText(console.changes) + "</td></tr>\n";
}

std::string EstatePage::text(Estate const& estate, Json const& totals,
                             std::string const& rowData) const {
    std::vector<Placeholder> placeholders = headerPlaceholders(estate, totals);
    placeholders.push_back(
        {"not-collected", [&estate](std::string& page) { appendNotCollected(page, estate); }});
    placeholders.push_back(textPlaceholder("console-rows", _consoleRows));
    placeholders.push_back({"outcome-keys", report::appendOutcomeKeys});
    placeholders.push_back(
        {"console-links", [&estate](std::string& page) { appendConsoleLinks(page, estate); }});
    placeholders.push_back({"outcome-options", appendOutcomeOptions});
    placeholders.push_back(
        {"console-options", [&estate](std::string& page) { appendConsoleOptions(page, estate); }});
    placeholders.push_back({"row-data", [&rowData](std::string& page) { page += rowData; }});
    std::string page;
    page.reserve(rowData.size() + _consoleRows.size() + std::size_t{64} * 1024);
    report::fillSkeleton(page, gc_EstatePageSkeleton, placeholders);
    return page;
}

} // namespace estate
