#pragma once

#include "history/HistoryError.h"

#include <SQLiteCpp/Database.h>
#include <SQLiteCpp/Exception.h>

namespace history {

// How long a write waits for another process that holds the database (a
// run recording itself, a prune) before it gives up.
constexpr int gc_BusyTimeoutMilliseconds = 5000;

// The reason in plain words for a failure of SQLite on database: a
// database locked past the busy timeout says that another process holds
// it, a failure of the file system carries errno's text ("unable to open
// database file: Read-only file system").
HistoryError historyErrorOf(SQLite::Exception const& failure, SQLite::Database const& database);

} // namespace history
