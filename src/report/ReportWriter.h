#pragma once

#include "report/DocumentCopies.h"
#include "report/SinceLastRun.h"

#include <nlohmann/json.hpp>

#include <optional>
#include <string>

namespace report {

// Writes the report of a summary into folder (made when missing):
// index.html, partitions.csv and summary.json, each through a temporary
// name renamed when complete, and a copy of each document the summary names
// from vpdFolder in folder/documents, where the page links to them: the
// folder holds all the page needs wherever it is copied. Throws util::SystemError
// when the folder cannot be made or a file cannot be written. placement:
// whether the documents are copied or linked (see DocumentPlacement).
//
// A folder that already holds a report keeps it: its index.html,
// partitions.csv and summary.json are renamed first to index-<time>.html,
// partitions-<time>.csv and summary-<time>.json, where <time> is the start of
// the run they describe (their summary's "started" without colons, such as
// 2026-11-24T133210+0100; the page's modification time when that summary
// cannot be read), with "-2", "-3"... added when a report of that time is
// already kept. Nothing is ever replaced; earlier reports stay until removed.
//
// With since (the run's changes from the history database), the page shows
// what changed since the last run and the CSV two columns more; without it,
// both are what they were before there was a history.
void writeReport(nlohmann::ordered_json const& summary, std::string const& vpdFolder,
                 std::string const& folder, std::optional<SinceLastRun> const& since = std::nullopt,
                 DocumentPlacement placement = DocumentPlacement::copy);

} // namespace report
