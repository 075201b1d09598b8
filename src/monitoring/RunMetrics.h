#pragma once

#include "monitoring/RunChanges.h"
#include "report/RunSummary.h"

#include <optional>
#include <string>

namespace monitoring {

// The run's figures as a metrics file for the node exporter's textfile
// collector (docs/metrics.md): every metric a gauge named quorvex_survey_*,
// labelled with the console's host name, so that one file per console
// describes its last run.

// What the summary does not say about the run's end: it is known only once
// every other file of the run was written.
struct RunEnding {
    long long startedUnix = 0;
    long long endedUnix = 0;
    double durationSeconds = 0;
    // The status the run exits with.
    int exitStatus = 0;
    bool historyRecorded = false;
    // The changes the history computed for the run; nullopt when it recorded
    // none (--no-history, or a history that could not be written or read),
    // and the change metrics are then left out rather than claimed to be 0.
    std::optional<RunChanges> changes;
};

// The file's text: families in a fixed order, each with its HELP and TYPE,
// a family without samples left out; label values escaped, console texts
// made UTF-8.
std::string metricsText(report::RunSummary const& summary, RunEnding const& ending);

} // namespace monitoring
