#pragma once

#include "report/SinceLastRun.h"

#include <nlohmann/json.hpp>

#include <optional>

#include <set>
#include <string>

namespace report {

// index.html of a summary: one self-contained page (style and script inline,
// nothing fetched) that reads fully without script: a header with the run's
// times, the console, the options and the totals; one row per machine with
// a stacked bar of its outcomes, its code and a link to its first partition
// row; the table of every partition with its reason in a <details> element.
// The script only adds sorting, filters and paging. Every console text is
// escaped for HTML. linkedDocuments are the documents, as the summary names
// them, that have a copy in the report folder's documents/ (copyDocuments());
// each links to its copy relative to the page.
//
// With since, the page shows the history too: the section "Since the last
// run" above the tables and the columns "Failing since" and "Last surveyed";
// without it, it is the page as it was before there was a history.
std::string reportPage(nlohmann::ordered_json const& summary,
                       std::set<std::string> const& linkedDocuments,
                       std::optional<SinceLastRun> const& since = std::nullopt);

} // namespace report
