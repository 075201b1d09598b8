#include "history/FailingOutcomes.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

TEST(FailingOutcomes, FailuresOfThePartitionAreFailingAndNothingElse) {
    std::vector<std::string> failing;
    for (report::OutcomeText const& row : report::outcomeTable()) {
        if (history::isFailing(row.outcome)) {
            failing.emplace_back(row.name);
        }
    }
    EXPECT_EQ(failing, (std::vector<std::string>{"channel_failure", "client_failure",
                                                 "fetch_failure", "timed_out", "worker_died"}));
}

} // namespace
