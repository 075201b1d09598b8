#include "monitoring/RunMetrics.h"

#include "monitoring/ExpositionText.h"
#include "monitoring/SecondsText.h"
#include "report/Outcome.h"
#include "report/SummaryTotals.h"

#include <algorithm>
#include <iterator>
#include <utility>
#include <vector>

namespace monitoring {

namespace {

// A metric's name and its HELP text, spelled here once (docs/metrics.md
// lists them).
struct Metric {
    char const* name;
    char const* help;
};

constexpr Metric gc_Partitions{"quorvex_survey_partitions",
                               "Partitions of the last run, per machine and outcome."};
constexpr Metric gc_ListingFailed{
    "quorvex_survey_machine_listing_failed",
    "1 when the console could not list the machine's partitions in the last run, else 0."};
constexpr Metric gc_NewFailures{
    "quorvex_survey_new_failures",
    "Partitions failing in the last run that were not failing in the run before it."};
constexpr Metric gc_Recoveries{
    "quorvex_survey_recoveries",
    "Partitions surveyed in the last run that were failing in the run before it."};
constexpr Metric gc_InventoryChanges{
    "quorvex_survey_inventory_changes",
    "Component changes the last run found against the run before it, per kind of change."};
constexpr Metric gc_Started{"quorvex_survey_run_start_timestamp_seconds",
                            "When the last run started, in seconds since the epoch."};
constexpr Metric gc_Ended{"quorvex_survey_run_end_timestamp_seconds",
                          "When the last run ended, in seconds since the epoch."};
constexpr Metric gc_Duration{"quorvex_survey_run_duration_seconds",
                             "How long the last run took, in seconds."};
constexpr Metric gc_ExitStatus{"quorvex_survey_run_exit_status",
                               "The exit status of the last run (0 every partition surveyed)."};
constexpr Metric gc_HistoryRecorded{
    "quorvex_survey_history_recorded",
    "1 when the last run was recorded in the history database, else 0."};

// One sample: its labels after the console's, and its value as written.
struct Sample {
    std::vector<std::pair<char const*, std::string>> labels;
    std::string value;
};

class Exposition {
public:
    explicit Exposition(std::string console) : _console(std::move(console)) {}

    void add(Metric const& metric, std::vector<Sample> const& samples) {
        if (samples.empty()) {
            return;
        }
        _text += std::string("# HELP ") + metric.name + " " + helpText(metric.help) + "\n";
        _text += std::string("# TYPE ") + metric.name + " gauge\n";
        for (Sample const& sample : samples) {
            _text += metric.name + _labelsOf(sample) + " " + sample.value + "\n";
        }
    }

    std::string const& text() const { return _text; }

private:
    std::string _labelsOf(Sample const& sample) const {
        std::string labels = "{console=\"" + labelValue(_console) + "\"";
        for (auto const& [name, value] : sample.labels) {
            labels += std::string(",") + name + "=\"" + labelValue(value) + "\"";
        }
        return labels + "}";
    }

    std::string _console;
    std::string _text;
};

std::string number(long long value) {
    return std::to_string(value);
}

std::vector<Sample> partitionSamples(std::vector<report::MachineSummary> const& machines) {
    std::vector<Sample> samples;
    for (report::MachineSummary const& machine : machines) {
        report::OutcomeCounts const counts = report::countOutcomes(machine.partitions);
        auto const& outcomes = report::outcomeTable();
        std::transform(outcomes.begin(), outcomes.end(), std::back_inserter(samples),
                       [&](report::OutcomeText const& row) {
                           return Sample{{{"machine", machine.identity}, {"outcome", row.name}},
                                         number(counts.of(row.outcome))};
                       });
    }
    return samples;
}

std::vector<Sample> listingSamples(std::vector<report::MachineSummary> const& machines) {
    std::vector<Sample> samples;
    std::transform(
        machines.begin(), machines.end(), std::back_inserter(samples),
        [](report::MachineSummary const& machine) {
            return Sample{{{"machine", machine.identity}}, machine.listingFailure ? "1" : "0"};
        });
    return samples;
}

void addChanges(Exposition& exposition, RunChanges const& changes) {
    exposition.add(gc_NewFailures, {{{}, number(changes.newFailures)}});
    exposition.add(gc_Recoveries, {{{}, number(changes.recoveries)}});
    exposition.add(gc_InventoryChanges,
                   {{{{"change", "added"}}, number(changes.componentsAdded)},
                    {{{"change", "removed"}}, number(changes.componentsRemoved)},
                    {{{"change", "replaced"}}, number(changes.componentsReplaced)},
                    {{{"change", "property_changed"}}, number(changes.propertiesChanged)}});
}

} // namespace

std::string metricsText(report::RunSummary const& summary, RunEnding const& ending) {
    Exposition exposition(summary.consoleHost);
    exposition.add(gc_Partitions, partitionSamples(summary.machines));
    exposition.add(gc_ListingFailed, listingSamples(summary.machines));
    if (ending.changes) {
        addChanges(exposition, *ending.changes);
    }
    exposition.add(gc_Started, {{{}, number(ending.startedUnix)}});
    exposition.add(gc_Ended, {{{}, number(ending.endedUnix)}});
    exposition.add(gc_Duration, {{{}, secondsText(ending.durationSeconds)}});
    exposition.add(gc_ExitStatus, {{{}, number(ending.exitStatus)}});
    exposition.add(gc_HistoryRecorded, {{{}, ending.historyRecorded ? "1" : "0"}});
    return exposition.text();
}

} // namespace monitoring
