#include "report/ReportPage.h"

#include "report/JsonMember.h"
#include "report/PageAssets.h"
#include "report/SummaryTotals.h"
#include "utility/TextSafety.h"

#include <algorithm>
#include <cstdio>
#include <vector>

namespace report {

using util::escapeHtml;

using Json = nlohmann::ordered_json;

namespace {

struct OutcomeStyle {
    char const* name;
    char const* cssClass;
    char const* label;
};

// One letter per outcome keeps the 50,000-row table small.
std::vector<OutcomeStyle> const& outcomeStyles() {
    static std::vector<OutcomeStyle> const styles = {{"surveyed", "s", "surveyed"},
                                                     {"inactive", "i", "inactive"},
                                                     {"channel_failure", "c", "channel failure"},
                                                     {"client_failure", "l", "client failure"},
                                                     {"fetch_failure", "f", "fetch failure"},
                                                     {"timed_out", "t", "timed out"},
                                                     {"interrupted", "x", "interrupted"}};
    return styles;
}

OutcomeStyle styleOf(std::string const& outcome) {
    auto const& styles = outcomeStyles();
    auto const found = std::find_if(styles.begin(), styles.end(), [&](OutcomeStyle const& style) {
        return outcome == style.name;
    });
    return found == styles.end() ? OutcomeStyle{"", "u", "unknown"} : *found;
}

// The text of a value as the page shows it, escaped; "" for null.
std::string shown(Json const& value) {
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
        return shown(value);
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
    for (char const c : path) {
        auto const byte = static_cast<unsigned char>(c);
        bool const plain = (byte >= 'a' && byte <= 'z') || (byte >= 'A' && byte <= 'Z') ||
                           (byte >= '0' && byte <= '9') || c == '-' || c == '_' || c == '.' ||
                           c == '~' || c == '/';
        if (plain) {
            encoded += c;
        } else {
            char hex[4] = {};
            std::snprintf(hex, sizeof hex, "%%%02X", byte);
            encoded += hex;
        }
    }
    return encoded;
}

std::string optionsText(Json const& summary) {
    if (shown(member(summary, "tool")) != "quorvex-survey") {
        return "read from the files earlier runs left";
    }
    Json const& options = member(summary, "options");
    std::string text =
        "-j " + shown(member(options, "jobs")) + " -t " + shown(member(options, "timeout_seconds"));
    if (member(options, "all").is_boolean() && member(options, "all").get<bool>()) {
        return text + " --all";
    }
    for (Json const& identity : member(options, "identities")) {
        text += " " + shown(identity);
    }
    return text;
}

void appendHead(std::string& page, Json const& summary) {
    page += "<!DOCTYPE html>\n<html lang=\"en\"><head><meta charset=\"utf-8\">\n"
            "<meta name=\"viewport\" content=\"width=device-width, initial-scale=1\">\n"
            "<title>Partition survey of " +
            shown(member(summary, "console_host")) + ", " + shown(member(summary, "started")) +
            "</title>\n<style>";
    page += pageStyle;
    page += "</style></head>\n<body>\n";
}

void appendTotals(std::string& page, Json const& totals) {
    page += "<ul class=\"totals\">\n<li><b>" + std::to_string(countOf(totals, "machines")) +
            "</b>machines\n<li><b>" + std::to_string(countOf(totals, "partitions")) +
            "</b>partitions\n";
    for (OutcomeStyle const& style : outcomeStyles()) {
        page += "<li class=\"" + std::string(style.cssClass) + "\" data-outcome=\"" + style.name +
                "\"><b>" + std::to_string(countOf(totals, style.name)) + "</b>" + style.label +
                "\n";
    }
    page += "</ul>\n";
}

void appendHeader(std::string& page, Json const& summary) {
    Json const& interrupted = member(summary, "interrupted");
    page += "<header>\n<h1>Partition survey <span>of console " +
            shown(member(summary, "console_host")) + "</span></h1>\n<p class=\"run\">Started <b>" +
            shown(member(summary, "started")) + "</b>, ended <b>" +
            shown(member(summary, "ended")) + "</b> (" +
            secondsText(member(summary, "elapsed_seconds")) + " s) &middot; overall code <b>" +
            shown(member(summary, "return_code")) + "</b>" +
            (interrupted.is_null() ? ""
                                   : " &middot; <b>interrupted by " + shown(interrupted) + "</b>") +
            " &middot; options: <b>" + optionsText(summary) + "</b></p>\n";
    appendTotals(page, member(summary, "totals"));
    page += "</header>\n<main>\n";
}

std::string barOf(Json const& counts) {
    long long const partitions = countOf(counts, "partitions");
    std::string bar = "<div class=\"bar\">";
    std::string described;
    for (OutcomeStyle const& style : outcomeStyles()) {
        long long const count = countOf(counts, style.name);
        if (count <= 0 || partitions <= 0) {
            continue;
        }
        char width[32] = {};
        std::snprintf(width, sizeof width, "%.3f%%",
                      100.0 * static_cast<double>(count) / static_cast<double>(partitions));
        std::string const text = std::to_string(count) + " " + style.label;
        bar += "<i class=\"" + std::string(style.cssClass) + "\" style=\"width:" + width +
               "\" title=\"" + text + "\"></i>";
        described += (described.empty() ? "" : ", ") + text;
    }
    return bar + "</div><td class=\"legend\">" + (described.empty() ? "none listed" : described);
}

void appendMachines(std::string& page, Json const& machines) {
    page += "<section id=\"machines\"><h2>Machines</h2>\n<table class=\"machines\"><thead><tr>"
            "<th>Machine<th>Code<th class=\"num\">Partitions<th class=\"bar-cell\">Outcomes"
            "<th>Counts</thead>\n<tbody>\n";
    std::size_t index = 0;
    for (Json const& machine : machines) {
        Json const& counts = member(machine, "counts");
        std::string const identity = shown(member(machine, "identity"));
        std::string const code = shown(member(machine, "return_code"));
        bool const hasRows = !member(machine, "partitions").empty();
        page += R"(<tr><th scope="row">)";
        if (hasRows) {
            page += R"(<a href="#m)" + std::to_string(index) + R"(" data-machine=")";
            page += identity;
            page += R"(">)";
            page += identity;
            page += "</a>";
        } else {
            page += identity;
        }
        page += R"(<td class="code code)";
        page += code;
        page += R"(">)";
        page += code;
        page += R"(<td class="num">)" + std::to_string(countOf(counts, "partitions")) +
                R"(<td class="bar-cell">)" + barOf(counts) + "\n";
        ++index;
    }
    page += "</tbody></table>\n<p class=\"legend\">";
    for (OutcomeStyle const& style : outcomeStyles()) {
        page += "<span class=\"key " + std::string(style.cssClass) + "\"></span>" + style.label;
    }
    page += "</p></section>\n";
}

void appendFilters(std::string& page, Json const& machines) {
    page += "<form id=\"filters\" class=\"controls\" hidden>\n";
    for (OutcomeStyle const& style : outcomeStyles()) {
        page += R"(<label><input type="checkbox" name="o" value=")" + std::string(style.cssClass) +
                R"(" checked><span class="key )" + style.cssClass + R"("></span>)" + style.label +
                "</label>\n";
    }
    page += R"(<label>Machine <select id="machine"><option value="">all</option>)";
    for (Json const& machine : machines) {
        std::string const identity = shown(member(machine, "identity"));
        page += R"(<option value=")";
        page += identity;
        page += R"(">)";
        page += identity;
        page += "</option>";
    }
    page += "</select></label>\n<label>Text <input type=\"search\" id=\"q\" "
            "placeholder=\"host, IP, status, reason…\"></label>\n<span id=\"count\"></span>\n"
            "</form>\n";
}

void appendPartitionRow(std::string& page, Json const& partition, std::string const& identity,
                        std::string const& anchor, std::string const& documentFolder) {
    OutcomeStyle const style = styleOf(shown(member(partition, "outcome")));
    page += "<tr";
    page += anchor;
    page += " class=";
    page += style.cssClass;
    page += "><td>" + identity + "<td>" + shown(member(partition, "id")) + "<td>" +
            shown(member(partition, "host")) + "<td>" + shown(member(partition, "ip")) + "<td>" +
            style.label + "<td>" + shown(member(partition, "status_text")) + "<td>" +
            secondsText(member(partition, "seconds")) + "<td>";
    Json const& document = member(partition, "document");
    if (document.is_string()) {
        std::string const path = document.get<std::string>();
        std::string const file = path.substr(path.rfind('/') + 1);
        page += "<a href=\"" + escapeHtml(urlPath(documentFolder + "/" + file)) + "\">XML</a>";
    }
    page += "<td>";
    Json const& reason = member(partition, "reason");
    if (reason.is_string()) {
        page += "<details><summary>reason</summary><pre>" + withoutTrailingBlanks(shown(reason)) +
                "</pre></details>";
    }
    // Closed, so that the line end is not part of the last cell.
    page += "</tr>\n";
}

void appendPartitions(std::string& page, Json const& machines, std::string const& documentFolder) {
    page += "<section id=\"partitions\"><h2>Partitions</h2>\n";
    appendFilters(page, machines);
    page += "<div id=\"live\"></div>\n<noscript id=\"rows\"><table class=\"parts\"><colgroup><col "
            "class=\"m\"><col class=\"id\"><col class=\"h\">"
            "<col class=\"ip\"><col class=\"o\"><col class=\"st\"><col class=\"sec\">"
            "<col class=\"d\"><col class=\"r\"></colgroup>\n<thead><tr><th>Machine"
            "<th data-type=\"number\">ID<th>Host<th data-type=\"ip\">IP<th>Outcome<th>Status"
            "<th data-type=\"number\">Seconds<th>Document<th>Reason</thead>\n<tbody>\n";
    std::size_t index = 0;
    for (Json const& machine : machines) {
        std::string const identity = shown(member(machine, "identity"));
        std::string anchor = " id=m" + std::to_string(index);
        for (Json const& partition : member(machine, "partitions")) {
            appendPartitionRow(page, partition, identity, anchor, documentFolder);
            anchor.clear();
        }
        ++index;
    }
    page += "</tbody></table></noscript>\n<p id=\"more\" hidden><button type=\"button\">Show "
            "more</button>"
            "</p>\n</section>\n";
}

void appendFooter(std::string& page, Json const& summary) {
    page += "</main>\n<footer>Written by " + shown(member(summary, "tool")) + " " +
            shown(member(summary, "version")) +
            " &middot; the same data: partitions.csv and summary.json beside this page</footer>"
            "\n<script>";
    page += pageScript;
    page += "</script>\n</body></html>\n";
}

std::size_t expectedSize(Json const& summary) {
    constexpr std::size_t bytesPerRow = 260;
    constexpr std::size_t headAndMachines = std::size_t{64} * 1024;
    return headAndMachines +
           bytesPerRow * static_cast<std::size_t>(countOf(member(summary, "totals"), "partitions"));
}

} // namespace

std::string reportPage(Json const& summary, std::string const& documentFolder) {
    std::string page;
    page.reserve(expectedSize(summary));
    appendHead(page, summary);
    appendHeader(page, summary);
    Json const& machines = member(summary, "machines");
    appendMachines(page, machines);
    appendPartitions(page, machines, documentFolder);
    appendFooter(page, summary);
    return page;
}

} // namespace report
