#pragma once

#include <nlohmann/json.hpp>

#include <string>

namespace report {

// index.html of a summary: one self-contained page (style and script inline,
// nothing fetched) that reads fully without script: a header with the run's
// times, the console, the options and the totals; one row per machine with
// a stacked bar of its outcomes, its code and a link to its first partition
// row; the table of every partition with its reason in a <details> element.
// The script only adds sorting, filters and paging. Every console text is
// escaped for HTML. documentFolder is the folder of the VPD documents as a
// URL relative to the page ("../VPD"); each document links to its file there.
std::string reportPage(nlohmann::ordered_json const& summary, std::string const& documentFolder);

} // namespace report
