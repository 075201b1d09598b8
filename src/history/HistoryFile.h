#pragma once

#include "history/HistoryDatabase.h"
#include "history/Migrations.h"
#include "history/SqliteFailure.h"

#include <SQLiteCpp/Database.h>
#include <SQLiteCpp/Exception.h>

#include <cstdint>
#include <string>

namespace history {

// Opening the history database for the history command, and the exit
// statuses it ends with (sysexits.h's numbers, docs/history.md).

// A bad command line, or a run or partition it names that is not there.
inline constexpr int gc_ExitUsage = 64;
// The file is not a quorvex-survey history, is damaged, or has a newer schema.
inline constexpr int gc_ExitDataError = 65;
// The file is missing or cannot be read.
inline constexpr int gc_ExitNoInput = 66;
// An export's file cannot be written.
inline constexpr int gc_ExitCannotCreate = 73;
// The database could not be read or changed for another reason.
inline constexpr int gc_ExitIoError = 74;
// Another process held the database for longer than the busy timeout.
inline constexpr int gc_ExitTemporaryFailure = 75;

// The history in path, opened read-only, once it is known to be a
// quorvex-survey history of a schema this command reads; throws
// UnusableHistory saying why not.
SQLite::Database openHistoryForReading(std::string const& path);

// The same, opened for writing (prune), with foreign keys enforced so that
// a run's rows go with it.
SQLite::Database openHistoryForWriting(std::string const& path);

// The UnusableHistory a failure of SQLite on path amounts to: a damaged
// file, a lock held too long, or another failure to read or write.
[[noreturn]] void throwUnusable(std::string const& path, SQLite::Exception const& failure);

} // namespace history
