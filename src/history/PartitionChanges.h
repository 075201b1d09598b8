#pragma once

#include "history/RunPair.h"

#include <SQLiteCpp/Database.h>

namespace history {

// Sets failing_since_run, runs_failing and last_surveyed_run of every
// partition result of the run from its record in its machine's previous
// record (docs/history.md, "Changes"): a failing partition continues or
// starts a streak, an interrupted one carries its previous state on.
void recordPartitionStates(SQLite::Database& db, RunPair const& runs);

// Inserts the run's machine and partition events, each machine's against
// its previous record; a console's first run has none, and a run of some
// machines none for the others.
void insertMachineEvents(SQLite::Database& db, RunPair const& runs);
void insertPartitionEvents(SQLite::Database& db, RunPair const& runs);

} // namespace history
