// Runs every end-to-end scenario with the survey tool under valgrind's memory
// checker: the run must leave exactly the expected outputs and files, and the
// checker must find no invalid access, no use of an undefined value and no
// block definitely or indirectly lost. Only the tool itself is checked: the
// shells and console tools it starts run natively.

#include "EndToEndScenario.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <iostream>

namespace {

constexpr int gc_Skipped = 77;
// Neither of the tool's own exit statuses (2 and 255).
constexpr int gc_MemcheckFound = 99;
constexpr char gc_Report[] = "memcheck.log";
constexpr char gc_NoError[] = "ERROR SUMMARY: 0 errors from 0 contexts";

std::vector<std::string> u_tool_UnderMemcheck(std::string const& reportPath) {
    return {"valgrind",
            "--tool=memcheck",
            "--error-exitcode=" + std::to_string(gc_MemcheckFound),
            "--leak-check=full",
            "--errors-for-leak-kinds=definite,indirect",
            "--child-silent-after-fork=yes",
            "--vgdb=no",
            "--log-file=" + reportPath,
            QUORVEX_SURVEY_TOOL};
}

class SurveyEndToEndUnderMemcheck : public ::testing::TestWithParam<std::string> {
protected:
    // Without valgrind the test process ends with the status ctest reports
    // as skipped.
    static void SetUpTestSuite() {
        if (QuorvexTest::runShell("command -v valgrind").exitStatus != 0) {
            std::cerr << "valgrind is not installed" << std::endl;
            std::exit(gc_Skipped);
        }
    }
};

TEST_P(SurveyEndToEndUnderMemcheck, RunHasNoMemoryErrorNorLeakAndTheExpectedOutcome) {
    EndToEndScenario scenario(GetParam());
    std::string const reportPath = scenario.probeFile(gc_Report);
    QuorvexTest::CommandResult const result = scenario.run(u_tool_UnderMemcheck(reportPath));
    if (result.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
        GTEST_SKIP() << result.stderrText;
    }
    ASSERT_TRUE(QuorvexTest::fileExists(reportPath)) << result.stderrText;
    std::string const report = QuorvexTest::readFile(reportPath);
    EXPECT_NE(report.find(std::string("Command: ") + QUORVEX_SURVEY_TOOL), std::string::npos)
        << report;
    EXPECT_NE(report.find(gc_NoError), std::string::npos) << report;
    EXPECT_NE(result.exitStatus, gc_MemcheckFound) << report;
    scenario.expectExpectedOutcome(result);
}

INSTANTIATE_TEST_SUITE_P(Scenario, SurveyEndToEndUnderMemcheck,
                         ::testing::ValuesIn(EndToEndScenario::list()), EndToEndScenario::testName);

} // namespace
