#include "report/SummaryTotals.h"

#include "report/StatusText.h"
#include "survey/calculate_ReturnCode.h"

#include <algorithm>
#include <iterator>

namespace report {

namespace {

void appendReturnCodes(std::vector<PartitionSummary> const& partitions,
                       std::vector<std::string>& codes) {
    std::transform(partitions.begin(), partitions.end(), std::back_inserter(codes),
                   [](PartitionSummary const& partition) { return partition.returnCode; });
}

} // namespace

void OutcomeCounts::add(Outcome outcome) {
    ++partitions;
    ++byOutcome[static_cast<std::size_t>(outcome)];
}

void OutcomeCounts::add(OutcomeCounts const& counts) {
    partitions += counts.partitions;
    for (std::size_t i = 0; i < byOutcome.size(); ++i) {
        byOutcome[i] += counts.byOutcome[i];
    }
}

long long OutcomeCounts::of(Outcome outcome) const {
    return byOutcome[static_cast<std::size_t>(outcome)];
}

OutcomeCounts countOutcomes(std::vector<PartitionSummary> const& partitions) {
    OutcomeCounts counts;
    for (PartitionSummary const& partition : partitions) {
        counts.add(partition.outcome);
    }
    return counts;
}

OutcomeCounts totalCounts(std::vector<MachineSummary> const& machines) {
    OutcomeCounts totals;
    for (MachineSummary const& machine : machines) {
        totals.add(countOutcomes(machine.partitions));
    }
    return totals;
}

std::string overallCode(std::vector<PartitionSummary> const& partitions) {
    std::vector<std::string> codes;
    appendReturnCodes(partitions, codes);
    return get_OverallCode(codes);
}

std::string overallCode(std::vector<MachineSummary> const& machines) {
    std::vector<std::string> codes;
    for (MachineSummary const& machine : machines) {
        appendReturnCodes(machine.partitions, codes);
        // A machine the console could not list was not surveyed at all: a
        // run that cannot see it never reads as a success.
        if (machine.listingFailure) {
            codes.emplace_back(gc_NotSurveyedCode);
        }
    }
    return get_OverallCode(codes);
}

} // namespace report
