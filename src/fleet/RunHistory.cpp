#include "fleet/RunHistory.h"

#include "history/HistoryDatabase.h"
#include "report/ReportCommand.h"
#include "report/SinceLastRunReader.h"

#include <exception>

namespace fleet {

RunHistory::RunHistory(Options const& options) {
    if (options.recordHistory) {
        _record = report::HistoryRecord{options.historyFile, std::nullopt, false, std::nullopt};
    }
}

// Any failure, whatever throws it (the database, the file system, the
// changes' computation), leaves the run without its record and every other
// output still to be written.
void RunHistory::record(report::RunSummary summary) {
    if (!_record) {
        return;
    }
    summary.history = report::HistoryRecord{_record->file, _record->runId, true, std::nullopt};
    try {
        nlohmann::ordered_json const document = report::summaryDocument(summary);
        history::HistoryDatabase database(_record->file);
        if (_record->runId) {
            database.amendRun(*_record->runId, summary, document);
        } else {
            _record->runId = database.recordRun(summary, document, report::gc_DefaultVpdFolder);
        }
        _record->recorded = true;
        _record->error.reset();
    } catch (std::exception const& refusal) {
        _record->recorded = false;
        _record->error = refusal.what();
    }
}

std::optional<report::HistoryRecord> const& RunHistory::member() const {
    return _record;
}

std::optional<std::string> RunHistory::failure() const {
    if (!_record || !_record->error) {
        return std::nullopt;
    }
    return "cannot record the run in " + _record->file + ": " + *_record->error;
}

std::optional<report::SinceLastRun> RunHistory::sinceLastRun(int staleAfterRuns) const {
    if (!_record) {
        return std::nullopt;
    }
    if (_record->runId) {
        return report::sinceLastRunFor(_record->file, *_record->runId, staleAfterRuns);
    }
    return report::historyNotRecorded(_record->error.value_or(""));
}

} // namespace fleet
