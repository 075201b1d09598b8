#include "monitoring/RunMetrics.h"

#include <gtest/gtest.h>

namespace {

using report::Outcome;

report::PartitionSummary partition(std::string host, Outcome outcome) {
    report::PartitionSummary summary;
    summary.host = std::move(host);
    summary.outcome = outcome;
    return summary;
}

// Two machines: one with a surveyed, a failed and an inactive partition,
// one whose listing failed.
report::RunSummary twoMachines() {
    report::RunSummary summary;
    summary.consoleHost = "hmc1";
    report::MachineSummary first;
    first.identity = "9119-MHE_21ABCDE";
    first.partitions = {partition("a", Outcome::Surveyed), partition("b", Outcome::ClientFailure),
                        partition("c", Outcome::Inactive), partition("d", Outcome::Surveyed)};
    report::MachineSummary second;
    second.identity = "8286-42A_10XYZ99";
    second.listingFailure = report::ListingFailure{"lspartition", 1, "not found"};
    summary.machines = {first, second};
    return summary;
}

report::RunSummary noMachines(std::string console) {
    report::RunSummary summary;
    summary.consoleHost = std::move(console);
    return summary;
}

monitoring::RunEnding ending(int exitStatus) {
    monitoring::RunEnding ending;
    ending.startedUnix = 1795000000;
    ending.endedUnix = 1795000125;
    ending.durationSeconds = 125.25;
    ending.exitStatus = exitStatus;
    return ending;
}

// The families that every file ends with.
std::string runFamilies(std::string const& console, int exitStatus, bool recorded) {
    std::string const labels = "{console=\"" + console + "\"}";
    return "# HELP quorvex_survey_run_start_timestamp_seconds When the last run started, in "
           "seconds since the epoch.\n"
           "# TYPE quorvex_survey_run_start_timestamp_seconds gauge\n"
           "quorvex_survey_run_start_timestamp_seconds" +
           labels +
           " 1795000000\n"
           "# HELP quorvex_survey_run_end_timestamp_seconds When the last run ended, in "
           "seconds since the epoch.\n"
           "# TYPE quorvex_survey_run_end_timestamp_seconds gauge\n"
           "quorvex_survey_run_end_timestamp_seconds" +
           labels +
           " 1795000125\n"
           "# HELP quorvex_survey_run_duration_seconds How long the last run took, in seconds.\n"
           "# TYPE quorvex_survey_run_duration_seconds gauge\n"
           "quorvex_survey_run_duration_seconds" +
           labels +
           " 125.250\n"
           "# HELP quorvex_survey_run_exit_status The exit status of the last run (0 every "
           "partition surveyed).\n"
           "# TYPE quorvex_survey_run_exit_status gauge\n"
           "quorvex_survey_run_exit_status" +
           labels + " " + std::to_string(exitStatus) +
           "\n"
           "# HELP quorvex_survey_history_recorded 1 when the last run was recorded in the "
           "history database, else 0.\n"
           "# TYPE quorvex_survey_history_recorded gauge\n"
           "quorvex_survey_history_recorded" +
           labels + (recorded ? " 1\n" : " 0\n");
}

std::string partitionLine(std::string const& machine, std::string const& outcome, int count) {
    return R"(quorvex_survey_partitions{console="hmc1",machine=")" + machine + "\",outcome=\"" +
           outcome + "\"} " + std::to_string(count) + "\n";
}

std::string machineFamilies() {
    std::string text = "# HELP quorvex_survey_partitions Partitions of the last run, per machine "
                       "and outcome.\n# TYPE quorvex_survey_partitions gauge\n";
    char const* const outcomes[] = {"surveyed",       "inactive",      "channel_failure",
                                    "client_failure", "fetch_failure", "timed_out",
                                    "interrupted",    "worker_died"};
    int const first[] = {2, 1, 0, 1, 0, 0, 0, 0};
    for (int i = 0; i < 8; ++i) {
        text += partitionLine("9119-MHE_21ABCDE", outcomes[i], first[i]);
    }
    for (char const* outcome : outcomes) {
        text += partitionLine("8286-42A_10XYZ99", outcome, 0);
    }
    return text +
           "# HELP quorvex_survey_machine_listing_failed 1 when the console could not list the "
           "machine's partitions in the last run, else 0.\n"
           "# TYPE quorvex_survey_machine_listing_failed gauge\n"
           "quorvex_survey_machine_listing_failed{console=\"hmc1\",machine=\"9119-MHE_21ABCDE\"} "
           "0\n"
           "quorvex_survey_machine_listing_failed{console=\"hmc1\",machine=\"8286-42A_10XYZ99\"} "
           "1\n";
}

TEST(RunMetrics, RunWithoutHistoryHasEveryMachineOutcomeAndNoChangeMetrics) {
    EXPECT_EQ(monitoring::metricsText(twoMachines(), ending(4)),
              machineFamilies() + runFamilies("hmc1", 4, false));
}

TEST(RunMetrics, RecordedRunHasItsChangesPerKind) {
    monitoring::RunEnding recorded = ending(0);
    recorded.historyRecorded = true;
    recorded.changes = monitoring::RunChanges{2, 1, 3, 4, 5, 6};
    std::string const labels = "{console=\"hmc1\"}";
    EXPECT_EQ(monitoring::metricsText(twoMachines(), recorded),
              machineFamilies() +
                  "# HELP quorvex_survey_new_failures Partitions failing in the last run that "
                  "were not failing in the run before it.\n"
                  "# TYPE quorvex_survey_new_failures gauge\n"
                  "quorvex_survey_new_failures" +
                  labels +
                  " 2\n"
                  "# HELP quorvex_survey_recoveries Partitions surveyed in the last run that "
                  "were failing in the run before it.\n"
                  "# TYPE quorvex_survey_recoveries gauge\n"
                  "quorvex_survey_recoveries" +
                  labels +
                  " 1\n"
                  "# HELP quorvex_survey_inventory_changes Component changes the last run found "
                  "against the run before it, per kind of change.\n"
                  "# TYPE quorvex_survey_inventory_changes gauge\n"
                  "quorvex_survey_inventory_changes{console=\"hmc1\",change=\"added\"} 3\n"
                  "quorvex_survey_inventory_changes{console=\"hmc1\",change=\"removed\"} 4\n"
                  "quorvex_survey_inventory_changes{console=\"hmc1\",change=\"replaced\"} 5\n"
                  "quorvex_survey_inventory_changes{console=\"hmc1\",change=\"property_changed\"}"
                  " 6\n" +
                  runFamilies("hmc1", 0, true));
}

TEST(RunMetrics, HistoryRecordedWithChangesUnreadableSaysRecordedWithoutChangeMetrics) {
    monitoring::RunEnding recorded = ending(73);
    recorded.historyRecorded = true;
    EXPECT_EQ(monitoring::metricsText(noMachines("hmc1"), recorded), runFamilies("hmc1", 73, true));
}

TEST(RunMetrics, RunWithoutMachinesLeavesOutTheMachineFamilies) {
    EXPECT_EQ(monitoring::metricsText(noMachines("hmc1"), ending(69)),
              runFamilies("hmc1", 69, false));
}

TEST(RunMetrics, HostileConsoleAndMachineNamesAreEscapedInLabels) {
    report::RunSummary summary = noMachines("h\"m\\c\n1");
    report::MachineSummary machine;
    machine.identity = "x\"y\xFF";
    summary.machines = {machine};
    std::string const text = monitoring::metricsText(summary, ending(8));
    EXPECT_NE(text.find("quorvex_survey_partitions{console=\"h\\\"m\\\\c\\n1\",machine=\"x\\\"y"
                        "\xEF\xBF\xBD\",outcome=\"surveyed\"} 0\n"),
              std::string::npos)
        << text;
    EXPECT_NE(text.find("quorvex_survey_run_exit_status{console=\"h\\\"m\\\\c\\n1\"} 8\n"),
              std::string::npos)
        << text;
}

} // namespace
