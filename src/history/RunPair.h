#pragma once

#include <SQLiteCpp/Database.h>
#include <SQLiteCpp/Statement.h>

#include <optional>
#include <string>

namespace history {

// A run and the console's previous run: the latest run of the same console
// with a smaller id (recording order, whatever the clocks said). A
// console's first run has none. Each machine's changes are computed against
// its own previous record (previousRecords()), which a run of other machines
// does not move.
struct RunPair {
    long long run = 0;
    std::optional<long long> previous;
    std::string console;
};

// Binds the run (":run") and the console (":console") to those of the two
// parameters the statement uses.
void bindRuns(SQLite::Statement& statement, RunPair const& runs);

// The common table expression "previous (machine, run_id, listed)", for a
// statement that starts with "WITH " and binds the runs:
// - each machine of the run, listed 1, with its previous record: the latest
//   earlier run of the console that listed it (null when none did);
// - when the run listed every machine of the console (runs.all_machines),
//   each machine it did not list that some run listed since the console's
//   previous run of every machine, listed 0, with its latest record: the
//   machines gone from the console.
std::string const& previousRecords();

// Runs one statement with the runs bound.
void executeForRuns(SQLite::Database& db, std::string const& sql, RunPair const& runs);

} // namespace history
