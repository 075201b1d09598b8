#include "report/PartitionsCsv.h"

#include "report/HistoryPartitionNames.h"
#include "report/JsonMember.h"
#include "report/ListingFailure.h"
#include "utility/TextSafety.h"

#include <algorithm>
#include <iterator>
#include <vector>

namespace report {

using util::validUtf8;

using Json = nlohmann::ordered_json;

namespace {

constexpr char gc_RowEnd[] = "\r\n";

std::vector<std::string> const& partitionColumns() {
    static std::vector<std::string> const columns = {
        "host", "ip",     "active_status", "outcome",  "status_text", "return_code",
        "rc",   "rc_cmd", "seconds",       "document", "reason"};
    return columns;
}

std::string fieldText(Json const& value) {
    if (value.is_null()) {
        return "";
    }
    if (value.is_string()) {
        return validUtf8(value.get<std::string>());
    }
    return value.dump();
}

// The row of a machine whose partition listing failed, or of a run whose
// machine listing failed (no machine, no code): no partition, the outcome
// listing_failed, the failure as the reason.
void addListingFailure(CsvRows& rows, Json const& failure, std::string const& machine,
                       std::string const& machineCode, bool withHistory) {
    if (failure.is_null()) {
        return;
    }
    std::vector<std::string> row = {machine, machineCode, ""};
    std::transform(partitionColumns().begin(), partitionColumns().end(), std::back_inserter(row),
                   [&failure](std::string const& column) {
                       return column == "outcome"  ? std::string(gc_ListingFailedName)
                              : column == "reason" ? validUtf8(listingFailureText(failure))
                                                   : std::string();
                   });
    if (withHistory) {
        row.insert(row.end(), {"", ""});
    }
    rows.push_back(std::move(row));
}

bool hasHistory(std::optional<SinceLastRun> const& since) {
    return since && !since->unavailable;
}

// The history's two fields of a partition.
std::vector<std::string> historyFields(SinceLastRun const& since, std::string const& machine,
                                       std::string const& partition) {
    auto const found = since.partitions.find({machine, partition});
    if (found == since.partitions.end()) {
        return {"", ""};
    }
    return {validUtf8(found->second.failingSince.value_or("")),
            validUtf8(found->second.lastSurveyed.value_or(""))};
}

// A machine's partition rows; with the history, its fields at the end.
void addPartitions(CsvRows& rows, Json const& machine, std::optional<SinceLastRun> const& since) {
    Json const& partitions = member(machine, "partitions");
    std::string const identity = historyMachineName(machine);
    std::vector<std::string> const names = historyPartitionNames(partitions);
    std::size_t index = 0;
    for (Json const& partition : partitions) {
        std::vector<std::string> row = {fieldText(member(machine, "identity")),
                                        fieldText(member(machine, "return_code")),
                                        fieldText(member(partition, "id"))};
        std::transform(partitionColumns().begin(), partitionColumns().end(),
                       std::back_inserter(row), [&](std::string const& column) {
                           return fieldText(member(partition, column.c_str()));
                       });
        if (hasHistory(since)) {
            std::vector<std::string> const fields = historyFields(*since, identity, names[index]);
            row.insert(row.end(), fields.begin(), fields.end());
        }
        rows.push_back(std::move(row));
        ++index;
    }
}

} // namespace

std::string csvField(std::string const& text) {
    if (text.find_first_of(",\"\r\n") == std::string::npos) {
        return text;
    }
    std::string quoted = "\"";
    for (char const character : text) {
        quoted += character;
        if (character == '"') {
            quoted += '"';
        }
    }
    return quoted + "\"";
}

void appendCsvRow(std::string& csv, std::vector<std::string> const& fields) {
    for (std::size_t i = 0; i < fields.size(); ++i) {
        if (i > 0) {
            csv += ',';
        }
        csv += csvField(fields[i]);
    }
    csv += gc_RowEnd;
}

std::vector<std::string> partitionsCsvHeader(std::optional<SinceLastRun> const& since) {
    std::vector<std::string> header = {"machine", "machine_return_code", "partition_id"};
    header.insert(header.end(), partitionColumns().begin(), partitionColumns().end());
    if (hasHistory(since)) {
        header.insert(header.end(), {"failing_since", "last_surveyed"});
    }
    return header;
}

CsvRows partitionsCsvRows(Json const& summary, std::optional<SinceLastRun> const& since) {
    CsvRows rows;
    for (Json const& machine : member(summary, "machines")) {
        addListingFailure(rows, member(machine, "listing_failure"),
                          fieldText(member(machine, "identity")),
                          fieldText(member(machine, "return_code")), hasHistory(since));
        addPartitions(rows, machine, since);
    }
    if (member(summary, "machines").empty()) {
        addListingFailure(rows, member(summary, "listing_failure"), "", "", hasHistory(since));
    }
    return rows;
}

std::string partitionsCsv(Json const& summary, std::optional<SinceLastRun> const& since) {
    std::string csv;
    appendCsvRow(csv, partitionsCsvHeader(since));
    for (std::vector<std::string> const& row : partitionsCsvRows(summary, since)) {
        appendCsvRow(csv, row);
    }
    return csv;
}

} // namespace report
