#include "report/OutcomeMarks.h"

#include "report/JsonMember.h"
#include "report/Outcome.h"

#include <cstdio>

namespace report {

using Json = nlohmann::ordered_json;

long long countOf(Json const& counts, char const* name) {
    Json const& value = member(counts, name);
    return value.is_number_integer() ? value.get<long long>() : 0;
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

// A counts object's bar: one item per outcome present, kept
// whole on its line ("1 channel failure"), so the cell wraps between items.
std::string outcomeBar(Json const& counts) {
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
        described += "<span><span class=\"key " + std::string(outcome.pageClass) + "\"></span>" +
                     text + "</span> ";
    }
    return bar + "</div><p class=\"counts\">" +
           (described.empty() ? "none listed" : described.substr(0, described.size() - 1)) + "</p>";
}

// The outcomes' keys, and the mark of a machine whose listing failed, each
// key kept on the line of its name.
void appendOutcomeKeys(std::string& page) {
    for (OutcomeText const& outcome : outcomeTable()) {
        page += "<span><span class=\"key " + std::string(outcome.pageClass) + "\"></span>" +
                outcome.label + "</span> ";
    }
    page += R"(<span><span class="key listing-failed"></span>listing failed</span>)";
}

} // namespace report
