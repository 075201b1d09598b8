#include "report/ReportPage.h"

#include "report/DocumentCopies.h"
#include "report/HistoryPartitionNames.h"
#include "report/JsonMember.h"
#include "report/ListingFailure.h"
#include "report/Outcome.h"
#include "report/OutcomeMarks.h"
#include "report/PageAssets.h"
#include "report/PageSkeleton.h"
#include "report/PageText.h"
#include "report/ReportCommand.h"
#include "report/SinceLastRunSection.h"
#include "utility/TextSafety.h"

#include <algorithm>
#include <cstdio>
#include <optional>
#include <set>
#include <vector>

namespace report {

using util::escapeHtml;

using Json = nlohmann::ordered_json;

namespace {

// How a partition's row shows its outcome.
struct RowOutcome {
    char const* label;
    char const* pageClass;
};

// A partition whose outcome the outcome table lacks (a summary from a newer
// program, or none) still gets a row, labelled unknown; no style sheet rule
// colours its class.
RowOutcome rowOutcome(Json const& name) {
    std::optional<Outcome> const outcome =
        name.is_string() ? outcomeNamed(name.get<std::string>()) : std::nullopt;
    if (!outcome) {
        return {"unknown", "u"};
    }
    return {textOf(*outcome).label, textOf(*outcome).pageClass};
}

// Seconds with one decimal, as the survey's stop lines give them; the CSV
// and summary.json keep every digit.
std::string secondsText(Json const& value) {
    if (!value.is_number()) {
        return htmlText(value);
    }
    char text[32] = {};
    std::snprintf(text, sizeof text, "%.1f", value.get<double>());
    return text;
}

// A reason ends with blank lines in the documents; on the page they would
// only make the row taller.
std::string withoutTrailingBlanks(std::string text) {
    text.erase(text.find_last_not_of(" \n") + 1);
    return text;
}

// Bytes outside the unreserved characters and "/" are percent-encoded, so a
// file name with "#", "?", "%", spaces or markup still names its file.
std::string urlPath(std::string const& path) {
    std::string encoded;
    for (char const character : path) {
        auto const byte = static_cast<unsigned char>(character);
        bool const plain = (byte >= 'a' && byte <= 'z') || (byte >= 'A' && byte <= 'Z') ||
                           (byte >= '0' && byte <= '9') || character == '-' || character == '_' ||
                           character == '.' || character == '~' || character == '/';
        if (plain) {
            encoded += character;
        } else {
            char hex[4] = {};
            std::snprintf(hex, sizeof hex, "%%%02X", byte);
            encoded += hex;
        }
    }
    return encoded;
}

// Each option with its value, and each identity, is kept whole on its line
// (a line may break after the "-" of "-j" or inside "9119-MHE_21ABCDE");
// lines break between them.
std::string optionsText(Json const& summary) {
    if (htmlText(member(summary, "tool")) != gc_ProgramName) {
        return "read from the files earlier runs left";
    }
    Json const& options = member(summary, "options");
    std::string text = "<span>-j " + htmlText(member(options, "jobs")) + "</span> <span>-t " +
                       htmlText(member(options, "timeout_seconds")) + "</span>";
    if (member(options, "all").is_boolean() && member(options, "all").get<bool>()) {
        return text + " <span>--all</span>";
    }
    for (Json const& identity : member(options, "identities")) {
        text += " <span>" + htmlText(identity) + "</span>";
    }
    return text;
}

std::string interruptionText(Json const& summary) {
    Json const& interrupted = member(summary, "interrupted");
    if (interrupted.is_null()) {
        return "";
    }
    return " &middot; <b>interrupted by " + htmlText(interrupted) + "</b>";
}

// Beside the times: an interruption, and a machine listing (--all) that
// failed, with the command, its exit status and the console's message.
std::string runNotesText(Json const& summary) {
    Json const& failure = member(summary, "listing_failure");
    if (failure.is_null()) {
        return interruptionText(summary);
    }
    return interruptionText(summary) + " &middot; <b>" + std::string(gc_ListingFailedLabel) +
           "</b>: " + escapeHtml(listingFailureText(failure));
}

// A machine whose partitions the console could not list: the command, its
// exit status and the console's message, in place of the counts.
std::string listingFailure(Json const& failure) {
    return R"(<div class="bar listing-failed"></div><p class="counts"><b>listing failed</b>: )" +
           escapeHtml(listingFailureText(failure)) + "</p>";
}

bool listingFailed(Json const& machine) {
    return !member(machine, "listing_failure").is_null();
}

void appendMachineRow(std::string& page, Json const& machine, std::size_t index) {
    std::string const identity = htmlText(member(machine, "identity"));
    std::string const code = htmlText(member(machine, "return_code"));
    page += listingFailed(machine) ? R"(<tr class="listing-failed"><th scope="row">)"
                                   : R"(<tr><th scope="row">)";
    if (member(machine, "partitions").empty()) {
        page += identity;
    } else {
        page += R"(<a href="#m)" + std::to_string(index) + R"(" data-machine=")" + identity +
                R"(">)" + identity + "</a>";
    }
    page += R"(<td class="code code)" + code + R"(">)" + code + R"(<td class="number">)" +
            std::to_string(countOf(member(machine, "counts"), "partitions")) +
            R"(<td class="bar-cell">)" +
            (listingFailed(machine) ? listingFailure(member(machine, "listing_failure"))
                                    : outcomeBar(member(machine, "counts"))) +
            "\n";
}

void appendMachineRows(std::string& page, Json const& machines) {
    std::size_t index = 0;
    for (Json const& machine : machines) {
        appendMachineRow(page, machine, index);
        ++index;
    }
}

// The filter's boxes: the value is the class of the rows a box keeps.
void appendOutcomeChoices(std::string& page) {
    for (OutcomeText const& outcome : outcomeTable()) {
        page += R"(<label><input type="checkbox" name="outcome" value=")" +
                std::string(outcome.pageClass) + R"(" data-outcome=")" + outcome.name +
                R"(" checked><span class="key )" + outcome.pageClass + R"("></span>)" +
                outcome.label + "</label>\n";
    }
}

void appendMachineOptions(std::string& page, Json const& machines) {
    for (Json const& machine : machines) {
        std::string const identity = htmlText(member(machine, "identity"));
        page += R"(<option value=")";
        page += identity;
        page += R"(">)";
        page += identity;
        page += "</option>";
    }
}

// A link to the document's copy beside the page; none for a document that
// was not copied, as the link would lead nowhere.
std::string documentLink(Json const& document, std::set<std::string> const& linkedDocuments) {
    if (!document.is_string() || linkedDocuments.count(document.get<std::string>()) == 0) {
        return "";
    }
    std::optional<std::string> const file = documentFileName(document.get<std::string>());
    if (!file) {
        return "";
    }
    return "<a href=\"" + escapeHtml(urlPath(std::string(gc_DocumentFolder) + "/" + *file)) +
           "\">XML</a>";
}

std::string reasonDetails(Json const& reason) {
    if (!reason.is_string()) {
        return "";
    }
    return "<details><summary>reason</summary><pre>" + withoutTrailingBlanks(htmlText(reason)) +
           "</pre></details>";
}

// Cells are left open (HTML closes them) to keep 50,000 rows small; only
// the cells the style sheet colours or aligns carry a class.
void appendPartitionRow(std::string& page, Json const& partition, std::string const& identity,
                        std::string const& anchor, std::set<std::string> const& linkedDocuments,
                        std::string const& historyCells) {
    RowOutcome const outcome = rowOutcome(member(partition, "outcome"));
    page += "<tr" + anchor + " class=" + outcome.pageClass + "><td>" + identity +
            "<td class=number>" + htmlText(member(partition, "id")) + "<td>" +
            htmlText(member(partition, "host")) + "<td>" + htmlText(member(partition, "ip")) +
            "<td class=outcome>" + outcome.label + historyCells + "<td>" +
            htmlText(member(partition, "status_text")) + "<td class=number>" +
            secondsText(member(partition, "seconds")) + "<td>" +
            documentLink(member(partition, "document"), linkedDocuments) + "<td>" +
            reasonDetails(member(partition, "reason"));
    // The row is closed before the line end: left open, the line end would
    // belong to the last cell, and an empty reason cell would lose the dash
    // the style sheet gives empty cells (td:empty).
    page += "</tr>\n";
}

// The history's cells of a machine's partitions, in listing order; none
// without history.
std::vector<std::string> historyCellsOf(Json const& machine,
                                        std::optional<SinceLastRun> const& since) {
    Json const& partitions = member(machine, "partitions");
    if (!since || !hasHistoryColumns(*since)) {
        return std::vector<std::string>(partitions.size());
    }
    std::string const identity = historyMachineName(machine);
    std::vector<std::string> cells = historyPartitionNames(partitions);
    std::transform(cells.begin(), cells.end(), cells.begin(),
                   [&](std::string const& name) { return historyCells(*since, identity, name); });
    return cells;
}

void appendPartitionRows(std::string& page, Json const& machines,
                         std::set<std::string> const& linkedDocuments,
                         std::optional<SinceLastRun> const& since) {
    std::size_t index = 0;
    for (Json const& machine : machines) {
        std::string const identity = htmlText(member(machine, "identity"));
        std::vector<std::string> const history = historyCellsOf(machine, since);
        std::string anchor = " id=m" + std::to_string(index);
        std::size_t row = 0;
        for (Json const& partition : member(machine, "partitions")) {
            appendPartitionRow(page, partition, identity, anchor, linkedDocuments, history[row]);
            anchor.clear();
            ++row;
        }
        ++index;
    }
}

std::size_t expectedSize(Json const& summary) {
    constexpr std::size_t bytesPerRow = 300;
    constexpr std::size_t headAndMachines = std::size_t{64} * 1024;
    return headAndMachines +
           bytesPerRow * static_cast<std::size_t>(countOf(member(summary, "totals"), "partitions"));
}

std::vector<Placeholder> runPlaceholders(Json const& summary) {
    Json const& totals = member(summary, "totals");
    return {
        textPlaceholder("console-host", htmlText(member(summary, "console_host"))),
        textPlaceholder("started", timeElement(member(summary, "started"))),
        textPlaceholder("ended", timeElement(member(summary, "ended"))),
        textPlaceholder("started-text", timeText(member(summary, "started"))),
        textPlaceholder("elapsed-seconds", secondsText(member(summary, "elapsed_seconds"))),
        textPlaceholder("return-code", htmlText(member(summary, "return_code"))),
        textPlaceholder("interruption", runNotesText(summary)),
        textPlaceholder("options", optionsText(summary)),
        textPlaceholder("machine-count", std::to_string(countOf(totals, "machines"))),
        textPlaceholder("partition-count", std::to_string(countOf(totals, "partitions"))),
        {"outcome-totals", [&totals](std::string& page) { appendOutcomeTotals(page, totals); }},
        textPlaceholder("tool", htmlText(member(summary, "tool"))),
        textPlaceholder("version", htmlText(member(summary, "version"))),
        textPlaceholder("script", std::string(gc_PageScript)),
    };
}

// The history's parts of the page: the section, the columns and the
// history's style; all empty without history, so that the page is then
// the page of before.
std::vector<Placeholder> historyPlaceholders(std::optional<SinceLastRun> const& since) {
    bool const columns = since && hasHistoryColumns(*since);
    return {
        textPlaceholder("style",
                        std::string(gc_PageStyle) + (since ? std::string(gc_HistoryStyle) : "")),
        textPlaceholder("since-last-run", since ? sinceLastRunSection(*since) : ""),
        textPlaceholder("history-columns", columns ? historyColumns() : ""),
        textPlaceholder("history-headings", columns ? historyHeadings() : ""),
    };
}

} // namespace

std::string reportPage(Json const& summary, std::set<std::string> const& linkedDocuments,
                       std::optional<SinceLastRun> const& since) {
    Json const& machines = member(summary, "machines");
    std::vector<Placeholder> placeholders = runPlaceholders(summary);
    std::vector<Placeholder> const history = historyPlaceholders(since);
    placeholders.insert(placeholders.end(), history.begin(), history.end());
    placeholders.push_back(
        {"machine-rows", [&machines](std::string& page) { appendMachineRows(page, machines); }});
    placeholders.push_back({"outcome-keys", appendOutcomeKeys});
    placeholders.push_back({"outcome-choices", appendOutcomeChoices});
    placeholders.push_back({"machine-options", [&machines](std::string& page) {
                                appendMachineOptions(page, machines);
                            }});
    placeholders.push_back({"partition-rows", [&](std::string& page) {
                                appendPartitionRows(page, machines, linkedDocuments, since);
                            }});
    std::string page;
    page.reserve(expectedSize(summary));
    fillSkeleton(page, gc_PageSkeleton, placeholders);
    return page;
}

} // namespace report
