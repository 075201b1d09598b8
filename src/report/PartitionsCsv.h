#pragma once

#include "report/SinceLastRun.h"

#include <nlohmann/json.hpp>

#include <optional>
#include <string>
#include <vector>

namespace report {

// partitions.csv of a summary: a header row, then one row per listed
// partition of every machine, in the summary's order. RFC 4180: fields
// holding a comma, a double quote, CR or LF are quoted with inner quotes
// doubled, and every row ends with CRLF; the text is UTF-8. Columns:
// machine, machine_return_code, partition_id, host, ip, active_status,
// outcome, status_text, return_code, rc, rc_cmd, seconds, document, reason;
// a value the summary has as null is an empty field. A machine whose
// partition listing failed has a row of its own before its partitions, and a
// run whose machine listing failed one row without machine: the outcome
// listing_failed and the failure (command, exit status, the console's
// message) as the reason, every partition field empty.
//
// With the history (since, unless it could not be read), two columns follow
// at the end: failing_since and last_surveyed, the start (as the summaries
// write it) of the failing streak's first run and of the latest run that
// surveyed the partition, empty when there is none. Without it, the columns
// are those above alone.
std::string partitionsCsv(nlohmann::ordered_json const& summary,
                          std::optional<SinceLastRun> const& since = std::nullopt);

// The same table in parts, for a CSV that adds columns of its own (the
// estate's console columns before these).
using CsvRows = std::vector<std::vector<std::string>>;
std::vector<std::string>
partitionsCsvHeader(std::optional<SinceLastRun> const& since = std::nullopt);
CsvRows partitionsCsvRows(nlohmann::ordered_json const& summary,
                          std::optional<SinceLastRun> const& since = std::nullopt);
// Appends one row of fields as partitionsCsv writes rows: quoted where
// needed, ending with CRLF.
void appendCsvRow(std::string& csv, std::vector<std::string> const& fields);

// One field of an RFC 4180 row: as it is, or quoted with inner quotes
// doubled when it holds a comma, a double quote, CR or LF.
std::string csvField(std::string const& text);

} // namespace report
