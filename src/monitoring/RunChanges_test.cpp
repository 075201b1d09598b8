#include "monitoring/RunChanges.h"

#include "QuorvexTest.h"

#include <SQLiteCpp/SQLiteCpp.h>
#include <gtest/gtest.h>

#include <stdexcept>

namespace {

// A history database of schema version 1 holding runs 1 and 2 of one
// console, with the events given as (run, scope, kind).
class HistoryFile {
public:
    HistoryFile() {
        SQLite::Database database(path(), SQLite::OPEN_READWRITE | SQLite::OPEN_CREATE);
        database.exec(QuorvexTest::readFile(QuorvexTest::sourceRoot() +
                                            "/src/history/migrations/0001-history.sql"));
        database.exec("PRAGMA user_version = 1");
        for (int run = 1; run <= 2; ++run) {
            database.exec("INSERT INTO runs (console, tool, started, ended, started_unix, "
                          "recorded_unix, exit_status, return_code, partitions, surveyed, failed, "
                          "summary) VALUES ('hmc1', 'quorvex-survey', 'x', 'y', 1, 2, 4, '4', 3, "
                          "2, 1, '{}')");
        }
    }

    std::string path() const { return _folder.file("history.sqlite"); }

    void addEvent(int run, std::string const& scope, std::string const& kind, int times = 1) const {
        SQLite::Database database(path(), SQLite::OPEN_READWRITE);
        SQLite::Statement insert(database, "INSERT INTO events (run_id, scope, kind, machine) "
                                           "VALUES (?, ?, ?, 'm')");
        for (int i = 0; i < times; ++i) {
            insert.bind(1, run);
            insert.bind(2, scope);
            insert.bind(3, kind);
            insert.exec();
            insert.reset();
        }
    }

private:
    QuorvexTest::TemporaryDirectory _folder;
};

TEST(RunChanges, CountsTheRunsEventsPerKind) {
    HistoryFile const history;
    history.addEvent(2, "partition", "newly_failing", 2);
    history.addEvent(2, "partition", "recovered");
    history.addEvent(2, "component", "added", 3);
    history.addEvent(2, "component", "removed", 4);
    history.addEvent(2, "component", "replaced", 5);
    history.addEvent(2, "component", "property_changed", 6);
    monitoring::RunChanges const changes = monitoring::runChangesOf(history.path(), 2);
    EXPECT_EQ(changes.newFailures, 2);
    EXPECT_EQ(changes.recoveries, 1);
    EXPECT_EQ(changes.componentsAdded, 3);
    EXPECT_EQ(changes.componentsRemoved, 4);
    EXPECT_EQ(changes.componentsReplaced, 5);
    EXPECT_EQ(changes.propertiesChanged, 6);
}

TEST(RunChanges, OtherRunsAndOtherKindsAreNotCounted) {
    HistoryFile const history;
    history.addEvent(1, "partition", "newly_failing");
    history.addEvent(1, "component", "added");
    history.addEvent(2, "partition", "still_failing");
    history.addEvent(2, "partition", "appeared");
    history.addEvent(2, "machine", "listing_failed");
    // A machine's "appeared" is no partition event, nor a component one.
    history.addEvent(2, "machine", "appeared");
    monitoring::RunChanges const changes = monitoring::runChangesOf(history.path(), 2);
    EXPECT_EQ(changes.newFailures + changes.recoveries + changes.componentsAdded +
                  changes.componentsRemoved + changes.componentsReplaced +
                  changes.propertiesChanged,
              0);
}

TEST(RunChanges, RunThatIsNotInTheHistoryIsRefusedNamingIt) {
    HistoryFile const history;
    auto const error = QuorvexTest::thrownBy<std::runtime_error>(
        [&history] { (void)monitoring::runChangesOf(history.path(), 3); });
    ASSERT_TRUE(error);
    EXPECT_EQ(std::string(error->what()),
              "cannot read the history " + history.path() + ": it holds no run 3");
}

TEST(RunChanges, MissingDatabaseIsNotCreatedAndIsRefusedWithSqlitesReason) {
    QuorvexTest::TemporaryDirectory folder;
    std::string const path = folder.file("history.sqlite");
    auto const error = QuorvexTest::thrownBy<std::runtime_error>(
        [&path] { (void)monitoring::runChangesOf(path, 1); });
    ASSERT_TRUE(error);
    EXPECT_EQ(std::string(error->what()),
              "cannot read the history " + path + ": unable to open database file");
    EXPECT_FALSE(QuorvexTest::fileExists(path));
}

TEST(RunChanges, FileThatIsNoDatabaseIsRefusedWithSqlitesReason) {
    QuorvexTest::TemporaryDirectory folder;
    std::string const path = folder.file("history.sqlite");
    QuorvexTest::writeFile(path, std::string(4096, 'x'));
    auto const error = QuorvexTest::thrownBy<std::runtime_error>(
        [&path] { (void)monitoring::runChangesOf(path, 1); });
    ASSERT_TRUE(error);
    EXPECT_EQ(std::string(error->what()),
              "cannot read the history " + path + ": file is not a database");
}

} // namespace
