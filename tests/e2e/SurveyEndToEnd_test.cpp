// Runs the built survey tool inside tools/sandbox against the simulated
// console of every scenario folder and compares everything a run leaves
// behind with the folder's expected texts (see EndToEndScenario.h).

#include "EndToEndScenario.h"

#include <gtest/gtest.h>

namespace {

class SurveyEndToEnd : public ::testing::TestWithParam<std::string> {};

TEST_P(SurveyEndToEnd, RunLeavesExactlyTheExpectedOutputsAndFiles) {
    EndToEndScenario scenario(GetParam());
    QuorvexTest::CommandResult const result = scenario.run({QUORVEX_SURVEY_TOOL});
    if (result.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
        GTEST_SKIP() << result.stderrText;
    }
    scenario.expectExpectedOutcome(result);
}

INSTANTIATE_TEST_SUITE_P(Scenario, SurveyEndToEnd, ::testing::ValuesIn(EndToEndScenario::list()),
                         EndToEndScenario::testName);

} // namespace
