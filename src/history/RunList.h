#pragma once

#include <SQLiteCpp/Database.h>
#include <nlohmann/json.hpp>

#include <cstddef>
#include <optional>
#include <string>

namespace history {

// "history runs": the recorded runs, oldest first, with the changes each
// brought counted.

// The columns every listing of runs gives, for a query "FROM runs r": the
// run's own, its length in seconds and its counts of events.
inline constexpr char gc_RunColumns[] =
    "r.id, r.console, r.started, r.ended,"
    " CAST(round((julianday(r.ended) - julianday(r.started)) * 86400) AS INTEGER),"
    " r.exit_status, r.return_code, r.interrupted, r.partitions, r.surveyed, r.failed,"
    " (SELECT count(*) FROM events e WHERE e.run_id = r.id AND e.scope = 'partition'"
    " AND e.kind = 'newly_failing'),"
    " (SELECT count(*) FROM events e WHERE e.run_id = r.id AND e.scope = 'partition'"
    " AND e.kind = 'recovered'),"
    " (SELECT count(*) FROM events e WHERE e.run_id = r.id AND e.scope = 'component')";

// The keys of a run in the JSON forms, in gc_RunColumns' order.
inline constexpr char const* gc_RunKeys[] = {
    "id",          "console",          "started",    "ended",    "seconds", "exit_status",
    "return_code", "interrupted",      "partitions", "surveyed", "failed",  "new_failures",
    "recoveries",  "inventory_changes"};

struct RunSelection {
    // Only this console's runs.
    std::optional<std::string> console;
    // The newest this many; 0 for all.
    std::size_t last = 20;
};

// The table of the selected runs for a terminal width columns wide (0: no
// limit).
std::string runListText(SQLite::Database& database, RunSelection const& selection,
                        std::size_t width);

// {"runs": [{gc_RunKeys...}]}, oldest first.
nlohmann::ordered_json runListJson(SQLite::Database& database, RunSelection const& selection);

} // namespace history
