// The console-wide survey against the one-machine survey tool run once per
// machine in turn: at one, four and thirty-two partitions in flight it must
// leave the same files, print the same bytes and run the same console
// command lines. The generated seeds are fixed, so a failing case is made
// again from its name (gen-<seed>, tests/fleet/generate-cases.py).

#include "DifferentialBatch.h"

#include <gtest/gtest.h>

#include <cctype>

namespace {

using FleetTest::DifferentialBatch;

std::vector<int> const gc_JobCounts{1, 4, 32};

void expectSameAsReference(DifferentialBatch& batch,
                           std::vector<std::string> const& sandboxOptions = {}) {
    QuorvexTest::CommandResult const result = batch.run(gc_JobCounts, sandboxOptions);
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
    batch.addShipped("demo-given-twice", "demo.scn", {"9119-MHE_21ABCDE", "9119-MHE_21ABCDE"},
                     false);
    batch.addShipped("several-machines-all", "several-machines.scn",
                     {"8286-42A_10XYZ99", "9119-MHE_21ABCDE"}, true);
    batch.addShipped(
        "several-machines-given", "several-machines.scn",
        {"9119-MHE_21ABCDE", "7063-CR2_06QRV01", "1234-ABC_10ABCDE", "8286-42A_10XYZ99"}, false);
    batch.addShipped("odd-output", "odd-output.scn", {"9119-MHE_21ABCDE"}, false);
    batch.addShipped("slow", "slow.scn", {"9119-MHE_21ABCDE"}, false);
    batch.addShipped("console-all", "console.scn",
                     {"8286-42A_10XYZ99", "9009-22A_78KLM01", "9119-MHE_21ABCDE"}, true);
    expectSameAsReference(batch);
}

// Result folders that are missing or read-only: the one-machine tool runs
// its whole survey and keeps what it can, silently; the console-wide survey
// refuses to start, naming the folder and why, before any console command.
class ResultFolders : public ::testing::TestWithParam<std::string> {};

// The line quorvex-survey prints for the folder the sandbox option spoils. A
// read-only folder refuses writes with "Read-only file system" in a mount
// namespace and "Permission denied" under proot (docs/sandbox.md).
std::vector<std::string> refusalLines(std::string const& sandboxOption) {
    std::string const folder = sandboxOption.find("vpd") != std::string::npos
                                   ? "/var/adm/quorvex/VPD"
                                   : "/var/adm/quorvex/Trace";
    std::string const line = "quorvex-survey: cannot write into " + folder + ": ";
    if (sandboxOption.rfind("--no-", 0) == 0) {
        return {line + "No such file or directory\n"};
    }
    return {line + "Read-only file system\n", line + "Permission denied\n"};
}

TEST_P(ResultFolders, RefuseToStartWithExitStatus73) {
    DifferentialBatch batch;
    batch.addShipped("demo", "demo.scn", {"9119-MHE_21ABCDE"}, false);
    batch.addShipped("odd-output", "odd-output.scn", {"9119-MHE_21ABCDE"}, false);
    QuorvexTest::CommandResult const result = batch.run(gc_JobCounts, {GetParam()});
    ASSERT_EQ(result.exitStatus, 0) << "the cases did not all run: " << result.stderrText;
    for (FleetTest::DifferentialCase const& differentialCase : batch.cases()) {
        for (int const jobs : gc_JobCounts) {
            differentialCase.expectRefusedUpFront(jobs, refusalLines(GetParam()));
        }
    }
}

INSTANTIATE_TEST_SUITE_P(FleetDifferential, ResultFolders,
                         ::testing::Values("--no-vpd-dir", "--no-trace-dir", "--readonly-vpd",
                                           "--readonly-trace"),
                         [](::testing::TestParamInfo<std::string> const& info) {
                             std::string name;
                             bool upper = true;
                             for (char const c : info.param.substr(2)) {
                                 if (c == '-') {
                                     upper = true;
                                 } else {
                                     name += upper ? static_cast<char>(std::toupper(c)) : c;
                                     upper = false;
                                 }
                             }
                             return name;
                         });

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
