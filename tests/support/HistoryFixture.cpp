#include "HistoryFixture.h"

#include "TemporaryFiles.h"
#include "TestConstants.h"

#include <SQLiteCpp/Statement.h>

#include <cstdint>

namespace QuorvexTest {

namespace {

// "QVSH", the store's mark on the files it makes.
constexpr std::int32_t gc_HistoryApplicationId = 0x51565348;

template <typename Value>
void bindOptional(SQLite::Statement& statement, int index, std::optional<Value> const& value) {
    if (!value) {
        statement.bind(index);
    } else if constexpr (std::is_same_v<Value, long long>) {
        statement.bind(index, static_cast<std::int64_t>(*value));
    } else {
        statement.bind(index, *value);
    }
}

} // namespace

HistoryFixture::HistoryFixture(std::string const& path)
    : _database(path, SQLite::OPEN_READWRITE | SQLite::OPEN_CREATE) {
    // Tests need no file that survives a power loss.
    _database.exec("PRAGMA synchronous = OFF");
    _database.exec(readFile(sourceRoot() + "/src/history/migrations/0001-history.sql"));
    _database.exec("PRAGMA application_id = " + std::to_string(gc_HistoryApplicationId));
    _database.exec("PRAGMA user_version = 1");
}

SQLite::Database& HistoryFixture::database() {
    return _database;
}

long long HistoryFixture::addRun(std::string const& console, std::string const& started,
                                 std::string const& ended, int partitions, int surveyed, int failed,
                                 Number exitStatus, Text const& interrupted) {
    SQLite::Statement insert(
        _database, "INSERT INTO runs (console, tool, started, ended, started_unix, recorded_unix,"
                   " exit_status, return_code, interrupted, partitions, surveyed, failed, summary)"
                   " VALUES (?1, 'quorvex-survey', ?2, ?3, CAST(strftime('%s', ?2) AS INTEGER),"
                   " CAST(strftime('%s', ?3) AS INTEGER), ?4, '0', ?5, ?6, ?7, ?8, '{}')");
    insert.bind(1, console);
    insert.bind(2, started);
    insert.bind(3, ended);
    bindOptional(insert, 4, exitStatus);
    bindOptional(insert, 5, interrupted);
    insert.bind(6, partitions);
    insert.bind(7, surveyed);
    insert.bind(8, failed);
    insert.exec();
    return _database.getLastInsertRowid();
}

void HistoryFixture::addPartition(long long run, std::string const& machine,
                                  std::string const& partition, std::string const& outcome,
                                  Text const& reason, Number failingSinceRun, Number runsFailing,
                                  std::string const& inventory) {
    // The run listed the partition's machine.
    SQLite::Statement machineRow(_database, "INSERT OR IGNORE INTO machine_results (run_id,"
                                            " machine, return_code) VALUES (?, ?, '0')");
    machineRow.bind(1, static_cast<std::int64_t>(run));
    machineRow.bind(2, machine);
    machineRow.exec();
    SQLite::Statement insert(
        _database, "INSERT INTO partition_results (run_id, machine, partition, ip, outcome,"
                   " status_text, reason, inventory, failing_since_run, runs_failing)"
                   " VALUES (?1, ?2, ?3, '10.1.1.1', ?4, ?4, ?5, ?6, ?7, ?8)");
    insert.bind(1, static_cast<std::int64_t>(run));
    insert.bind(2, machine);
    insert.bind(3, partition);
    insert.bind(4, outcome);
    bindOptional(insert, 5, reason);
    insert.bind(6, inventory);
    bindOptional(insert, 7, failingSinceRun);
    bindOptional(insert, 8, runsFailing);
    insert.exec();
}

void HistoryFixture::addPartitionEvent(long long run, std::string const& kind,
                                       std::string const& machine, std::string const& partition,
                                       Text const& outcome, Text const& reason,
                                       Number failingSinceRun, Number runsFailing) {
    _addEvent(run, "partition", kind, machine, {partition, {}, {}, {}, {}, {}, outcome, reason},
              failingSinceRun, runsFailing);
}

void HistoryFixture::addMachineEvent(long long run, std::string const& kind,
                                     std::string const& machine, Text const& reason) {
    _addEvent(run, "machine", kind, machine, {{}, {}, {}, {}, {}, {}, {}, reason}, {}, {});
}

void HistoryFixture::addComponentEvent(long long run, std::string const& kind,
                                       std::string const& machine, std::string const& partition,
                                       std::string const& component, std::string const& name,
                                       Text const& property, Text const& oldValue,
                                       Text const& newValue) {
    _addEvent(run, "component", kind, machine,
              {partition, component, name, property, oldValue, newValue, {}, {}}, {}, {});
}

void HistoryFixture::_addEvent(long long run, std::string const& scope, std::string const& kind,
                               std::string const& machine, std::vector<Text> const& texts,
                               Number failingSinceRun, Number runsFailing) {
    SQLite::Statement insert(
        _database,
        "INSERT INTO events (run_id, scope, kind, machine, partition, component, component_name,"
        " property, old_value, new_value, outcome, reason, failing_since_run, runs_failing)"
        " VALUES (?1, ?2, ?3, ?4, ?5, ?6, ?7, ?8, ?9, ?10, ?11, ?12, ?13, ?14)");
    insert.bind(1, static_cast<std::int64_t>(run));
    insert.bind(2, scope);
    insert.bind(3, kind);
    insert.bind(4, machine);
    for (std::size_t i = 0; i < texts.size(); ++i) {
        bindOptional(insert, 5 + static_cast<int>(i), texts[i]);
    }
    bindOptional(insert, 13, failingSinceRun);
    bindOptional(insert, 14, runsFailing);
    insert.exec();
}

namespace {

void addFirstRuns(HistoryFixture& history) {
    long long const first =
        history.addRun("cons-a", "2026-11-01T02:00:00+01:00", "2026-11-01T02:01:12+01:00", 3, 3, 0);
    for (char const* partition : {"lpar1", "lpar2", "lpar3"}) {
        history.addPartition(first, gc_HistoryMachine, partition);
    }
    long long const second = history.addRun("cons-a", "2026-11-02T02:00:00+01:00",
                                            "2026-11-02T02:03:05+01:00", 3, 2, 1, 4);
    history.addPartition(second, gc_HistoryMachine, "lpar1");
    history.addPartition(second, gc_HistoryMachine, "lpar2", "timed_out", "no answer within 1800 s",
                         second, 1, "none");
    history.addPartition(second, gc_HistoryMachine, "lpar3");
    history.addPartitionEvent(second, "newly_failing", gc_HistoryMachine, "lpar2", "timed_out",
                              "no answer within 1800 s", second, 1);
    history.addComponentEvent(second, "replaced", gc_HistoryMachine, "lpar1",
                              "U78AB.001.WZS0123-P1-C7", "Ethernet adapter", {}, "YL10A", "YL10B");
    long long const other =
        history.addRun("cons-b", "2026-11-02T03:00:00Z", "2026-11-02T03:00:09Z", 1, 1, 0);
    history.addPartition(other, gc_HistoryOtherMachine, "web1");
}

void addInterruptedRun(HistoryFixture& history) {
    long long const run = history.addRun("cons-a", "2026-11-03T02:00:00+01:00",
                                         "2026-11-03T02:00:41+01:00", 3, 1, 1, 143, "SIGTERM");
    history.addPartition(run, gc_HistoryMachine, "lpar1");
    history.addPartition(run, gc_HistoryMachine, "lpar2", "client_failure",
                         "the client ended with 12", 2, 2, "none");
    history.addPartition(run, gc_HistoryMachine, "lpar4", "inactive", {}, {}, {}, "none");
    history.addPartitionEvent(run, "still_failing", gc_HistoryMachine, "lpar2", "client_failure",
                              "the client ended with 12", 2, 2);
    history.addPartitionEvent(run, "disappeared", gc_HistoryMachine, "lpar3");
    history.addPartitionEvent(run, "appeared", gc_HistoryMachine, "lpar4", "inactive");
    history.addComponentEvent(run, "property_changed", gc_HistoryMachine, "lpar1",
                              "U78AB.001.WZS0123-P1", "System firmware", "FW", "1.0",
                              "1.1, \"service pack\"");
    history.addMachineEvent(run, "appeared", gc_HistoryOtherMachine);
    history.addMachineEvent(run, "listing_failed", gc_HistoryOtherMachine,
                            "lspartition ended with 1: no such machine");
}

void addRecoveringRun(HistoryFixture& history) {
    long long const run =
        history.addRun("cons-a", "2026-11-04T02:00:00+01:00", "2026-11-04T02:02:00+01:00", 3, 3, 0);
    for (char const* partition : {"lpar1", "lpar2", "lpar4"}) {
        history.addPartition(run, gc_HistoryMachine, partition);
    }
    history.addPartitionEvent(run, "recovered", gc_HistoryMachine, "lpar2", "surveyed");
    history.addMachineEvent(run, "listing_recovered", gc_HistoryOtherMachine);
    history.addComponentEvent(run, "added", gc_HistoryMachine, "lpar4", "U78AB.001.WZS0123-P1-C9",
                              "Fibre channel adapter");
    history.addComponentEvent(run, "removed", gc_HistoryMachine, "lpar1", "U78AB.001.WZS0123-P1-C3",
                              "SAS controller");
}

} // namespace

ExampleHistory::ExampleHistory() : _path(_folder.file("history.sqlite")), _history(_path) {
    addExampleRuns(_history);
}

std::string const& ExampleHistory::path() const {
    return _path;
}

SQLite::Database& ExampleHistory::database() {
    return _history.database();
}

void addExampleRuns(HistoryFixture& history) {
    addFirstRuns(history);
    addInterruptedRun(history);
    addRecoveringRun(history);
}

} // namespace QuorvexTest
