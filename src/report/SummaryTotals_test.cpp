#include "report/SummaryTotals.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>

namespace {

using report::MachineSummary;
using report::Outcome;
using report::PartitionSummary;

// Partitions of the outcomes, each with the survey's code of its outcome.
std::vector<PartitionSummary> partitions(std::vector<Outcome> const& outcomes) {
    std::vector<PartitionSummary> list;
    std::transform(outcomes.begin(), outcomes.end(), std::back_inserter(list), [](Outcome outcome) {
        PartitionSummary partition;
        partition.outcome = outcome;
        partition.returnCode = outcome == Outcome::Surveyed ? "0" : "8";
        return partition;
    });
    return list;
}

MachineSummary machine(std::vector<Outcome> const& outcomes) {
    MachineSummary summary;
    summary.partitions = partitions(outcomes);
    return summary;
}

TEST(SummaryTotals, CountsEveryOutcomeAndThePartitions) {
    report::OutcomeCounts const counts = report::countOutcomes(
        partitions({Outcome::Surveyed, Outcome::Surveyed, Outcome::TimedOut, Outcome::Inactive}));
    EXPECT_EQ(4, counts.partitions);
    EXPECT_EQ(2, counts.of(Outcome::Surveyed));
    EXPECT_EQ(1, counts.of(Outcome::TimedOut));
    EXPECT_EQ(1, counts.of(Outcome::Inactive));
    EXPECT_EQ(0, counts.of(Outcome::ChannelFailure));
    EXPECT_EQ(0, counts.of(Outcome::Interrupted));
}

TEST(SummaryTotals, TotalsAddTheMachinesCounts) {
    report::OutcomeCounts const totals =
        report::totalCounts({machine({Outcome::Surveyed}),
                             machine({Outcome::Surveyed, Outcome::Interrupted}), machine({})});
    EXPECT_EQ(3, totals.partitions);
    EXPECT_EQ(2, totals.of(Outcome::Surveyed));
    EXPECT_EQ(1, totals.of(Outcome::Interrupted));
    EXPECT_EQ(0, totals.of(Outcome::FetchFailure));
}

TEST(SummaryTotals, MachineCodeIsZeroAllFourSomeEightNoneOrNoneListed) {
    EXPECT_EQ("0", report::overallCode(partitions({Outcome::Surveyed})));
    EXPECT_EQ("4", report::overallCode(partitions({Outcome::Surveyed, Outcome::Inactive})));
    EXPECT_EQ("8", report::overallCode(partitions({Outcome::Inactive})));
    EXPECT_EQ("8", report::overallCode(partitions({})));
}

TEST(SummaryTotals, RunCodeTakesEveryMachinesPartitionsTogether) {
    EXPECT_EQ("4", report::overallCode(std::vector<MachineSummary>{
                       machine({Outcome::Surveyed}), machine({Outcome::ChannelFailure})}));
    EXPECT_EQ("0", report::overallCode(
                       std::vector<MachineSummary>{machine({Outcome::Surveyed}), machine({})}));
    EXPECT_EQ("8", report::overallCode(std::vector<MachineSummary>{}));
}

// A machine whose listing failed printed 8 and was not surveyed: beside a
// surveyed machine the run reads 4, never 0.
TEST(SummaryTotals, RunCodeCountsAMachineWhoseListingFailedAsNotSurveyed) {
    MachineSummary unknown = machine({});
    unknown.listingFailure = report::ListingFailure{"/opt/vtc/bin/lspartition -ix -c X", 1,
                                                    "lspartition: managed system not found"};
    EXPECT_EQ("4", report::overallCode(
                       std::vector<MachineSummary>{machine({Outcome::Surveyed}), unknown}));
    EXPECT_EQ("8", report::overallCode(std::vector<MachineSummary>{unknown}));
}

} // namespace
