#pragma once

#include <nlohmann/json.hpp>

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
std::string partitionsCsv(nlohmann::ordered_json const& summary);

// The same table in parts, for a CSV that adds columns of its own (the
// estate's console columns before these).
using CsvRows = std::vector<std::vector<std::string>>;
std::vector<std::string> partitionsCsvHeader();
CsvRows partitionsCsvRows(nlohmann::ordered_json const& summary);
// Appends one row of fields as partitionsCsv writes rows: quoted where
// needed, ending with CRLF.
void appendCsvRow(std::string& csv, std::vector<std::string> const& fields);

} // namespace report
