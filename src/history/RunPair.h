#pragma once

#include <SQLiteCpp/Database.h>
#include <SQLiteCpp/Statement.h>

#include <optional>
#include <string>

namespace history {

// A run and the run its changes are computed against: the latest run of
// the same console with a smaller id (recording order, whatever the clocks
// said). A console's first run has none.
struct RunPair {
    long long run = 0;
    std::optional<long long> previous;
    std::string console;
};

// Binds the run (":run"), the previous run (":previous", null for a
// console's first run) and the console (":console") to those of the three
// parameters the statement uses.
void bindRuns(SQLite::Statement& statement, RunPair const& runs);

// Runs one statement with the runs bound.
void executeForRuns(SQLite::Database& db, std::string const& sql, RunPair const& runs);

} // namespace history
