#pragma once

#include <SQLiteCpp/Database.h>
#include <nlohmann/json.hpp>

#include <cstddef>
#include <optional>
#include <string>

namespace history {

// "history changes": the events of one run, or of every run since a
// moment, grouped as an operator reads them: new failures, still failing,
// recoveries, newly inactive, appeared, disappeared, machines whose listing
// failed or recovered, and inventory changes.

struct ChangeSelection {
    // The run whose events are shown; with neither run nor since, the newest
    // run (of console, when given).
    std::optional<long long> run;
    // Every run that started at this moment or later, and the text given.
    std::optional<long long> sinceUnix;
    std::string sinceText;
    std::optional<std::string> console;
};

// The keys of an event in the JSON forms, in the order of the events
// table's columns.
inline constexpr char const* gc_EventKeys[] = {
    "run",       "console",           "scope",       "kind",      "machine",   "partition",
    "component", "component_name",    "property",    "old_value", "new_value", "outcome",
    "reason",    "failing_since_run", "runs_failing"};

// The grouped events as text for a terminal width columns wide (0: no
// limit).
std::string changeListText(SQLite::Database& database, ChangeSelection const& selection,
                           std::size_t width);

// {"run": {...}|null, "since": TEXT|null, "runs": [ids], then one array per
// group (docs/history.md)}.
nlohmann::ordered_json changeListJson(SQLite::Database& database, ChangeSelection const& selection);

// Whether the history holds the run.
bool hasRun(SQLite::Database& database, long long run);

} // namespace history
