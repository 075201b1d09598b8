#include "estate/EstateHistory.h"

#include "estate/BundledRun.h"
#include "history/HistoryDatabase.h"
#include "report/SinceLastRunReader.h"

#include <SQLiteCpp/Statement.h>

#include <cstdint>
#include <exception>
#include <optional>
#include <utility>

namespace estate {

using Json = nlohmann::ordered_json;

namespace {

bool isRecorded(RecordKind kind) {
    return kind == RecordKind::Collected || kind == RecordKind::Stale;
}

// The run recorded before of this console that started then, if any.
std::optional<long long> recordedRun(history::HistoryDatabase& database,
                                     report::RunSummary const& run) {
    SQLite::Statement query(database.connection(),
                            "SELECT id FROM runs WHERE console = ? AND started = ? "
                            "ORDER BY id DESC LIMIT 1");
    query.bind(1, run.consoleHost);
    query.bind(2, run.started);
    if (!query.executeStep()) {
        return std::nullopt;
    }
    return static_cast<long long>(query.getColumn(0).getInt64());
}

constexpr char gc_HistoryMember[] = "history";

// The summary's history member, taken out; null when it had none.
std::optional<Json> takeHistoryMember(Json& summary) {
    if (!summary.contains(gc_HistoryMember)) {
        return std::nullopt;
    }
    Json member = std::move(summary[gc_HistoryMember]);
    return member;
}

void putBackHistoryMember(Json& summary, std::optional<Json>&& member) {
    if (member) {
        summary[gc_HistoryMember] = std::move(*member);
    } else {
        summary.erase(gc_HistoryMember);
    }
}

// Records the run with the summary as the history keeps it: its history
// member says where it is recorded now, as a run's own summary does (the
// console's own record stays in its bundle). The member is set in place and
// put back after, whatever happens, rather than the estate copying a summary
// of thousands of partitions for one member.
long long recordKeptSummary(history::HistoryDatabase& database, report::RunSummary const& run,
                            Json& summary, std::string const& vpdFolder) {
    std::optional<Json> own = takeHistoryMember(summary);
    try {
        summary[gc_HistoryMember] = Json{
            {"file", database.path()}, {"run_id", nullptr}, {"recorded", true}, {"error", nullptr}};
        long long const runId = database.recordRun(run, summary, vpdFolder);
        putBackHistoryMember(summary, std::move(own));
        return runId;
    } catch (...) {
        putBackHistoryMember(summary, std::move(own));
        throw;
    }
}

} // namespace

EstateHistory::EstateHistory(std::string file) : _file(std::move(file)) {}

// Any failure, whatever throws it (a summary the history cannot take, the
// database, the documents), leaves that console's run unrecorded and every
// output still to be written.
std::optional<report::SinceLastRun> EstateHistory::record(ConsoleRun const& console,
                                                          Json& summary) {
    if (_file.empty() || !isRecorded(console.record.kind)) {
        return std::nullopt;
    }
    try {
        long long const runId = _recordOnce(console, summary);
        return report::sinceLastRunFor(_file, runId, report::gc_DefaultStaleAfterRuns);
    } catch (std::exception const& failure) {
        _failures.push_back("cannot record console " + console.record.console + "'s run in " +
                            _file + ": " + failure.what());
        return report::historyNotRecorded(failure.what());
    }
}

std::vector<std::string> const& EstateHistory::failures() const {
    return _failures;
}

long long EstateHistory::_recordOnce(ConsoleRun const& console, Json& summary) const {
    report::RunSummary run = bundledRun(summary);
    run.consoleHost = console.record.console;
    history::HistoryDatabase database(_file);
    if (std::optional<long long> const recorded = recordedRun(database, run)) {
        return *recorded;
    }
    return recordKeptSummary(database, run, summary, console.vpdFolder);
}

} // namespace estate
