#include "history/KnownDocuments.h"

#include "QuorvexTest.h"
#include "history/HistoryDatabase.h"

#include <SQLiteCpp/SQLiteCpp.h>
#include <gtest/gtest.h>

#include <cstdint>
#include <string>

namespace {

using history::KnownDocuments;

// A history with runs written row by row: each partition result names its
// document's hash and what reading it gave.
class HistoryKnownDocuments : public ::testing::Test {
protected:
    QuorvexTest::TemporaryDirectory _folder;
    history::HistoryDatabase _history{_folder.file("history.sqlite")};
    SQLite::Database& _db = _history.connection();

    long long run(std::string const& console) {
        SQLite::Statement insert(_db, "INSERT INTO runs (console, tool, started, ended,"
                                      " started_unix, recorded_unix, return_code, partitions,"
                                      " surveyed, failed, summary) VALUES (?, 'quorvex-survey',"
                                      " 's', 'e', 0, 0, '0', 1, 1, 0, '{}')");
        insert.bind(1, console);
        insert.exec();
        return _db.getLastInsertRowid();
    }

    void machine(long long runId, std::string const& name) {
        SQLite::Statement insert(_db, "INSERT INTO machine_results (run_id, machine, return_code)"
                                      " VALUES (?, ?, '0')");
        insert.bind(1, static_cast<std::int64_t>(runId));
        insert.bind(2, name);
        insert.exec();
    }

    void partition(long long runId, std::string const& machineName, std::string const& hash,
                   std::string const& inventory, char const* problem = nullptr) {
        SQLite::Statement insert(_db, "INSERT INTO partition_results (run_id, machine, partition,"
                                      " ip, outcome, status_text, inventory, inventory_problem,"
                                      " document_hash) VALUES (?, ?, ?, '10.0.0.1', 'surveyed',"
                                      " 'Ok', ?, ?, ?)");
        insert.bind(1, static_cast<std::int64_t>(runId));
        insert.bind(2, machineName);
        insert.bind(3, "p-" + hash);
        insert.bind(4, inventory);
        if (problem != nullptr) {
            insert.bind(5, problem);
        }
        insert.bind(6, hash);
        insert.exec();
    }

    KnownDocuments knownFor(long long runId, std::string const& console) {
        return KnownDocuments::ofPreviousRecords(_db, {runId, std::nullopt, console});
    }
};

TEST_F(HistoryKnownDocuments, ContentsOfThePreviousRecordAreKnownWithWhatReadingThemGave) {
    long long const first = run("console");
    machine(first, "M");
    partition(first, "M", "h1", "read");
    partition(first, "M", "h2", "unreadable", "document unreadable at line 3: mismatched tag");
    long long const second = run("console");
    machine(second, "M");
    KnownDocuments const known = knownFor(second, "console");
    ASSERT_NE(nullptr, known.find("h1"));
    EXPECT_EQ("read", known.find("h1")->inventory);
    EXPECT_EQ(std::nullopt, known.find("h1")->problem);
    ASSERT_NE(nullptr, known.find("h2"));
    EXPECT_EQ("unreadable", known.find("h2")->inventory);
    EXPECT_EQ("document unreadable at line 3: mismatched tag", known.find("h2")->problem);
}

TEST_F(HistoryKnownDocuments, ContentOnlyAnOlderRecordHeldIsReadAgain) {
    long long const first = run("console");
    machine(first, "M");
    partition(first, "M", "old", "read");
    long long const second = run("console");
    machine(second, "M");
    partition(second, "M", "new", "read");
    long long const third = run("console");
    machine(third, "M");
    KnownDocuments const known = knownFor(third, "console");
    EXPECT_EQ(nullptr, known.find("old"));
    EXPECT_NE(nullptr, known.find("new"));
}

TEST_F(HistoryKnownDocuments, AnotherConsolesContentIsNotKnown) {
    long long const first = run("other");
    machine(first, "M");
    partition(first, "M", "h1", "read");
    long long const second = run("console");
    machine(second, "M");
    EXPECT_EQ(nullptr, knownFor(second, "console").find("h1"));
}

TEST_F(HistoryKnownDocuments, MachinesOwnPreviousRecordCountsThoughTheLatestRunSkippedIt) {
    long long const first = run("console");
    machine(first, "M");
    machine(first, "N");
    partition(first, "M", "h1", "read");
    long long const second = run("console");
    machine(second, "N");
    long long const third = run("console");
    machine(third, "M");
    EXPECT_NE(nullptr, knownFor(third, "console").find("h1"));
}

} // namespace
