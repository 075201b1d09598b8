#include "report/SinceLastRunReader.h"

#include "utility/SystemError.h"

#include <SQLiteCpp/SQLiteCpp.h>
#include <unistd.h>

#include <cerrno>

namespace report {

namespace {

using PartitionChange = SinceLastRun::PartitionChange;
using ComponentChange = SinceLastRun::ComponentChange;

// SQLite's own message for a file it cannot open says no more than "unable
// to open database file": the file is tried first, for errno's words.
SQLite::Database openReadOnly(std::string const& dbPath) {
    if (access(dbPath.c_str(), R_OK) != 0) {
        throw util::SystemError("read", dbPath, errno);
    }
    return SQLite::Database(dbPath, SQLite::OPEN_READONLY, gc_HistoryBusyTimeoutMilliseconds);
}

std::optional<std::string> optionalText(SQLite::Column const& column) {
    if (column.isNull()) {
        return std::nullopt;
    }
    return column.getString();
}

// The run's console and its previous run, the latest of the same console
// recorded before it.
std::string readRuns(SQLite::Database& db, SinceLastRun& since) {
    SQLite::Statement run(db, "SELECT console FROM runs WHERE id = ?");
    run.bind(1, static_cast<int64_t>(since.runId));
    if (!run.executeStep()) {
        throw std::runtime_error("the history holds no run " + std::to_string(since.runId));
    }
    std::string console = run.getColumn(0).getString();
    SQLite::Statement previous(
        db, "SELECT id, started FROM runs WHERE console = ? AND id < ? ORDER BY id DESC LIMIT 1");
    previous.bind(1, console);
    previous.bind(2, static_cast<int64_t>(since.runId));
    if (previous.executeStep()) {
        since.previousRunId = previous.getColumn(0).getInt64();
        since.previousStarted = previous.getColumn(1).getString();
    }
    return console;
}

// The partition's change from an events row (see the query in readEvents).
PartitionChange partitionChange(SQLite::Statement const& row) {
    return {row.getColumn(2).getString(),    row.getColumn(3).getString(),
            row.getColumn(9).getString(),    row.getColumn(10).getString(),
            optionalText(row.getColumn(11)), row.getColumn(12).getInt64()};
}

ComponentChange componentChange(SQLite::Statement const& row) {
    return {row.getColumn(1).getString(), row.getColumn(2).getString(),
            row.getColumn(3).getString(), row.getColumn(4).getString(),
            row.getColumn(5).getString(), row.getColumn(6).getString(),
            row.getColumn(7).getString(), row.getColumn(8).getString()};
}

// The list a partition event of this kind goes to; none for a kind this
// reader does not know (one a newer program records).
std::vector<PartitionChange>* partitionList(SinceLastRun& since, std::string const& kind) {
    if (kind == "newly_failing") {
        return &since.newFailures;
    }
    if (kind == "recovered") {
        return &since.recoveries;
    }
    if (kind == "still_failing") {
        return &since.stillFailing;
    }
    if (kind == "newly_inactive") {
        return &since.newlyInactive;
    }
    if (kind == "appeared") {
        return &since.partitionsAppeared;
    }
    if (kind == "disappeared") {
        return &since.partitionsDisappeared;
    }
    return nullptr;
}

void addEvent(SinceLastRun& since, SQLite::Statement const& row) {
    std::string const scope = row.getColumn(0).getString();
    std::string const kind = row.getColumn(1).getString();
    if (scope == "component") {
        since.inventoryChanges.push_back(componentChange(row));
    } else if (scope == "partition") {
        if (std::vector<PartitionChange>* const list = partitionList(since, kind)) {
            list->push_back(partitionChange(row));
        }
    } else if (scope == "machine" && kind == "appeared") {
        since.machinesAppeared.push_back(row.getColumn(2).getString());
    } else if (scope == "machine" && kind == "disappeared") {
        since.machinesDisappeared.push_back(row.getColumn(2).getString());
    }
}

void readEvents(SQLite::Database& db, SinceLastRun& since) {
    SQLite::Statement events(
        db, "SELECT scope, kind, machine, coalesce(partition, ''), coalesce(component, ''),"
            " coalesce(component_name, ''), coalesce(property, ''), coalesce(old_value, ''),"
            " coalesce(new_value, ''), coalesce(outcome, ''), coalesce(reason, ''),"
            " (SELECT started FROM runs WHERE id = events.failing_since_run),"
            " coalesce(runs_failing, 0)"
            " FROM events WHERE run_id = ? ORDER BY id");
    events.bind(1, static_cast<int64_t>(since.runId));
    while (events.executeStep()) {
        addEvent(since, events);
    }
}

// Runs not surveyed in a row: the console's runs that listed the
// partition's machine after the latest that surveyed the partition or, when
// none did, from its first record on. A run of other machines says nothing
// of this one.
constexpr char gc_PartitionsQuery[] =
    "SELECT p.machine, p.partition,"
    " (SELECT started FROM runs WHERE id = p.failing_since_run),"
    " (SELECT started FROM runs WHERE id = p.last_surveyed_run),"
    " (SELECT count(*) FROM runs r JOIN machine_results m ON m.run_id = r.id"
    "  AND m.machine = p.machine WHERE r.console = ?1 AND r.id <= p.run_id AND r.id >"
    "  coalesce(p.last_surveyed_run, (SELECT min(q.run_id) - 1 FROM partition_results q"
    "   JOIN runs qr ON qr.id = q.run_id AND qr.console = ?1"
    "   WHERE q.machine = p.machine AND q.partition = p.partition)))"
    " FROM partition_results p WHERE p.run_id = ?2";

void readPartitions(SQLite::Database& db, SinceLastRun& since, std::string const& console) {
    SQLite::Statement partitions(db, gc_PartitionsQuery);
    partitions.bind(1, console);
    partitions.bind(2, static_cast<int64_t>(since.runId));
    while (partitions.executeStep()) {
        SinceLastRun::PartitionState state;
        state.failingSince = optionalText(partitions.getColumn(2));
        state.lastSurveyed = optionalText(partitions.getColumn(3));
        state.runsNotSurveyed = partitions.getColumn(4).getInt64();
        state.isStale = state.runsNotSurveyed >= since.staleAfterRuns;
        since.partitions[{partitions.getColumn(0).getString(),
                          partitions.getColumn(1).getString()}] = state;
    }
}

} // namespace

SinceLastRun readSinceLastRun(std::string const& dbPath, long long runId, int staleAfterRuns) {
    SQLite::Database db = openReadOnly(dbPath);
    SinceLastRun since;
    since.runId = runId;
    since.staleAfterRuns = staleAfterRuns;
    // One read transaction: a run recorded meanwhile is either wholly seen or not.
    SQLite::Transaction const snapshot(db);
    std::string const console = readRuns(db, since);
    readEvents(db, since);
    readPartitions(db, since, console);
    return since;
}

SinceLastRun sinceLastRunFor(std::string const& dbPath, long long runId, int staleAfterRuns) {
    try {
        return readSinceLastRun(dbPath, runId, staleAfterRuns);
    } catch (util::SystemError const& failure) {
        return historyNotRecorded(failure.what());
    } catch (std::exception const& failure) {
        return historyNotRecorded("cannot read the history " + dbPath + ": " + failure.what());
    }
}

SinceLastRun historyNotRecorded(std::string const& reason) {
    SinceLastRun since;
    since.unavailable = reason;
    return since;
}

std::optional<long long> newestRunOf(std::string const& dbPath, std::string const& console) {
    SQLite::Database db = openReadOnly(dbPath);
    SQLite::Statement newest(db, "SELECT max(id) FROM runs WHERE console = ?");
    newest.bind(1, console);
    newest.executeStep();
    if (newest.getColumn(0).isNull()) {
        return std::nullopt;
    }
    return newest.getColumn(0).getInt64();
}

} // namespace report
