#pragma once

#include "report/Outcome.h"
#include "report/RunSummary.h"

#include <array>
#include <string>
#include <vector>

namespace report {

// How many partitions a summary lists, and how many ended in each outcome.
struct OutcomeCounts {
    long long partitions = 0;
    // In the order of the outcome table.
    std::array<long long, gc_OutcomeCount> byOutcome{};

    void add(Outcome outcome);
    void add(OutcomeCounts const& counts);
    long long of(Outcome outcome) const;
};

OutcomeCounts countOutcomes(std::vector<PartitionSummary> const& partitions);
// The sum of the machines' counts.
OutcomeCounts totalCounts(std::vector<MachineSummary> const& machines);

// The survey's overall code of the partitions' codes ("0" all surveyed, "4"
// some, "8" none or none listed): of one machine, and of a whole run.
std::string overallCode(std::vector<PartitionSummary> const& partitions);
std::string overallCode(std::vector<MachineSummary> const& machines);

} // namespace report
