#pragma once

#include "history/HistoryError.h"

#include <SQLiteCpp/Database.h>
#include <SQLiteCpp/Exception.h>

namespace history {

// The reason in plain words for a failure of SQLite on database: a
// database locked past the busy timeout (report/HistoryBusyTimeout.h) says
// that another process holds it, a failure of the file system carries
// errno's text ("unable to open database file: Read-only file system").
HistoryError historyErrorOf(SQLite::Exception const& failure, SQLite::Database const& database);

} // namespace history
