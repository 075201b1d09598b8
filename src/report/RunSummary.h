#pragma once

#include "report/ListingFailure.h"
#include "report/Outcome.h"
#include "report/RemoteAction.h"

#include <nlohmann/json.hpp>

#include <cstddef>
#include <optional>
#include <string>
#include <variant>
#include <vector>

namespace report {

// The run summary of docs/summary.schema.json as the programs know it, before
// it becomes a document: a run of quorvex-survey fills it from its records,
// the report from the files earlier runs left. What the writer cannot know
// is nullopt and becomes null. Counts, totals and overall codes are not kept
// here: summaryDocument derives them from the partitions.

// A remote action that quorvex-survey stopped, by its time limit or because
// a signal interrupted the run.
struct StoppedAction {
    RemoteAction action = RemoteAction::RunCommand;
    double afterSeconds = 0;
};

// One listed partition.
struct PartitionSummary {
    std::optional<std::string> id;
    std::string host;
    std::string ip;
    std::optional<std::string> activeStatus;
    Outcome outcome = Outcome::Interrupted;
    std::string statusText;
    // The survey's code of the partition: "0" surveyed, "8" not.
    std::string returnCode;
    std::optional<long long> rc;
    std::optional<long long> rcCmd;
    std::optional<std::string> document;
    std::optional<std::string> reason;
    std::optional<double> seconds;
    std::optional<StoppedAction> stoppedAction;
};

// One machine and its partitions in listing order.
struct MachineSummary {
    std::string identity;
    std::string statusFile;
    std::optional<std::string> traceFile;
    std::vector<PartitionSummary> partitions;
    // Set when the console's partition listing of the machine failed: the
    // machine then has no partitions, whatever its status file says.
    std::optional<ListingFailure> listingFailure;
};

// The options of the run.
struct SummaryOptions {
    std::optional<std::size_t> jobs;
    std::optional<unsigned int> timeoutSeconds;
    bool all = false;
    std::vector<std::string> identities;
};

// Where the run was recorded in the history database (docs/history.md).
struct HistoryRecord {
    std::string file;
    // The run's id in the database once recorded.
    std::optional<long long> runId;
    bool recorded = false;
    // Why it could not be recorded.
    std::optional<std::string> error;
};

// Whole seconds when taken from file times, which have no fraction; else the
// run's measured time.
using ElapsedSeconds = std::variant<long long, double>;

struct RunSummary {
    // The program writing the summary: "quorvex-survey", or
    // "quorvex-survey report" reading the files of earlier runs.
    std::string tool;
    std::string consoleHost;
    std::string started;
    std::string ended;
    ElapsedSeconds elapsedSeconds = 0LL;
    SummaryOptions options;
    // The signal that interrupted the run (SIGINT, SIGTERM, SIGHUP, SIGPIPE).
    std::optional<std::string> interruptedBy;
    std::optional<int> exitStatus;
    std::vector<MachineSummary> machines;
    // Set when the console's machine listing (--all) failed: the run then
    // has no machines.
    std::optional<ListingFailure> listingFailure;
    // nullopt when the run keeps no history (--no-history, or a report read
    // from files).
    std::optional<HistoryRecord> history;
};

// The summary's document, its keys in the schema's order: counts per machine
// and in total, and the machines' and the run's overall codes, derived from
// the partitions by the survey's own rule.
nlohmann::ordered_json summaryDocument(RunSummary const& summary);

// The text of a summary document, as --summary and a report's summary.json
// hold it: indented by two spaces, bytes that are not UTF-8 replaced by
// U+FFFD, ending with a line end.
std::string summaryText(nlohmann::ordered_json const& document);

} // namespace report
