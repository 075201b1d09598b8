// The result folders under /var/adm/quorvex missing or read-only while the
// shipped demo machine is surveyed: the tool creates no folder, the survey
// goes on for every partition, and everything that can still be written is
// exactly what a normal run of the demo writes (tests/e2e, shipped-demo).

#include "FaultRun.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <vector>

namespace {

constexpr char gc_DemoIdentity[] = "9119-MHE_21ABCDE";
constexpr char gc_Demo[] = QUORVEX_DEMO_EXPECTED;
// What the simulated console says when it cannot place a fetched document.
constexpr char gc_CannotPlace[] = "runact-api: cannot write /var/adm/quorvex/VPD/";

std::string u_expected(std::string const& name) {
    return QuorvexTest::readFile(std::string(gc_Demo) + "/" + name);
}

// The text without the lines that start with prefix; count gets their number.
std::string u_without_Lines(std::string const& text, std::string const& prefix, int& count) {
    std::istringstream lines(text);
    std::string kept;
    count = 0;
    for (std::string line; std::getline(lines, line);) {
        if (line.rfind(prefix, 0) == 0) {
            ++count;
        } else {
            kept += line + "\n";
        }
    }
    return kept;
}

void u_expect_DemoOutputs(FaultRun const& run, QuorvexTest::CommandResult const& result) {
    EXPECT_EQ(std::to_string(result.exitStatus) + "\n", u_expected("exit-status"));
    EXPECT_EQ(result.stdoutText, u_expected("stdout"));
    EXPECT_EQ(result.stderrText, u_expected("stderr"));
    EXPECT_EQ(run.calls(), u_expected("calls"));
    EXPECT_EQ(run.leftInTmp(), std::vector<std::string>{});
}

// The trace of a normal run, apart from the console's complaints that it
// could not place the three fetched documents.
void u_expect_DemoTraceWithoutPlacedDocuments(FaultRun const& run) {
    ASSERT_TRUE(run.hasTrace());
    int complaints = 0;
    EXPECT_EQ(u_without_Lines(run.trace(), gc_CannotPlace, complaints), u_expected("trace"));
    EXPECT_EQ(complaints, 3);
}

class FaultInResultFolders : public ::testing::Test {
protected:
    FaultInResultFolders()
        : run(QuorvexTest::ScenarioFile{QuorvexTest::shippedScenario("demo.scn")}) {}

    // False when no sandbox can be made: the test is skipped.
    bool runDemo(std::vector<std::string> const& sandboxOptions) {
        run.addSandboxOptions(sandboxOptions);
        result = run.run(gc_DemoIdentity);
        return FaultRun::ranInSandbox(result);
    }

    FaultRun run;
    QuorvexTest::CommandResult result;
};

TEST_F(FaultInResultFolders, MissingTraceFolderLosesOnlyTheTraceAndIsNotCreated) {
    if (!runDemo({"--no-trace-dir"})) {
        return;
    }
    u_expect_DemoOutputs(run, result);
    EXPECT_EQ(run.quorvexFolders(), std::vector<std::string>{"VPD"});
    std::vector<std::string> const files = run.vpdFiles();
    ASSERT_EQ(files, QuorvexTest::listFolder(std::string(gc_Demo) + "/VPD"));
    for (std::string const& name : files) {
        EXPECT_EQ(run.vpdFile(name), u_expected("VPD/" + name)) << name;
    }
}

TEST_F(FaultInResultFolders, MissingVPDFolderLosesStatusFileAndDocumentsAndIsNotCreated) {
    if (!runDemo({"--no-vpd-dir"})) {
        return;
    }
    u_expect_DemoOutputs(run, result);
    EXPECT_EQ(run.quorvexFolders(), std::vector<std::string>{"Trace"});
    u_expect_DemoTraceWithoutPlacedDocuments(run);
}

TEST_F(FaultInResultFolders, ReadOnlyVPDFolderStaysEmptyWhileEveryPartitionIsSurveyed) {
    if (!runDemo({"--readonly-vpd"})) {
        return;
    }
    u_expect_DemoOutputs(run, result);
    EXPECT_EQ(run.quorvexFolders(), (std::vector<std::string>{"Trace", "VPD"}));
    EXPECT_EQ(run.vpdFiles(), std::vector<std::string>{});
    u_expect_DemoTraceWithoutPlacedDocuments(run);
}

} // namespace
