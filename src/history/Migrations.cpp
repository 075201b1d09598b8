#include "history/Migrations.h"

#include "history/MigrationTexts.h"

#include <SQLiteCpp/Transaction.h>

#include <iterator>
#include <string>

namespace history {

namespace {

void runMigration(SQLite::Database& database, MigrationText const& migration) {
    SQLite::Transaction transaction(database, SQLite::TransactionBehavior::IMMEDIATE);
    int const version = schemaVersion(database);
    if (version >= migration.version) {
        return;
    }
    database.exec(std::string(*migration.statements));
    if (version == 0) {
        database.exec("PRAGMA application_id = " + std::to_string(gc_ApplicationId));
    }
    database.exec("PRAGMA user_version = " + std::to_string(migration.version));
    transaction.commit();
}

} // namespace

int newestSchemaVersion() {
    return std::prev(std::end(gc_MigrationTexts))->version;
}

int schemaVersion(SQLite::Database& database) {
    return database.execAndGet("PRAGMA user_version").getInt();
}

void migrate(SQLite::Database& database, int targetVersion) {
    for (MigrationText const& migration : gc_MigrationTexts) {
        if (migration.version <= targetVersion && migration.version > schemaVersion(database)) {
            runMigration(database, migration);
        }
    }
}

} // namespace history
