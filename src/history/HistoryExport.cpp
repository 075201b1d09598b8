#include "history/HistoryExport.h"

#include "history/ChangeList.h"
#include "history/ColumnValue.h"
#include "history/RunList.h"
#include "report/PartitionsCsv.h"

#include <SQLiteCpp/Statement.h>
#include <cstdint>
#include <nlohmann/json.hpp>

#include <iterator>
#include <vector>

namespace history {

namespace {

using Json = nlohmann::ordered_json;

// The version of the export's JSON document and of its columns.
constexpr int gc_ExportSchemaVersion = 1;

constexpr char const* gc_PartitionKeys[] = {
    "run",          "console",          "machine",           "partition",     "partition_id",
    "ip",           "outcome",          "status_text",       "reason",        "seconds",
    "document",     "inventory",        "inventory_problem", "document_hash", "failing_since_run",
    "runs_failing", "last_surveyed_run"};

// What is exported: the query, whose first parameter is the earliest start
// and the second the console, and the names of its columns.
struct ExportQuery {
    std::string sql;
    std::vector<std::string> keys;
};

template <std::size_t Count> std::vector<std::string> keyList(char const* const (&keys)[Count]) {
    return std::vector<std::string>(std::begin(keys), std::end(keys));
}

constexpr char gc_RunFilter[] =
    " WHERE r.started_unix >= coalesce(?1, r.started_unix) AND (?2 IS NULL OR r.console = ?2)";

ExportQuery exportQuery(std::string const& what) {
    if (what == "changes") {
        return {std::string("SELECT e.run_id, r.console, e.scope, e.kind, e.machine, e.partition,"
                            " e.component, e.component_name, e.property, e.old_value,"
                            " e.new_value, e.outcome, e.reason, e.failing_since_run,"
                            " e.runs_failing FROM runs r JOIN events e ON e.run_id = r.id") +
                    gc_RunFilter + " ORDER BY e.run_id, e.id",
                keyList(gc_EventKeys)};
    }
    if (what == "partitions") {
        return {std::string("SELECT p.run_id, r.console, p.machine, p.partition, p.partition_id,"
                            " p.ip, p.outcome, p.status_text, p.reason, p.seconds, p.document,"
                            " p.inventory, p.inventory_problem, p.document_hash,"
                            " p.failing_since_run, p.runs_failing, p.last_surveyed_run"
                            " FROM runs r JOIN partition_results p ON p.run_id = r.id") +
                    gc_RunFilter + " ORDER BY p.run_id, p.machine, p.partition",
                keyList(gc_PartitionKeys)};
    }
    return {std::string("SELECT ") + gc_RunColumns + " FROM runs r" + gc_RunFilter +
                " ORDER BY r.id",
            keyList(gc_RunKeys)};
}

SQLite::Statement boundQuery(SQLite::Database& database, ExportQuery const& what,
                             ExportSelection const& selection) {
    SQLite::Statement query(database, what.sql);
    if (selection.sinceUnix) {
        query.bind(1, static_cast<std::int64_t>(*selection.sinceUnix));
    }
    if (selection.console) {
        query.bind(2, *selection.console);
    }
    return query;
}

void writeCsvRow(std::ostream& out, std::vector<std::string> const& fields) {
    for (std::size_t i = 0; i < fields.size(); ++i) {
        out << (i == 0 ? "" : ",") << report::csvField(fields[i]);
    }
    out << "\r\n";
}

void writeCsv(SQLite::Statement& query, std::vector<std::string> const& keys, std::ostream& out) {
    writeCsvRow(out, keys);
    std::vector<std::string> fields(keys.size());
    while (query.executeStep()) {
        for (std::size_t i = 0; i < keys.size(); ++i) {
            fields[i] = textValue(query.getColumn(static_cast<int>(i)));
        }
        writeCsvRow(out, fields);
    }
}

void writeJson(SQLite::Statement& query, std::vector<std::string> const& keys,
               ExportSelection const& selection, std::ostream& out) {
    Json rows = Json::array();
    while (query.executeStep()) {
        Json row = Json::object();
        for (std::size_t i = 0; i < keys.size(); ++i) {
            row[keys[i]] = jsonValue(query.getColumn(static_cast<int>(i)));
        }
        rows.push_back(std::move(row));
    }
    Json const document = {
        {"schema_version", gc_ExportSchemaVersion},
        {"what", selection.what},
        {"since", selection.sinceUnix ? Json(selection.sinceText) : Json(nullptr)},
        {"console", selection.console ? Json(*selection.console) : Json(nullptr)},
        {"rows", std::move(rows)}};
    out << document.dump(2, ' ', false, Json::error_handler_t::replace) << "\n";
}

} // namespace

void writeExport(SQLite::Database& database, ExportSelection const& selection, std::ostream& out) {
    ExportQuery const what = exportQuery(selection.what);
    SQLite::Statement query = boundQuery(database, what, selection);
    if (selection.format == "csv") {
        writeCsv(query, what.keys, out);
    } else {
        writeJson(query, what.keys, selection, out);
    }
}

} // namespace history
