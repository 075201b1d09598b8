#include "survey/calculate_ReturnCode.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

using QuorvexTest::CommandResult;

using QuorvexTest::gc_ReturnCodeHeading;

// Standard output and standard error of calculate_ReturnCode in a child process.
CommandResult u_calculate(std::vector<std::string> const& returnCodes) {
    return QuorvexTest::runInChild([&returnCodes]() {
        calculate_ReturnCode(returnCodes);
        return 0;
    });
}

TEST(calculate_ReturnCode, AllPartitionsSurveyedPrintsZero) {
    CommandResult const output = u_calculate({"0", "0", "0"});
    EXPECT_EQ(output.stderrText, std::string(gc_ReturnCodeHeading) + "0");
    EXPECT_EQ(output.stdoutText, "");
}

TEST(calculate_ReturnCode, SomePartitionsFailedPrintsFour) {
    EXPECT_EQ(u_calculate({"8", "8", "0"}).stderrText, std::string(gc_ReturnCodeHeading) + "4");
}

TEST(calculate_ReturnCode, AllPartitionsFailedPrintsEight) {
    EXPECT_EQ(u_calculate({"8", "8"}).stderrText, std::string(gc_ReturnCodeHeading) + "8");
}

TEST(calculate_ReturnCode, NoPartitionListedPrintsEight) {
    EXPECT_EQ(u_calculate({}).stderrText, std::string(gc_ReturnCodeHeading) + "8");
}

TEST(calculate_ReturnCode, OnlyCodesThatAreExactlyZeroCount) {
    EXPECT_EQ(u_calculate({"0 ", " 0", "00", ""}).stderrText,
              std::string(gc_ReturnCodeHeading) + "8");
    EXPECT_EQ(u_calculate({"0", "00"}).stderrText, std::string(gc_ReturnCodeHeading) + "4");
}

TEST(calculate_ReturnCode, OneSurveyedPartitionPrintsZero) {
    EXPECT_EQ(u_calculate({"0"}).stderrText, std::string(gc_ReturnCodeHeading) + "0");
}

} // namespace
