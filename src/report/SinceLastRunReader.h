#pragma once

#include "report/HistoryBusyTimeout.h"
#include "report/SinceLastRun.h"

#include <optional>
#include <string>

namespace report {

// Reading what changed since the last run out of the history database
// (schema in src/history/migrations), for the report. The database is opened
// read-only with a busy timeout (gc_HistoryBusyTimeoutMilliseconds), so that
// a run recording meanwhile is waited for and never disturbed.

// The changes of run runId against the console's previous run, each
// partition's failing streak and last survey, and which partitions have not
// been surveyed for staleAfterRuns runs in a row. Throws std::runtime_error
// (util::SystemError for a file that cannot be read, SQLite::Exception for
// a database that cannot be queried) with the cause.
SinceLastRun readSinceLastRun(std::string const& dbPath, long long runId, int staleAfterRuns);

// The same for a run that has just recorded its history; never throws: a
// database that cannot be read gives a SinceLastRun whose "unavailable"
// says why, as the report shows it.
SinceLastRun sinceLastRunFor(std::string const& dbPath, long long runId, int staleAfterRuns);

// The state of a run whose history could not be recorded: the report says
// so, with the reason, in place of the changes.
SinceLastRun historyNotRecorded(std::string const& reason);

// The newest run recorded for console, or nothing when the database holds
// none. Throws like readSinceLastRun().
std::optional<long long> newestRunOf(std::string const& dbPath, std::string const& console);

} // namespace report
