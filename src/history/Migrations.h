#pragma once

#include <SQLiteCpp/Database.h>

#include <cstdint>

namespace history {

// The schema of the history database and the steps between its versions
// (src/history/migrations/NNNN-what.sql, written into the program at build
// time). PRAGMA user_version holds a database's version: 0 for an empty
// file. PRAGMA application_id marks the file as a quorvex-survey history,
// so that no other program's database is taken for one.

// "QVSH" as a big-endian number: the file's bytes 68 to 71, which file(1)
// and a person with a hex viewer can read.
constexpr std::int32_t gc_ApplicationId = 0x51565348;

// The version the newest migration takes a database to.
int newestSchemaVersion();

// The database's schema version (PRAGMA user_version).
int schemaVersion(SQLite::Database& database);

// Brings the database from its version to targetVersion, one migration at a
// time, each in a transaction of its own that also sets user_version (and,
// from an empty file, the application id): a migration that fails, or a
// process killed in the middle of one, leaves the version before it. The
// version is read again once the transaction holds the write lock, so two
// programs opening the same old database run each step once.
void migrate(SQLite::Database& database, int targetVersion = newestSchemaVersion());

} // namespace history
