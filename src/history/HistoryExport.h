#pragma once

#include <SQLiteCpp/Database.h>

#include <optional>
#include <ostream>
#include <string>

namespace history {

// "history export": runs, changes or partition results as one JSON
// document or as RFC 4180 CSV, for other programs (docs/history.md).

struct ExportSelection {
    // "json" or "csv".
    std::string format = "json";
    // "runs", "changes" or "partitions".
    std::string what = "runs";
    // Only runs that started at this moment or later, and the text given.
    std::optional<long long> sinceUnix;
    std::string sinceText;
    std::optional<std::string> console;
};

// Writes the export on out. JSON: {"schema_version": 1, "what", "since",
// "console", "rows": [...]}, one object per row with the CSV's columns as
// keys. CSV: a header row of the column names, then one row per record,
// CRLF after each, null as an empty field.
void writeExport(SQLite::Database& database, ExportSelection const& selection, std::ostream& out);

} // namespace history
