#include "HistorySeed.h"

#include "TemporaryFiles.h"
#include "TestConstants.h"

#include <SQLiteCpp/SQLiteCpp.h>

#include <algorithm>
#include <filesystem>
#include <vector>

namespace QuorvexTest {

namespace {

std::vector<std::string> migrationFiles() {
    std::string const folder = sourceRoot() + "/src/history/migrations";
    std::vector<std::string> files;
    for (std::filesystem::directory_entry const& entry :
         std::filesystem::directory_iterator(folder)) {
        if (entry.path().extension() == ".sql") {
            files.push_back(entry.path().string());
        }
    }
    std::sort(files.begin(), files.end());
    return files;
}

void bindOptional(SQLite::Statement& statement, int index, std::optional<long long> value) {
    if (value) {
        statement.bind(index, static_cast<int64_t>(*value));
    } else {
        statement.bind(index);
    }
}

} // namespace

HistorySeed::HistorySeed(std::string path) : _path(std::move(path)) {
    SQLite::Database db(_path, SQLite::OPEN_READWRITE | SQLite::OPEN_CREATE);
    std::vector<std::string> const files = migrationFiles();
    for (std::string const& file : files) {
        db.exec(readFile(file));
    }
    db.exec("PRAGMA user_version = " + std::to_string(files.size()));
}

std::string const& HistorySeed::path() const {
    return _path;
}

void HistorySeed::execute(std::string const& sql) const {
    SQLite::Database db(_path, SQLite::OPEN_READWRITE);
    db.exec(sql);
}

long long HistorySeed::addRun(std::string const& console, std::string const& started) const {
    SQLite::Database db(_path, SQLite::OPEN_READWRITE);
    SQLite::Statement insert(
        db, "INSERT INTO runs (console, tool, started, ended, started_unix, recorded_unix,"
            " exit_status, return_code, interrupted, partitions, surveyed, failed, summary)"
            " VALUES (?, 'quorvex-survey', ?, ?, 0, 0, 0, '0', NULL, 0, 0, 0, '{}')");
    insert.bind(1, console);
    insert.bind(2, started);
    insert.bind(3, started);
    insert.exec();
    return db.getLastInsertRowid();
}

void HistorySeed::addMachine(long long run, std::string const& machine) const {
    SQLite::Database db(_path, SQLite::OPEN_READWRITE);
    SQLite::Statement insert(db, "INSERT OR IGNORE INTO machine_results (run_id, machine,"
                                 " return_code) VALUES (?, ?, '0')");
    insert.bind(1, static_cast<int64_t>(run));
    insert.bind(2, machine);
    insert.exec();
}

void HistorySeed::addPartition(long long run, PartitionRow const& row) const {
    addMachine(run, row.machine);
    SQLite::Database db(_path, SQLite::OPEN_READWRITE);
    SQLite::Statement insert(
        db, "INSERT INTO partition_results (run_id, machine, partition, ip, outcome, status_text,"
            " inventory, failing_since_run, runs_failing, last_surveyed_run)"
            " VALUES (?, ?, ?, '10.0.0.1', ?, '', 'none', ?, ?, ?)");
    insert.bind(1, static_cast<int64_t>(run));
    insert.bind(2, row.machine);
    insert.bind(3, row.partition);
    insert.bind(4, row.outcome);
    bindOptional(insert, 5, row.failingSinceRun);
    bindOptional(insert, 6, row.runsFailing);
    bindOptional(insert, 7, row.lastSurveyedRun);
    insert.exec();
}

} // namespace QuorvexTest
