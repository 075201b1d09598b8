#include "monitoring/RunChanges.h"

#include "report/HistoryBusyTimeout.h"

#include <SQLiteCpp/SQLiteCpp.h>

#include <stdexcept>

namespace monitoring {

namespace {

// Where the count of an event of this scope and kind goes; nullptr for the
// events the metrics do not count.
long long* countOf(RunChanges& changes, std::string const& scope, std::string const& kind) {
    if (scope == "partition") {
        return kind == "newly_failing" ? &changes.newFailures
               : kind == "recovered"   ? &changes.recoveries
                                       : nullptr;
    }
    if (scope != "component") {
        return nullptr;
    }
    return kind == "added"              ? &changes.componentsAdded
           : kind == "removed"          ? &changes.componentsRemoved
           : kind == "replaced"         ? &changes.componentsReplaced
           : kind == "property_changed" ? &changes.propertiesChanged
                                        : nullptr;
}

bool hasRun(SQLite::Database& database, long long runId) {
    SQLite::Statement query(database, "SELECT 1 FROM runs WHERE id = ?");
    query.bind(1, static_cast<int64_t>(runId));
    return query.executeStep();
}

RunChanges countChanges(SQLite::Database& database, long long runId) {
    SQLite::Statement query(database, "SELECT scope, kind, count(*) FROM events "
                                      "WHERE run_id = ? GROUP BY scope, kind");
    query.bind(1, static_cast<int64_t>(runId));
    RunChanges changes;
    while (query.executeStep()) {
        if (long long* const count =
                countOf(changes, query.getColumn(0).getString(), query.getColumn(1).getString())) {
            *count = query.getColumn(2).getInt64();
        }
    }
    return changes;
}

} // namespace

RunChanges runChangesOf(std::string const& databasePath, long long runId) {
    std::string const failure = "cannot read the history " + databasePath + ": ";
    try {
        // Another run recording its history may hold the database for a
        // moment: the metrics wait for it rather than go without the run's
        // changes.
        SQLite::Database database(databasePath, SQLite::OPEN_READONLY,
                                  report::gc_HistoryBusyTimeoutMilliseconds);
        if (!hasRun(database, runId)) {
            throw std::runtime_error(failure + "it holds no run " + std::to_string(runId));
        }
        return countChanges(database, runId);
    } catch (SQLite::Exception const& error) {
        throw std::runtime_error(failure + error.what());
    }
}

} // namespace monitoring
