#include "fleet/Summary.h"

#include "fleet/RunFiles.h"
#include "report/ReportCommand.h"

#include <algorithm>
#include <iterator>

namespace fleet {

namespace {

template <typename T> std::optional<long long> widened(std::optional<T> const& value) {
    return value ? std::optional<long long>(*value) : std::nullopt;
}

std::optional<std::string> unlessEmpty(std::string const& text) {
    return text.empty() ? std::nullopt : std::optional<std::string>(text);
}

report::PartitionSummary partitionSummary(PartitionRecord const& record) {
    auto const& partition = record.partition;
    auto const& result = record.result;
    report::PartitionSummary summary;
    summary.id = partition.get_PartitionID();
    summary.host = partition.get_HostName();
    summary.ip = partition.get_IP();
    summary.activeStatus = partition.get_ActiveStatus();
    // A partition still unsettled at the end was cut short by the run's end.
    summary.outcome = record.outcome.value_or(report::Outcome::Interrupted);
    summary.statusText = result.statusText;
    summary.returnCode = result.returnCode;
    summary.rc = widened(result.rc);
    summary.rcCmd = widened(result.rcCmd);
    summary.document = unlessEmpty(result.fileName);
    summary.reason = unlessEmpty(result.reason);
    summary.seconds = record.seconds;
    if (record.stop) {
        summary.stoppedAction = report::StoppedAction{record.stop->action, record.stop->seconds};
    }
    return summary;
}

report::MachineSummary machineSummary(MachineRecord const& machine) {
    report::MachineSummary summary;
    summary.identity = machine.identity;
    summary.statusFile = statusFilePath(machine.identity);
    summary.traceFile = traceFilePath(machine.identity);
    summary.listingFailure = machine.listingFailure;
    std::transform(machine.partitions.begin(), machine.partitions.end(),
                   std::back_inserter(summary.partitions), &partitionSummary);
    return summary;
}

report::SummaryOptions summaryOptions(Options const& options) {
    report::SummaryOptions summary;
    summary.jobs = options.jobs;
    summary.timeoutSeconds = options.timeoutSeconds;
    summary.all = options.all;
    summary.identities = options.identities;
    return summary;
}

} // namespace

report::RunSummary runSummary(RunFacts const& facts, std::vector<MachineRecord> const& machines) {
    report::RunSummary summary;
    summary.tool = report::gc_ProgramName;
    summary.consoleHost = facts.consoleHost;
    summary.started = facts.started;
    summary.ended = facts.ended;
    summary.elapsedSeconds = facts.elapsedSeconds;
    summary.options = summaryOptions(facts.options);
    summary.interruptedBy = unlessEmpty(facts.interruptedBy);
    summary.exitStatus = facts.exitStatus;
    summary.listingFailure = facts.listingFailure;
    std::transform(machines.begin(), machines.end(), std::back_inserter(summary.machines),
                   &machineSummary);
    return summary;
}

} // namespace fleet
