#pragma once

#include "history/RunPair.h"

#include <SQLiteCpp/Database.h>

namespace history {

// Inserts the component events of the run: for each partition whose
// inventory the run read whole, the changes since the partition's latest
// inventory read whole in an earlier run of the console, when its document
// differs from that one (docs/history.md, "Changes").
void insertComponentEvents(SQLite::Database& db, RunPair const& runs);

} // namespace history
