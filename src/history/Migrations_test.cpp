#include "history/Migrations.h"

#include "QuorvexTest.h"
#include "history/HistoryDatabase.h"
#include "history/MigrationTexts.h"

#include <SQLiteCpp/Statement.h>

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

// The schema as SQLite keeps it: every object's type, name and statement.
std::vector<std::string> schemaOf(SQLite::Database& database) {
    SQLite::Statement query(database, "SELECT type || ' ' || name || ': ' || coalesce(sql, '') "
                                      "FROM sqlite_master ORDER BY type, name");
    std::vector<std::string> objects;
    while (query.executeStep()) {
        objects.push_back(query.getColumn(0).getString());
    }
    return objects;
}

std::vector<std::string> newestSchema(std::string const& path) {
    return schemaOf(history::HistoryDatabase(path).connection());
}

TEST(Migrations, NumberedFromOneWithoutGap) {
    int expected = 1;
    for (history::MigrationText const& migration : history::gc_MigrationTexts) {
        EXPECT_EQ(migration.version, expected++) << migration.name;
    }
    EXPECT_EQ(history::newestSchemaVersion(), expected - 1);
}

TEST(Migrations, EachStepSetsItsOwnVersion) {
    QuorvexTest::TemporaryDirectory const work;
    SQLite::Database database(work.file("h.sqlite"), SQLite::OPEN_READWRITE | SQLite::OPEN_CREATE);
    EXPECT_EQ(history::schemaVersion(database), 0);
    for (int version = 1; version <= history::newestSchemaVersion(); ++version) {
        history::migrate(database, version);
        EXPECT_EQ(history::schemaVersion(database), version);
    }
}

// A database left at each earlier version (0: an empty file) opens at the
// newest, with the same schema as one made afresh and its rows kept.
TEST(Migrations, EveryEarlierVersionIsBroughtToTheNewest) {
    QuorvexTest::TemporaryDirectory const work;
    std::vector<std::string> const fresh = newestSchema(work.file("fresh.sqlite"));
    for (int version = 0; version < history::newestSchemaVersion(); ++version) {
        std::string const path = work.file("from-" + std::to_string(version) + ".sqlite");
        {
            SQLite::Database old(path, SQLite::OPEN_READWRITE | SQLite::OPEN_CREATE);
            history::migrate(old, version);
        }
        history::HistoryDatabase database(path);
        EXPECT_EQ(history::schemaVersion(database.connection()), history::newestSchemaVersion())
            << "from version " << version;
        EXPECT_EQ(schemaOf(database.connection()), fresh) << "from version " << version;
        EXPECT_EQ(database.connection().execAndGet("PRAGMA application_id").getInt(),
                  history::gc_ApplicationId);
    }
}

// Runs recorded under version 1 are still there after every later step.
TEST(Migrations, RunsOfTheFirstVersionAreKept) {
    QuorvexTest::TemporaryDirectory const work;
    std::string const path = work.file("h.sqlite");
    {
        SQLite::Database old(path, SQLite::OPEN_READWRITE | SQLite::OPEN_CREATE);
        history::migrate(old, 1);
        old.exec("INSERT INTO runs (console, tool, started, ended, started_unix, recorded_unix, "
                 "return_code, partitions, surveyed, failed, summary) VALUES ('hmc1', "
                 "'quorvex-survey', 's', 'e', 1, 2, '0', 0, 0, 0, '{}')");
    }
    history::HistoryDatabase database(path);
    EXPECT_EQ(database.connection().execAndGet("SELECT console FROM runs").getString(), "hmc1");
}

TEST(Migrations, ApplicationIdSpellsQvsh) {
    EXPECT_EQ(history::gc_ApplicationId, ('Q' << 24) | ('V' << 16) | ('S' << 8) | 'H');
}

} // namespace
