// The console-wide survey against the one-machine survey tool run once per
// machine in turn: at one, four and thirty-two partitions in flight it must
// leave the same files, print the same bytes and run the same console
// command lines. The generated seeds are fixed, so a failing case is made
// again from its name (gen-<seed>, tests/fleet/generate-cases.py).

#include "DifferentialBatch.h"

#include <gtest/gtest.h>

namespace {

using FleetTest::DifferentialBatch;

std::vector<int> const gc_JobCounts{1, 4, 32};

void expectSameAsReference(DifferentialBatch& batch) {
    QuorvexTest::CommandResult const result = batch.run(gc_JobCounts);
    if (result.exitStatus == 77) {
        GTEST_SKIP() << "no private mount namespace for the sandbox: " << result.stderrText;
    }
    ASSERT_EQ(result.exitStatus, 0) << "the cases did not all run: " << result.stderrText;
    for (FleetTest::DifferentialCase const& differentialCase : batch.cases()) {
        for (int const jobs : gc_JobCounts) {
            differentialCase.expectSameAsReference(jobs);
        }
    }
}

TEST(FleetDifferential, ShippedScenariosGiveTheSameResults) {
    DifferentialBatch batch;
    batch.addShipped("demo", "demo.scn", {"9119-MHE_21ABCDE"}, false);
    batch.addShipped("empty", "empty.scn", {"9119-MHE_21ABCDE"}, false);
    batch.addShipped("several-machines-all", "several-machines.scn",
                     {"8286-42A_10XYZ99", "9119-MHE_21ABCDE"}, true);
    batch.addShipped(
        "several-machines-given", "several-machines.scn",
        {"9119-MHE_21ABCDE", "7063-CR2_06HMC01", "1234-ABC_10ABCDE", "8286-42A_10XYZ99"}, false);
    batch.addShipped("odd-output", "odd-output.scn", {"9119-MHE_21ABCDE"}, false);
    batch.addShipped("slow", "slow.scn", {"9119-MHE_21ABCDE"}, false);
    expectSameAsReference(batch);
}

// Two hundred generated consoles of two or three machines, in batches of
// twenty-five seeds that ctest can run side by side.
constexpr int gc_SeedsPerBatch = 25;
constexpr int gc_Batches = 8;

class GeneratedSeeds : public ::testing::TestWithParam<int> {};

TEST_P(GeneratedSeeds, GiveTheSameResults) {
    DifferentialBatch batch;
    batch.addGenerated(GetParam() * gc_SeedsPerBatch, gc_SeedsPerBatch);
    expectSameAsReference(batch);
}

std::string seedRange(::testing::TestParamInfo<int> const& info) {
    int const first = info.param * gc_SeedsPerBatch;
    auto const threeDigits = [](int number) {
        std::string const digits = std::to_string(number);
        return std::string(3 - digits.size(), '0') + digits;
    };
    return "Seeds" + threeDigits(first) + "To" + threeDigits(first + gc_SeedsPerBatch - 1);
}

INSTANTIATE_TEST_SUITE_P(FleetDifferential, GeneratedSeeds, ::testing::Range(0, gc_Batches),
                         seedRange);

} // namespace
