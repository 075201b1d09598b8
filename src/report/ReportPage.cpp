#include "report/ReportPage.h"

#include "report/JsonMember.h"
#include "report/ListingFailure.h"
#include "report/Outcome.h"
#include "report/PageAssets.h"
#include "report/PageSkeleton.h"
#include "report/ReportCommand.h"
#include "utility/TextSafety.h"

#include <cstdio>
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

// The text of a value as the page carries it, escaped for HTML; "" for null.
std::string htmlText(Json const& value) {
    if (value.is_null()) {
        return "";
    }
    if (value.is_string()) {
        return escapeHtml(value.get<std::string>());
    }
    return escapeHtml(value.dump());
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

long long countOf(Json const& counts, char const* name) {
    Json const& value = member(counts, name);
    return value.is_number_integer() ? value.get<long long>() : 0;
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

std::string optionsText(Json const& summary) {
    if (htmlText(member(summary, "tool")) != gc_ProgramName) {
        return "read from the files earlier runs left";
    }
    Json const& options = member(summary, "options");
    std::string text = "-j " + htmlText(member(options, "jobs")) + " -t " +
                       htmlText(member(options, "timeout_seconds"));
    if (member(options, "all").is_boolean() && member(options, "all").get<bool>()) {
        return text + " --all";
    }
    for (Json const& identity : member(options, "identities")) {
        text += " " + htmlText(identity);
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

// What the report says for a machine, or a run, whose listing failed: the
// outcome's name, then the command, its exit status and the console's message.
std::string listingFailureNote(Json const& failure) {
    return std::string(gc_ListingFailedName) + ": " + escapeHtml(listingFailureText(failure));
}

// Beside the times: an interruption, and a machine listing that failed.
std::string runNotesText(Json const& summary) {
    Json const& failure = member(summary, "listing_failure");
    return interruptionText(summary) +
           (failure.is_null() ? "" : " &middot; <b>" + listingFailureNote(failure) + "</b>");
}

// One item per outcome; the page's script finds them by data-outcome, and
// their class gives them the outcome's colour.
void appendOutcomeTotals(std::string& page, Json const& totals) {
    for (OutcomeText const& outcome : outcomeTable()) {
        page += "<li class=\"" + std::string(outcome.pageClass) + "\" data-outcome=\"" +
                outcome.name + "\"><b>" + std::to_string(countOf(totals, outcome.name)) + "</b>" +
                outcome.label + "</li>\n";
    }
}

// noneText describes a machine without partitions.
std::string barOf(Json const& counts, std::string const& noneText) {
    long long const partitions = countOf(counts, "partitions");
    std::string bar = "<div class=\"bar\">";
    std::string described;
    for (OutcomeText const& outcome : outcomeTable()) {
        long long const count = countOf(counts, outcome.name);
        if (count <= 0 || partitions <= 0) {
            continue;
        }
        char width[32] = {};
        std::snprintf(width, sizeof width, "%.3f%%",
                      100.0 * static_cast<double>(count) / static_cast<double>(partitions));
        std::string const text = std::to_string(count) + " " + outcome.label;
        bar += "<i class=\"" + std::string(outcome.pageClass) + "\" style=\"width:" + width +
               "\" title=\"" + text + "\"></i>";
        described += (described.empty() ? "" : ", ") + text;
    }
    return bar + "</div><td class=\"legend\">" + (described.empty() ? noneText : described);
}

void appendMachineRow(std::string& page, Json const& machine, std::size_t index) {
    std::string const identity = htmlText(member(machine, "identity"));
    std::string const code = htmlText(member(machine, "return_code"));
    Json const& failure = member(machine, "listing_failure");
    std::string const noneText = failure.is_null() ? "none listed" : listingFailureNote(failure);
    page += R"(<tr><th scope="row">)";
    if (member(machine, "partitions").empty()) {
        page += identity;
    } else {
        page += R"(<a href="#m)" + std::to_string(index) + R"(" data-machine=")" + identity +
                R"(">)" + identity + "</a>";
    }
    page += R"(<td class="code code)" + code + R"(">)" + code + R"(<td class="number">)" +
            std::to_string(countOf(member(machine, "counts"), "partitions")) +
            R"(<td class="bar-cell">)" + barOf(member(machine, "counts"), noneText) + "\n";
}

void appendMachineRows(std::string& page, Json const& machines) {
    std::size_t index = 0;
    for (Json const& machine : machines) {
        appendMachineRow(page, machine, index);
        ++index;
    }
}

void appendOutcomeKeys(std::string& page) {
    for (OutcomeText const& outcome : outcomeTable()) {
        page +=
            "<span class=\"key " + std::string(outcome.pageClass) + "\"></span>" + outcome.label;
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

std::string documentLink(Json const& document, std::string const& documentFolder) {
    if (!document.is_string()) {
        return "";
    }
    std::string const path = document.get<std::string>();
    std::string const file = path.substr(path.rfind('/') + 1);
    return "<a href=\"" + escapeHtml(urlPath(documentFolder + "/" + file)) + "\">XML</a>";
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
                        std::string const& anchor, std::string const& documentFolder) {
    RowOutcome const outcome = rowOutcome(member(partition, "outcome"));
    page += "<tr" + anchor + " class=" + outcome.pageClass + "><td>" + identity +
            "<td class=number>" + htmlText(member(partition, "id")) + "<td>" +
            htmlText(member(partition, "host")) + "<td>" + htmlText(member(partition, "ip")) +
            "<td class=outcome>" + outcome.label + "<td>" +
            htmlText(member(partition, "status_text")) + "<td class=number>" +
            secondsText(member(partition, "seconds")) + "<td>" +
            documentLink(member(partition, "document"), documentFolder) + "<td>" +
            reasonDetails(member(partition, "reason"));
    // The row is closed before the line end: left open, the line end would
    // belong to the last cell, and an empty reason cell would lose the dash
    // the style sheet gives empty cells (td:empty).
    page += "</tr>\n";
}

void appendPartitionRows(std::string& page, Json const& machines,
                         std::string const& documentFolder) {
    std::size_t index = 0;
    for (Json const& machine : machines) {
        std::string const identity = htmlText(member(machine, "identity"));
        std::string anchor = " id=m" + std::to_string(index);
        for (Json const& partition : member(machine, "partitions")) {
            appendPartitionRow(page, partition, identity, anchor, documentFolder);
            anchor.clear();
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

// A placeholder filled with a text that is ready as it is.
Placeholder textPlaceholder(std::string_view name, std::string text) {
    return {name, [text = std::move(text)](std::string& page) { page += text; }};
}

std::vector<Placeholder> runPlaceholders(Json const& summary) {
    Json const& totals = member(summary, "totals");
    return {
        textPlaceholder("console-host", htmlText(member(summary, "console_host"))),
        textPlaceholder("started", htmlText(member(summary, "started"))),
        textPlaceholder("ended", htmlText(member(summary, "ended"))),
        textPlaceholder("elapsed-seconds", secondsText(member(summary, "elapsed_seconds"))),
        textPlaceholder("return-code", htmlText(member(summary, "return_code"))),
        textPlaceholder("interruption", runNotesText(summary)),
        textPlaceholder("options", optionsText(summary)),
        textPlaceholder("machine-count", std::to_string(countOf(totals, "machines"))),
        textPlaceholder("partition-count", std::to_string(countOf(totals, "partitions"))),
        {"outcome-totals", [&totals](std::string& page) { appendOutcomeTotals(page, totals); }},
        textPlaceholder("tool", htmlText(member(summary, "tool"))),
        textPlaceholder("version", htmlText(member(summary, "version"))),
        textPlaceholder("style", std::string(gc_PageStyle)),
        textPlaceholder("script", std::string(gc_PageScript)),
    };
}

} // namespace

std::string reportPage(Json const& summary, std::string const& documentFolder) {
    Json const& machines = member(summary, "machines");
    std::vector<Placeholder> placeholders = runPlaceholders(summary);
    placeholders.push_back(
        {"machine-rows", [&machines](std::string& page) { appendMachineRows(page, machines); }});
    placeholders.push_back({"outcome-keys", appendOutcomeKeys});
    placeholders.push_back({"outcome-choices", appendOutcomeChoices});
    placeholders.push_back({"machine-options", [&machines](std::string& page) {
                                appendMachineOptions(page, machines);
                            }});
    placeholders.push_back({"partition-rows", [&](std::string& page) {
                                appendPartitionRows(page, machines, documentFolder);
                            }});
    std::string page;
    page.reserve(expectedSize(summary));
    fillSkeleton(page, gc_PageSkeleton, placeholders);
    return page;
}

} // namespace report
