#pragma once

#include "report/RunSummary.h"

#include <SQLiteCpp/Database.h>
#include <SQLiteCpp/Statement.h>

#include <nlohmann/json.hpp>

namespace history {

// Writes one run into the tables every reader queries (docs/history.md):
// its row in runs, with the whole summary document kept beside the columns,
// a row per machine in machine_results and per listed partition in
// partition_results. The partition rows say inventory 'none' and leave the
// columns the change computation derives (failing streak, last surveyed
// run, inventory, document hash) empty. Runs within the caller's
// transaction, which must hold the write lock from its start (BEGIN
// IMMEDIATE) so that the run's id is the one it takes.
class RunRecorder {
public:
    explicit RunRecorder(SQLite::Database& database);

    // Records the run and returns its id, the next in recording order. The
    // summary document is kept as compact JSON; its history member, when it
    // is an object, is given the run's id as run_id first.
    long long record(report::RunSummary const& summary, nlohmann::ordered_json summaryDocument,
                     long long recordedUnix);

    // Replaces how the recorded run ended: its exit status, interrupting
    // signal and summary document (the history member given run_id too).
    void amend(long long runId, report::RunSummary const& summary,
               nlohmann::ordered_json summaryDocument);

private:
    long long _nextRunId();
    void _insertRun(long long runId, report::RunSummary const& summary,
                    std::string const& summaryText, long long recordedUnix);
    void _insertMachine(long long runId, report::MachineSummary const& machine);
    void _insertPartition(long long runId, std::string const& machine, std::string const& name,
                          report::PartitionSummary const& partition);

    SQLite::Database& _database;
    SQLite::Statement _machineInsert;
    SQLite::Statement _partitionInsert;
};

} // namespace history
