#include "history/HistoryPrune.h"

#include "HistoryFixture.h"

#include <gtest/gtest.h>

namespace {

using QuorvexTest::ExampleHistory;

long long count(SQLite::Database& database, std::string const& table) {
    return database.execAndGet("SELECT count(*) FROM " + table).getInt64();
}

std::vector<long long> runIds(SQLite::Database& database) {
    SQLite::Statement query(database, "SELECT id FROM runs ORDER BY id");
    std::vector<long long> ids;
    while (query.executeStep()) {
        ids.push_back(query.getColumn(0).getInt64());
    }
    return ids;
}

TEST(HistoryPrune, KeepsTheNewestRunsOfEachConsoleWithTheirRows) {
    ExampleHistory example;
    SQLite::Database& database = example.database();
    database.exec("PRAGMA foreign_keys = ON");
    history::PruneSelection keep;
    keep.keep = 2;
    history::PruneResult const result = history::pruneRuns(database, keep);
    EXPECT_EQ(result.removed, 2);
    EXPECT_EQ(result.kept, 3);
    EXPECT_EQ(runIds(database), (std::vector<long long>{3, 4, 5}));
    EXPECT_EQ(count(database, "partition_results"), 7);
    EXPECT_EQ(count(database, "events"), 10);
    EXPECT_EQ(history::pruneText(result), "Removed 2 runs, kept 3.\n");
}

TEST(HistoryPrune, RemovesTheRunsStartedBeforeAMoment) {
    ExampleHistory example;
    SQLite::Database& database = example.database();
    database.exec("PRAGMA foreign_keys = ON");
    history::PruneSelection before;
    before.beforeUnix = 1793581200; // 2026-11-02T02:00:00+01:00: run 2 itself stays
    history::PruneResult const result = history::pruneRuns(database, before);
    EXPECT_EQ(runIds(database), (std::vector<long long>{2, 3, 4, 5}));
    EXPECT_EQ(history::pruneText(result), "Removed 1 run, kept 4.\n");
    EXPECT_EQ(history::pruneJson(result),
              nlohmann::ordered_json::parse(R"({"removed": 1, "kept": 4})"));
}

TEST(HistoryPrune, RemovingNothingChangesNothing) {
    ExampleHistory example;
    history::PruneSelection keep;
    keep.keep = 10;
    EXPECT_EQ(history::pruneText(history::pruneRuns(example.database(), keep)),
              "Removed 0 runs, kept 5.\n");
    EXPECT_EQ(count(example.database(), "events"), 12);
}

} // namespace
