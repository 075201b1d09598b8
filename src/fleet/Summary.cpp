#include "fleet/Summary.h"

#include "fleet/MachineReport.h"
#include "fleet/RunFiles.h"
#include "survey/calculate_ReturnCode.h"

#include <algorithm>
#include <iterator>

namespace Fleet {

namespace {

template <typename T> nlohmann::json orNull(std::optional<T> const& value) {
    return value ? nlohmann::json(*value) : nlohmann::json(nullptr);
}

nlohmann::json orNull(std::string const& text) {
    return text.empty() ? nlohmann::json(nullptr) : nlohmann::json(text);
}

nlohmann::json emptyCounts() {
    nlohmann::json counts = {{"partitions", 0}};
    for (auto const& row : report::outcomeTable()) {
        counts[row.name] = 0;
    }
    return counts;
}

} // namespace

std::string Summary::outcomeName(PartitionRecord const& record) {
    return report::outcomeName(record.outcome.value_or(report::Outcome::Interrupted));
}

nlohmann::json Summary::_partition(PartitionRecord const& record) {
    auto const& partition = record.partition;
    auto const& outcome = record.result;
    nlohmann::json entry = {
        {"id", partition.get_PartitionID()}, {"host", partition.get_HostName()},
        {"ip", partition.get_IP()},          {"active_status", partition.get_ActiveStatus()},
        {"outcome", outcomeName(record)},    {"status_text", outcome.statusText},
        {"return_code", outcome.returnCode}, {"rc", orNull(outcome.rc)},
        {"rc_cmd", orNull(outcome.rcCmd)},   {"document", orNull(outcome.fileName)},
        {"reason", orNull(outcome.reason)},  {"seconds", orNull(record.seconds)},
    };
    if (record.stop) {
        entry["time_limit"] = {{"action", record.stop->action},
                               {"stopped_after_seconds", record.stop->seconds}};
    }
    return entry;
}

void Summary::_count(nlohmann::json& counts, MachineRecord const& machine) {
    for (auto const& record : machine.partitions) {
        counts["partitions"] = counts["partitions"].get<int>() + 1;
        std::string const outcome = outcomeName(record);
        counts[outcome] = counts[outcome].get<int>() + 1;
    }
}

nlohmann::json Summary::_counts(std::vector<MachineRecord> const& machines) {
    nlohmann::json counts = emptyCounts();
    for (auto const& machine : machines) {
        _count(counts, machine);
    }
    counts["machines"] = machines.size();
    return counts;
}

nlohmann::json Summary::_machine(MachineRecord const& machine) {
    nlohmann::json counts = emptyCounts();
    _count(counts, machine);
    nlohmann::json partitions = nlohmann::json::array();
    std::transform(machine.partitions.begin(), machine.partitions.end(),
                   std::back_inserter(partitions), &Summary::_partition);
    return {{"identity", machine.identity},
            {"return_code", get_OverallCode(MachineReport::returnCodes(machine))},
            {"status_file", RunFiles::statusFile(machine.identity)},
            {"trace_file", RunFiles::traceFile(machine.identity)},
            {"counts", counts},
            {"partitions", partitions}};
}

nlohmann::json Summary::build(RunFacts const& facts, std::vector<MachineRecord> const& machines) {
    nlohmann::json machineList = nlohmann::json::array();
    std::transform(machines.begin(), machines.end(), std::back_inserter(machineList),
                   &Summary::_machine);
    return {
        {"schema_version", 1},
        {"tool", "quorvex-survey"},
        {"version", QUORVEX_SURVEY_VERSION},
        {"console_host", facts.consoleHost},
        {"started", facts.started},
        {"ended", facts.ended},
        {"elapsed_seconds", facts.elapsedSeconds},
        {"options",
         {{"jobs", facts.options.jobs},
          {"timeout_seconds", facts.options.timeoutSeconds},
          {"all", facts.options.all},
          {"identities", facts.options.identities}}},
        {"interrupted", orNull(facts.interruptedBy)},
        {"return_code", facts.returnCode},
        {"exit_status", facts.exitStatus},
        {"totals", _counts(machines)},
        {"machines", machineList},
    };
}

std::string Summary::text(nlohmann::json const& summary) {
    return summary.dump(2, ' ', false, nlohmann::json::error_handler_t::replace) + "\n";
}

} // namespace Fleet
