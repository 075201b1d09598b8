#include "history/HistoryDatabase.h"

#include "QuorvexTest.h"
#include "history/HistoryError.h"
#include "history/Migrations.h"
#include "history/SqliteFailure.h"
#include "report/HistoryBusyTimeout.h"
#include "utility/SystemError.h"

#include <SQLiteCpp/Statement.h>
#include <sqlite3.h>

#include <gtest/gtest.h>

#include <algorithm>
#include <random>
#include <string>

namespace {

using QuorvexTest::thrownBy;

std::string textOf(SQLite::Database& database, char const* query) {
    return database.execAndGet(query).getString();
}

long long countOf(SQLite::Database& database, char const* query) {
    return database.execAndGet(query).getInt64();
}

report::RunSummary oneSurveyedPartition() {
    report::PartitionSummary partition;
    partition.host = "db1";
    partition.ip = "10.0.0.1";
    partition.outcome = report::Outcome::Surveyed;
    partition.statusText = "Ok";
    partition.returnCode = "0";
    report::RunSummary summary;
    summary.tool = "quorvex-survey";
    summary.consoleHost = "console1";
    summary.started = "2026-11-24T10:00:00+00:00";
    summary.ended = "2026-11-24T10:05:00+00:00";
    summary.machines.push_back({"9119-MHE_21ABCDE", "/s", std::nullopt, {partition}, std::nullopt});
    return summary;
}

// What refusing path says, and that the file is still byte for byte as it was.
std::string refusalKeepingTheFile(std::string const& path) {
    std::string const before = QuorvexTest::readFile(path);
    std::optional<history::HistoryError> const refusal =
        thrownBy<history::HistoryError>([&] { history::HistoryDatabase const opened(path); });
    EXPECT_EQ(QuorvexTest::readFile(path), before) << "the refused file was changed";
    return refusal ? refusal->what() : "(not refused)";
}

TEST(HistoryDatabase, MissingFoldersAndFileAreMade) {
    QuorvexTest::TemporaryDirectory const work;
    history::HistoryDatabase database(work.file("state/quorvex/history.sqlite"));
    EXPECT_TRUE(QuorvexTest::fileExists(work.file("state/quorvex/history.sqlite")));
    EXPECT_EQ(history::schemaVersion(database.connection()), history::newestSchemaVersion());
    EXPECT_EQ(database.path(), work.file("state/quorvex/history.sqlite"));
}

TEST(HistoryDatabase, WalModeForeignKeysAndBusyTimeoutAreSet) {
    QuorvexTest::TemporaryDirectory const work;
    history::HistoryDatabase database(work.file("h.sqlite"));
    EXPECT_EQ(textOf(database.connection(), "PRAGMA journal_mode"), "wal");
    EXPECT_EQ(countOf(database.connection(), "PRAGMA foreign_keys"), 1);
    EXPECT_EQ(countOf(database.connection(), "PRAGMA busy_timeout"),
              report::gc_HistoryBusyTimeoutMilliseconds);
}

// Writers (this store, a prune) and readers (the history command, the
// report, the metrics) share one busy timeout, the one docs/history.md
// tells operators about.
TEST(HistoryDatabase, EveryProgramWaitsTheDocumentedBusyTimeout) {
    std::string const documented =
        QuorvexTest::readFile(QuorvexTest::sourceRoot() + "/docs/history.md");
    std::string const seconds =
        std::to_string(report::gc_HistoryBusyTimeoutMilliseconds / 1000) + " s";
    EXPECT_NE(documented.find("Every program that opens the file waits the same " + seconds),
              std::string::npos)
        << "docs/history.md, \"Locking\", names another wait than " << seconds;
    EXPECT_NE(documented.find("waiting up to " + seconds + " for a run"), std::string::npos);
}

TEST(HistoryDatabase, EmptyFileBecomesAHistory) {
    QuorvexTest::TemporaryDirectory const work;
    QuorvexTest::writeFile(work.file("h.sqlite"), "");
    history::HistoryDatabase database(work.file("h.sqlite"));
    EXPECT_EQ(countOf(database.connection(), "PRAGMA application_id"), history::gc_ApplicationId);
}

TEST(HistoryDatabase, RandomBytesAreRefusedAndLeftAsTheyAre) {
    QuorvexTest::TemporaryDirectory const work;
    std::mt19937 bytes(20);
    std::string noise(8192, '\0');
    std::generate(noise.begin(), noise.end(), [&bytes] { return static_cast<char>(bytes()); });
    QuorvexTest::writeFile(work.file("h.sqlite"), noise);
    EXPECT_EQ(refusalKeepingTheFile(work.file("h.sqlite")),
              "it is not a quorvex-survey history database (file is not a database); it was "
              "left as it is");
}

TEST(HistoryDatabase, AnotherProgramsDatabaseIsRefused) {
    QuorvexTest::TemporaryDirectory const work;
    SQLite::Database(work.file("h.sqlite"), SQLite::OPEN_READWRITE | SQLite::OPEN_CREATE)
        .exec("CREATE TABLE notes (text TEXT)");
    EXPECT_EQ(refusalKeepingTheFile(work.file("h.sqlite")),
              "it is not a quorvex-survey history database (it holds another program's tables); "
              "it was left as it is");
}

TEST(HistoryDatabase, ForeignApplicationIdIsRefused) {
    QuorvexTest::TemporaryDirectory const work;
    SQLite::Database(work.file("h.sqlite"), SQLite::OPEN_READWRITE | SQLite::OPEN_CREATE)
        .exec("PRAGMA application_id = 1234567");
    EXPECT_EQ(refusalKeepingTheFile(work.file("h.sqlite")),
              "it is not a quorvex-survey history database (its application id is 0x12d687); "
              "it was left as it is");
}

TEST(HistoryDatabase, NewerSchemaIsRefusedNamingBothVersions) {
    QuorvexTest::TemporaryDirectory const work;
    int const newer = history::newestSchemaVersion() + 1;
    history::HistoryDatabase(work.file("h.sqlite"))
        .connection()
        .exec("PRAGMA user_version = " + std::to_string(newer));
    EXPECT_EQ(refusalKeepingTheFile(work.file("h.sqlite")),
              "its schema is version " + std::to_string(newer) +
                  ", newer than this quorvex-survey knows (versions up to " +
                  std::to_string(newer - 1) +
                  "); it was left as it is: use a newer quorvex-survey, or another file");
}

TEST(HistoryDatabase, FolderThatCannotBeMadeIsASystemError) {
    QuorvexTest::TemporaryDirectory const work;
    QuorvexTest::writeFile(work.file("file"), "x");
    std::optional<util::SystemError> const failure = thrownBy<util::SystemError>(
        [&] { history::HistoryDatabase{work.file("file/history.sqlite")}; });
    ASSERT_TRUE(failure);
    EXPECT_EQ(std::string(failure->what()),
              "cannot create " + work.file("file") + ": Not a directory");
}

TEST(HistoryDatabase, FolderInPlaceOfTheFileIsASystemError) {
    QuorvexTest::TemporaryDirectory const work;
    std::filesystem::create_directories(work.file("h.sqlite"));
    std::optional<util::SystemError> const failure =
        thrownBy<util::SystemError>([&] { history::HistoryDatabase{work.file("h.sqlite")}; });
    ASSERT_TRUE(failure);
    EXPECT_EQ(std::string(failure->what()),
              "cannot open " + work.file("h.sqlite") + ": Is a directory");
}

TEST(HistoryDatabase, LockedPastTheTimeoutSaysAnotherProcessHoldsIt) {
    QuorvexTest::TemporaryDirectory const work;
    history::HistoryDatabase database(work.file("h.sqlite"));
    history::HistoryError const error = history::historyErrorOf(
        SQLite::Exception("database is locked", SQLITE_BUSY), database.connection());
    EXPECT_EQ(std::string(error.what()),
              "the database is locked: another process has held it for more than 5 s");
}

TEST(HistoryDatabase, RecordedRunIsThereWhenOpenedAgain) {
    QuorvexTest::TemporaryDirectory const work;
    long long const runId = history::HistoryDatabase(work.file("h.sqlite"))
                                .recordRun(oneSurveyedPartition(), {{"tool", "x"}}, "/v");
    history::HistoryDatabase database(work.file("h.sqlite"));
    EXPECT_EQ(runId, 1);
    EXPECT_EQ(countOf(database.connection(), "SELECT count(*) FROM runs"), 1);
    EXPECT_EQ(countOf(database.connection(), "SELECT count(*) FROM partition_results"), 1);
}

// A row that cannot be written in the middle of a run (here a trigger
// refuses the partition) leaves nothing of the run.
TEST(HistoryDatabase, RunThatFailsHalfwayLeavesNothing) {
    QuorvexTest::TemporaryDirectory const work;
    history::HistoryDatabase database(work.file("h.sqlite"));
    database.connection().exec("CREATE TRIGGER refuse BEFORE INSERT ON partition_results "
                               "BEGIN SELECT RAISE(ABORT, 'partition refused'); END");
    std::optional<history::HistoryError> const failure = thrownBy<history::HistoryError>(
        [&] { database.recordRun(oneSurveyedPartition(), {}, "/v"); });
    ASSERT_TRUE(failure);
    EXPECT_EQ(std::string(failure->what()), "partition refused");
    EXPECT_EQ(countOf(database.connection(), "SELECT count(*) FROM runs"), 0);
    EXPECT_EQ(countOf(database.connection(), "SELECT count(*) FROM machine_results"), 0);
}

TEST(HistoryDatabase, AmendedRunSaysHowItEndedAndKeepsItsPartitions) {
    QuorvexTest::TemporaryDirectory const work;
    history::HistoryDatabase database(work.file("h.sqlite"));
    report::RunSummary summary = oneSurveyedPartition();
    summary.exitStatus = 0;
    long long const runId = database.recordRun(summary, {{"exit_status", 0}}, "/v");
    summary.exitStatus = 130;
    summary.interruptedBy = "SIGINT";
    database.amendRun(runId, summary, {{"exit_status", 130}, {"history", {{"run_id", nullptr}}}});
    EXPECT_EQ(countOf(database.connection(), "SELECT exit_status FROM runs"), 130);
    EXPECT_EQ(textOf(database.connection(), "SELECT interrupted FROM runs"), "SIGINT");
    EXPECT_EQ(textOf(database.connection(), "SELECT summary FROM runs"),
              R"({"exit_status":130,"history":{"run_id":1}})");
    EXPECT_EQ(countOf(database.connection(), "SELECT count(*) FROM partition_results"), 1);
}

} // namespace
