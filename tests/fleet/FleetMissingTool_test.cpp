// --all on a console whose machine listing tool is missing: an error (exit
// 69, one line naming the command, its exit status and the shell's
// complaint, the summary's listing_failure), never a console without
// machines. Run from the host in a sandbox of its own where the simulator
// plays only the other two tools, as nothing may show through from an
// enclosing sandbox.

#include "FleetTools.h"
#include "QuorvexTest.h"
#include "SummaryFile.h"

#include <gtest/gtest.h>

namespace {

TEST(FleetMissingTool, AMissingMachineListingToolEndsWith69NamingTheCommand) {
    ASSERT_FALSE(QuorvexTest::fileExists("/opt/lsvtc/bin/lsvtc")) << "the host has the tool";
    QuorvexTest::SimulatedConsole const console("");
    QuorvexTest::TemporaryDirectory const work;
    std::string const simulator = QuorvexTest::simulatorPath();
    QuorvexTest::CommandResult const result = QuorvexTest::runCommand(
        {QuorvexTest::sandboxPath(), "--bind", simulator + ":/opt/vtc/bin/lspartition", "--bind",
         simulator + ":/usr/bin/runact-api", "--bind",
         console.directory() + ":" + console.directory(), "--bind", work.path() + ":" + work.path(),
         "--", FleetTest::consoleWideTool(), "--all", "--summary", work.file("summary.json")});
    // What the shell says of a missing command is the shell's own text.
    std::string const failure = "quorvex-survey: cannot list the managed machines: "
                                "/opt/lsvtc/bin/lsvtc -t0 exited with status 127: ";
    EXPECT_EQ(result.stderrText.rfind(failure, 0), 0U) << result.stderrText;
    EXPECT_NE(result.stderrText.find("not found\n"), std::string::npos) << result.stderrText;
    EXPECT_EQ(result.exitStatus, 69);
    EXPECT_EQ(result.stdoutText, "");
    FleetTest::SummaryFile const summary(work.file("summary.json"));
    EXPECT_EQ(summary.validationProblems(), "");
    EXPECT_EQ(summary.field("/exit_status"), "69");
    EXPECT_EQ(summary.field("/machines"), "[]");
    EXPECT_EQ(summary.field("/listing_failure/exit_status"), "127");
    EXPECT_EQ(summary.field("/listing_failure/command"), "\"/opt/lsvtc/bin/lsvtc -t0\"");
}

} // namespace
