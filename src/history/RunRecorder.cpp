#include "history/RunRecorder.h"

#include "history/FailingOutcomes.h"
#include "history/PartitionNames.h"
#include "report/ListingFailure.h"
#include "report/SummaryTotals.h"
#include "utility/LocalTime.h"

#include <cstddef>
#include <cstdint>
#include <numeric>
#include <utility>

namespace history {

namespace {

constexpr char gc_InventoryNotRead[] = "none";

constexpr char gc_MachineInsert[] =
    "INSERT INTO machine_results (run_id, machine, return_code, listing_failure) "
    "VALUES (?, ?, ?, ?)";

constexpr char gc_PartitionInsert[] =
    "INSERT INTO partition_results (run_id, machine, partition, partition_id, ip, outcome, "
    "status_text, reason, seconds, document, inventory) VALUES (?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?)";

constexpr char gc_RunAmendment[] =
    "UPDATE runs SET exit_status = ?, interrupted = ?, summary = ? WHERE id = ?";

constexpr char gc_RunInsert[] =
    "INSERT INTO runs (id, console, tool, started, ended, started_unix, recorded_unix, "
    "exit_status, return_code, interrupted, partitions, surveyed, failed, summary, "
    "all_machines) VALUES (?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?)";

// A value the summary may lack binds as NULL.
template <typename T>
void bindOptional(SQLite::Statement& statement, int index, std::optional<T> const& value) {
    if (value) {
        statement.bind(index, *value);
    } else {
        statement.bind(index);
    }
}

long long failingCount(report::OutcomeCounts const& counts) {
    return std::accumulate(report::outcomeTable().begin(), report::outcomeTable().end(), 0LL,
                           [&counts](long long failing, report::OutcomeText const& row) {
                               return isFailing(row.outcome) ? failing + counts.of(row.outcome)
                                                             : failing;
                           });
}

// Compact: a summary of 1,000 partitions is a third smaller than indented.
std::string compactText(nlohmann::ordered_json const& document) {
    return document.dump(-1, ' ', false, nlohmann::ordered_json::error_handler_t::replace);
}

// The document as kept: its history member, when it is an object, names the
// run it is kept for.
std::string keptText(nlohmann::ordered_json summaryDocument, long long runId) {
    auto const history = summaryDocument.find("history");
    if (history != summaryDocument.end() && history->is_object()) {
        (*history)["run_id"] = runId;
    }
    return compactText(summaryDocument);
}

// Only a run that listed every machine of the console can tell that one is
// gone (docs/history.md, "Changes").
bool listedAllMachines(report::RunSummary const& summary) {
    return summary.options.all && !summary.listingFailure;
}

// SQLite's integers are 64 bits; long long is not the wrapper's int64_t.
void bindInteger(SQLite::Statement& statement, int index, long long value) {
    statement.bind(index, static_cast<std::int64_t>(value));
}

} // namespace

RunRecorder::RunRecorder(SQLite::Database& database)
    : _database(database), _machineInsert(database, gc_MachineInsert),
      _partitionInsert(database, gc_PartitionInsert) {}

long long RunRecorder::record(report::RunSummary const& summary,
                              nlohmann::ordered_json summaryDocument, long long recordedUnix) {
    long long const runId = _nextRunId();
    _insertRun(runId, summary, keptText(std::move(summaryDocument), runId), recordedUnix);
    for (report::MachineSummary const& machine : summary.machines) {
        _insertMachine(runId, machine);
    }
    return runId;
}

void RunRecorder::amend(long long runId, report::RunSummary const& summary,
                        nlohmann::ordered_json summaryDocument) {
    std::string const summaryText = keptText(std::move(summaryDocument), runId);
    SQLite::Statement update(_database, gc_RunAmendment);
    bindOptional(update, 1, summary.exitStatus);
    bindOptional(update, 2, summary.interruptedBy);
    update.bindNoCopy(3, summaryText);
    bindInteger(update, 4, runId);
    update.exec();
}

// The id AUTOINCREMENT would give, taken before the row is written so that
// the kept summary can carry it: no other writer runs within the
// transaction, and an id once used is never given again, even after a prune.
long long RunRecorder::_nextRunId() {
    return _database
        .execAndGet("SELECT max(coalesce((SELECT seq FROM sqlite_sequence "
                    "WHERE name = 'runs'), 0), coalesce((SELECT max(id) FROM runs), 0)) + 1")
        .getInt64();
}

void RunRecorder::_insertRun(long long runId, report::RunSummary const& summary,
                             std::string const& summaryText, long long recordedUnix) {
    report::OutcomeCounts const counts = report::totalCounts(summary.machines);
    SQLite::Statement insert(_database, gc_RunInsert);
    bindInteger(insert, 1, runId);
    insert.bind(2, summary.consoleHost);
    insert.bind(3, summary.tool);
    insert.bind(4, summary.started);
    insert.bind(5, summary.ended);
    bindInteger(insert, 6, util::secondsOfTimeText(summary.started).value_or(recordedUnix));
    bindInteger(insert, 7, recordedUnix);
    bindOptional(insert, 8, summary.exitStatus);
    insert.bind(9, report::overallCode(summary.machines));
    bindOptional(insert, 10, summary.interruptedBy);
    bindInteger(insert, 11, counts.partitions);
    bindInteger(insert, 12, counts.of(report::Outcome::Surveyed));
    bindInteger(insert, 13, failingCount(counts));
    insert.bindNoCopy(14, summaryText);
    insert.bind(15, listedAllMachines(summary) ? 1 : 0);
    insert.exec();
}

void RunRecorder::_insertMachine(long long runId, report::MachineSummary const& machine) {
    _machineInsert.reset();
    bindInteger(_machineInsert, 1, runId);
    _machineInsert.bind(2, machine.identity);
    _machineInsert.bind(3, report::overallCode(machine.partitions));
    if (machine.listingFailure) {
        _machineInsert.bind(4,
                            compactText(report::listingFailureDocument(*machine.listingFailure)));
    } else {
        _machineInsert.bind(4);
    }
    _machineInsert.exec();
    std::vector<std::string> const names = partitionNames(machine.partitions);
    for (std::size_t at = 0; at < names.size(); ++at) {
        _insertPartition(runId, machine.identity, names[at], machine.partitions[at]);
    }
}

void RunRecorder::_insertPartition(long long runId, std::string const& machine,
                                   std::string const& name,
                                   report::PartitionSummary const& partition) {
    SQLite::Statement& insert = _partitionInsert;
    insert.reset();
    bindInteger(insert, 1, runId);
    insert.bind(2, machine);
    insert.bind(3, name);
    bindOptional(insert, 4, partition.id);
    insert.bind(5, partition.ip);
    insert.bind(6, report::outcomeName(partition.outcome));
    insert.bind(7, partition.statusText);
    bindOptional(insert, 8, partition.reason);
    bindOptional(insert, 9, partition.seconds);
    bindOptional(insert, 10, partition.document);
    insert.bind(11, gc_InventoryNotRead);
    insert.exec();
}

} // namespace history
