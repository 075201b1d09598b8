#include "history/HistoryFile.h"

#include "HistoryFixture.h"
#include "QuorvexTest.h"
#include "history/UnusableHistory.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <iostream>

namespace {

using QuorvexTest::TemporaryDirectory;

// The message and exit status opening path for reading fails with.
std::pair<std::string, int> refusal(std::string const& path) {
    try {
        history::openHistoryForReading(path);
    } catch (history::UnusableHistory const& failure) {
        return {failure.what(), failure.exitStatus()};
    }
    return {"", 0};
}

TEST(HistoryFile, OpensAHistoryOfTheKnownSchema) {
    QuorvexTest::ExampleHistory example;
    SQLite::Database database = history::openHistoryForReading(example.path());
    EXPECT_EQ(database.execAndGet("SELECT count(*) FROM runs").getInt(), 5);
}

// The store writes in WAL mode: a run recording does not hold readers up.
TEST(HistoryFile, ReadsAWalDatabaseWhileARunRecords) {
    QuorvexTest::ExampleHistory example;
    example.database().exec("PRAGMA journal_mode = WAL");
    example.database().exec("BEGIN IMMEDIATE");
    example.database().exec("DELETE FROM events");
    SQLite::Database reader = history::openHistoryForReading(example.path());
    EXPECT_EQ(reader.execAndGet("SELECT count(*) FROM events").getInt(), 12);
    example.database().exec("ROLLBACK");
}

TEST(HistoryFile, AMissingFileIsNoInput) {
    TemporaryDirectory folder;
    std::string const path = folder.file("none.sqlite");
    EXPECT_EQ(refusal(path),
              std::make_pair("cannot read " + path +
                                 ": No such file or directory (no run has been recorded there "
                                 "yet; choose another file with --history FILE)",
                             66));
    EXPECT_FALSE(QuorvexTest::fileExists(path));
}

TEST(HistoryFile, ADatabaseOfAnotherProgramIsADataError) {
    TemporaryDirectory folder;
    std::string const path = folder.file("other.sqlite");
    SQLite::Database(path, SQLite::OPEN_READWRITE | SQLite::OPEN_CREATE)
        .exec("CREATE TABLE runs (id INTEGER)");
    EXPECT_EQ(refusal(path),
              std::make_pair(path + " is not a quorvex-survey history database", 65));
}

TEST(HistoryFile, RandomBytesAreADataError) {
    TemporaryDirectory folder;
    std::string const path = folder.file("noise.sqlite");
    std::string noise;
    for (int i = 0; i < 4096; ++i) {
        noise += static_cast<char>((i * 7919 + 13) % 251);
    }
    QuorvexTest::writeFile(path, noise);
    EXPECT_EQ(
        refusal(path),
        std::make_pair(path + " is not a readable history database: file is not a database", 65));
}

TEST(HistoryFile, ANewerSchemaIsADataErrorThatSaysWhichVersion) {
    TemporaryDirectory folder;
    std::string const path = folder.file("newer.sqlite");
    QuorvexTest::HistoryFixture(path).database().exec("PRAGMA user_version = 2");
    EXPECT_EQ(refusal(path),
              std::make_pair(path + " has schema version 2, newer than this program reads (1): "
                                    "use the quorvex-survey that wrote it",
                             65));
}

TEST(HistoryFile, AFileMarkedOursWithoutSchemaIsADataError) {
    TemporaryDirectory folder;
    std::string const path = folder.file("empty.sqlite");
    SQLite::Database(path, SQLite::OPEN_READWRITE | SQLite::OPEN_CREATE)
        .exec("PRAGMA application_id = " + std::to_string(history::gc_ApplicationId));
    EXPECT_EQ(refusal(path), std::make_pair(path + " holds no history yet (schema version 0)", 65));
}

TEST(HistoryFile, ReadingLeavesTheFileUnchanged) {
    QuorvexTest::ExampleHistory example;
    std::string const before = QuorvexTest::readFile(example.path());
    history::openHistoryForReading(example.path()).exec("SELECT count(*) FROM events");
    EXPECT_EQ(QuorvexTest::readFile(example.path()), before);
    EXPECT_THROW(history::openHistoryForReading(example.path()).exec("DELETE FROM runs"),
                 SQLite::Exception);
}

} // namespace

namespace {

// The user root reads a file whatever its mode: the refused reading runs in
// a child as the unprivileged user nobody.
constexpr uid_t gc_Nobody = 65534;

TEST(HistoryFile, AnUnreadableFileIsNoInputSaidWithErrnosText) {
    QuorvexTest::ExampleHistory example;
    std::filesystem::permissions(std::filesystem::path(example.path()).parent_path(),
                                 std::filesystem::perms::owner_all |
                                     std::filesystem::perms::others_read |
                                     std::filesystem::perms::others_exec);
    std::filesystem::permissions(example.path(), std::filesystem::perms::owner_read |
                                                     std::filesystem::perms::owner_write);
    QuorvexTest::CommandResult const result = QuorvexTest::runInChild([&] {
        if (geteuid() == 0 && (setgid(gc_Nobody) != 0 || setuid(gc_Nobody) != 0)) {
            return 2;
        }
        auto const [message, status] = refusal(example.path());
        std::cout << status << " " << message;
        return 0;
    });
    EXPECT_EQ(0, result.exitStatus) << result.stderrText;
    EXPECT_EQ("66 cannot read " + example.path() + ": Permission denied", result.stdoutText);
}

} // namespace
