#include "report/RunSummary.h"

#include "report/SummaryTotals.h"

#include <algorithm>
#include <iterator>

namespace report {

using Json = nlohmann::ordered_json;

namespace {

constexpr int gc_SchemaVersion = 1;

template <typename T> Json orNull(std::optional<T> const& value) {
    return value ? Json(*value) : Json(nullptr);
}

template <typename T, typename Convert> Json arrayOf(std::vector<T> const& items, Convert convert) {
    Json list = Json::array();
    std::transform(items.begin(), items.end(), std::back_inserter(list), convert);
    return list;
}

// The partitions, then one count per outcome in the table's order.
void addCounts(Json& object, OutcomeCounts const& counts) {
    object["partitions"] = counts.partitions;
    for (OutcomeText const& row : outcomeTable()) {
        object[row.name] = counts.of(row.outcome);
    }
}

Json countsOf(std::vector<PartitionSummary> const& partitions) {
    Json counts = Json::object();
    addCounts(counts, countOutcomes(partitions));
    return counts;
}

Json totalsOf(std::vector<MachineSummary> const& machines) {
    Json totals = Json::object();
    totals["machines"] = machines.size();
    addCounts(totals, totalCounts(machines));
    return totals;
}

Json partitionDocument(PartitionSummary const& partition) {
    Json entry = {{"id", orNull(partition.id)},
                  {"host", partition.host},
                  {"ip", partition.ip},
                  {"active_status", orNull(partition.activeStatus)},
                  {"outcome", outcomeName(partition.outcome)},
                  {"status_text", partition.statusText},
                  {"return_code", partition.returnCode},
                  {"rc", orNull(partition.rc)},
                  {"rc_cmd", orNull(partition.rcCmd)},
                  {"document", orNull(partition.document)},
                  {"reason", orNull(partition.reason)},
                  {"seconds", orNull(partition.seconds)}};
    if (partition.stoppedAction) {
        entry["time_limit"] = {{"action", remoteActionName(partition.stoppedAction->action)},
                               {"stopped_after_seconds", partition.stoppedAction->afterSeconds}};
    }
    return entry;
}

// Present only when the listing failed, after the keys every document has,
// as "time_limit" is for a partition.
void addListingFailure(Json& document, std::optional<ListingFailure> const& failure) {
    if (failure) {
        document["listing_failure"] = listingFailureDocument(*failure);
    }
}

Json machineDocument(MachineSummary const& machine) {
    Json document = {{"identity", machine.identity},
                     {"return_code", overallCode(machine.partitions)},
                     {"status_file", machine.statusFile},
                     {"trace_file", orNull(machine.traceFile)},
                     {"counts", countsOf(machine.partitions)},
                     {"partitions", arrayOf(machine.partitions, &partitionDocument)}};
    addListingFailure(document, machine.listingFailure);
    return document;
}

Json optionsDocument(SummaryOptions const& options) {
    return {{"jobs", orNull(options.jobs)},
            {"timeout_seconds", orNull(options.timeoutSeconds)},
            {"all", options.all},
            {"identities", options.identities}};
}

Json historyDocument(std::optional<HistoryRecord> const& history) {
    if (!history) {
        return nullptr;
    }
    return {{"file", history->file},
            {"run_id", orNull(history->runId)},
            {"recorded", history->recorded},
            {"error", orNull(history->error)}};
}

} // namespace

Json summaryDocument(RunSummary const& summary) {
    Json document = {{"schema_version", gc_SchemaVersion},
                     {"tool", summary.tool},
                     {"version", QUORVEX_VERSION},
                     {"console_host", summary.consoleHost},
                     {"started", summary.started},
                     {"ended", summary.ended},
                     {"elapsed_seconds", std::visit([](auto seconds) { return Json(seconds); },
                                                    summary.elapsedSeconds)},
                     {"options", optionsDocument(summary.options)},
                     {"interrupted", orNull(summary.interruptedBy)},
                     {"return_code", overallCode(summary.machines)},
                     {"exit_status", orNull(summary.exitStatus)},
                     {"history", historyDocument(summary.history)},
                     {"totals", totalsOf(summary.machines)},
                     {"machines", arrayOf(summary.machines, &machineDocument)}};
    addListingFailure(document, summary.listingFailure);
    return document;
}

std::string summaryText(Json const& document) {
    return document.dump(2, ' ', false, Json::error_handler_t::replace) + "\n";
}

} // namespace report
