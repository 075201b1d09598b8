#pragma once

#include "fleet/CommandLine.h"
#include "report/RunSummary.h"
#include "report/SinceLastRun.h"

#include <optional>
#include <string>

namespace fleet {

// sysexits.h's EX_IOERR: the run could not be recorded in its history
// database, though every other output was written.
constexpr int gc_ExitHistoryNotRecorded = 74;

// The run's record in the history database (--history, docs/history.md),
// made once the status files and traces are written and before the report,
// which shows the changes it brings. When a signal makes the run's last
// files be written again, the record made the first time is amended, so a
// run is recorded once.
class RunHistory {
public:
    explicit RunHistory(Options const& options);

    // Records the run as summary tells it (or amends its record). The
    // summary's own history member is set here.
    void record(report::RunSummary summary);
    // What the summary's history member says: nullopt with --no-history.
    std::optional<report::HistoryRecord> const& member() const;
    // "cannot record the run in FILE: reason" when the last attempt failed;
    // nullopt before the first.
    std::optional<std::string> failure() const;
    // What the run's report shows of its history: the changes it brought
    // once recorded, why not when it could not be; nullopt with
    // --no-history.
    std::optional<report::SinceLastRun> sinceLastRun(int staleAfterRuns) const;

private:
    std::optional<report::HistoryRecord> _record;
};

} // namespace fleet
