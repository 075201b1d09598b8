#pragma once

#include <string>

namespace monitoring {

// What a recorded run changed, counted from the history's events table
// (src/history/migrations/0001-history.sql), for the metrics file.
struct RunChanges {
    // Partition events "newly_failing" and "recovered".
    long long newFailures = 0;
    long long recoveries = 0;
    // Component events, one count per kind.
    long long componentsAdded = 0;
    long long componentsRemoved = 0;
    long long componentsReplaced = 0;
    long long propertiesChanged = 0;
};

// The changes of run runId in the history database at databasePath, opened
// read-only with a busy timeout, as every reader of the history opens it.
// Throws std::runtime_error ("cannot read the history PATH: reason") when
// the database cannot be read or holds no run runId.
RunChanges runChangesOf(std::string const& databasePath, long long runId);

} // namespace monitoring
