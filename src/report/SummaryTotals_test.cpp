#include "report/SummaryTotals.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>

namespace {

using Json = nlohmann::ordered_json;

Json partitions(std::vector<std::string> const& outcomes) {
    Json list = Json::array();
    std::transform(outcomes.begin(), outcomes.end(), std::back_inserter(list),
                   [](std::string const& outcome) {
                       return Json{{"outcome", outcome}};
                   });
    return list;
}

TEST(SummaryTotals, CountsEveryOutcomeAndThePartitions) {
    Json const counts =
        report::countOutcomes(partitions({"surveyed", "surveyed", "timed_out", "inactive"}));
    EXPECT_EQ(R"({"partitions":4,"surveyed":2,"inactive":1,"channel_failure":0,"client_failure":0,)"
              R"("fetch_failure":0,"timed_out":1,"interrupted":0})",
              counts.dump());
}

TEST(SummaryTotals, UnknownOutcomeCountsAsPartitionOnly) {
    Json const counts = report::countOutcomes(partitions({"partitions", "odd"}));
    EXPECT_EQ(2, counts["partitions"]);
    EXPECT_EQ(0, counts["surveyed"]);
}

TEST(SummaryTotals, TotalsAddTheMachinesCounts) {
    Json machines = Json::array();
    machines.push_back({{"counts", report::countOutcomes(partitions({"surveyed"}))}});
    machines.push_back(
        {{"counts", report::countOutcomes(partitions({"surveyed", "interrupted"}))}});
    Json const totals = report::totalCounts(machines);
    EXPECT_EQ(2, totals["machines"]);
    EXPECT_EQ(3, totals["partitions"]);
    EXPECT_EQ(2, totals["surveyed"]);
    EXPECT_EQ(1, totals["interrupted"]);
}

TEST(SummaryTotals, OverallCodeAllSomeNoneAndNoneListed) {
    EXPECT_EQ("0", report::overallCode(report::countOutcomes(partitions({"surveyed"}))));
    EXPECT_EQ("4",
              report::overallCode(report::countOutcomes(partitions({"surveyed", "inactive"}))));
    EXPECT_EQ("8", report::overallCode(report::countOutcomes(partitions({"inactive"}))));
    EXPECT_EQ("8", report::overallCode(report::countOutcomes(partitions({}))));
}

} // namespace
