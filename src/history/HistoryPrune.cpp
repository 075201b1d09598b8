#include "history/HistoryPrune.h"

#include <SQLiteCpp/Statement.h>
#include <SQLiteCpp/Transaction.h>
#include <cstdint>

namespace history {

namespace {

// The runs beyond the newest `keep` of their console.
long long removeAllButNewest(SQLite::Database& database, std::size_t keep) {
    SQLite::Statement remove(database,
                             "DELETE FROM runs WHERE id IN (SELECT id FROM (SELECT id,"
                             " row_number() OVER (PARTITION BY console ORDER BY id DESC) AS age"
                             " FROM runs) WHERE age > ?1)");
    remove.bind(1, static_cast<std::int64_t>(keep));
    return remove.exec();
}

long long removeStartedBefore(SQLite::Database& database, long long moment) {
    SQLite::Statement remove(database, "DELETE FROM runs WHERE started_unix < ?1");
    remove.bind(1, static_cast<std::int64_t>(moment));
    return remove.exec();
}

long long pragmaNumber(SQLite::Database& database, char const* pragma) {
    return database.execAndGet(std::string("PRAGMA ") + pragma).getInt64();
}

// VACUUM rewrites the whole file, worth it only when much of it is free.
void giveSpaceBack(SQLite::Database& database) {
    database.exec("PRAGMA wal_checkpoint(TRUNCATE)");
    if (pragmaNumber(database, "freelist_count") * 4 > pragmaNumber(database, "page_count")) {
        database.exec("VACUUM");
        database.exec("PRAGMA wal_checkpoint(TRUNCATE)");
    }
}

} // namespace

PruneResult pruneRuns(SQLite::Database& database, PruneSelection const& selection) {
    PruneResult result;
    // The write lock is taken at once, waiting out a run that is recording.
    SQLite::Transaction transaction(database, SQLite::TransactionBehavior::IMMEDIATE);
    if (selection.keep) {
        result.removed = removeAllButNewest(database, *selection.keep);
    } else {
        result.removed = removeStartedBefore(database, *selection.beforeUnix);
    }
    result.kept = database.execAndGet("SELECT count(*) FROM runs").getInt64();
    transaction.commit();
    giveSpaceBack(database);
    return result;
}

std::string pruneText(PruneResult const& result) {
    return "Removed " + std::to_string(result.removed) +
           (result.removed == 1 ? " run, kept " : " runs, kept ") + std::to_string(result.kept) +
           ".\n";
}

nlohmann::ordered_json pruneJson(PruneResult const& result) {
    return {{"removed", result.removed}, {"kept", result.kept}};
}

} // namespace history
