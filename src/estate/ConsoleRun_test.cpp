#include "estate/ConsoleRun.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

namespace {

using QuorvexTest::CollectFolder;

estate::ConsoleRecord recordOf(std::string const& console, estate::RecordKind kind,
                               std::optional<std::string> bundle) {
    estate::ConsoleRecord record;
    record.console = console;
    record.kind = kind;
    record.bundle = std::move(bundle);
    return record;
}

std::string const gc_Summary =
    CollectFolder::summary({CollectFolder::partition("1", "h1", "surveyed")});

TEST(ConsoleRun, ACollectedConsoleReadsItsBundle) {
    CollectFolder const folder;
    folder.addBundle("a", gc_Summary);
    estate::ConsoleRun const run = estate::readConsoleRun(
        folder.path(), recordOf("a", estate::RecordKind::Collected, "consoles/a"));
    EXPECT_EQ(estate::RecordKind::Collected, run.record.kind);
    EXPECT_EQ("a.example", run.consoleHost);
    EXPECT_EQ("run", run.mode);
    EXPECT_EQ("2026-11-24T17:55:00+00:00", run.runStarted);
    EXPECT_EQ(folder.path() + "/consoles/a/VPD", run.vpdFolder);
    ASSERT_TRUE(estate::readSummary(run));
    EXPECT_EQ("h1", (*estate::readSummary(run))["machines"][0]["partitions"][0]["host"]);
}

TEST(ConsoleRun, AMissingBundleMakesAToolErrorSayingWhy) {
    CollectFolder const folder;
    estate::ConsoleRun const run = estate::readConsoleRun(
        folder.path(), recordOf("a", estate::RecordKind::Collected, "consoles/a"));
    EXPECT_EQ(estate::RecordKind::ToolError, run.record.kind);
    EXPECT_EQ("bundle unreadable: cannot read " + folder.path() +
                  "/consoles/a/bundle.json: No such file or directory",
              run.record.message);
    EXPECT_FALSE(run.hasSummary());
}

TEST(ConsoleRun, ASummaryThatIsNotJsonMakesAToolError) {
    CollectFolder const folder;
    folder.addBundle("a", "{\"machines\": [");
    estate::ConsoleRun const run = estate::readConsoleRun(
        folder.path(), recordOf("a", estate::RecordKind::Collected, "consoles/a"));
    EXPECT_EQ(estate::RecordKind::ToolError, run.record.kind);
    EXPECT_EQ("bundle unreadable: " + folder.path() + "/consoles/a/summary.json: not a JSON object",
              run.record.message);
}

TEST(ConsoleRun, ABundleOfAnotherSchemaVersionMakesAToolError) {
    CollectFolder const folder;
    folder.addBundle("a", gc_Summary);
    QuorvexTest::writeFile(folder.path() + "/consoles/a/bundle.json", "{\"schema_version\": 7}");
    estate::ConsoleRun const run = estate::readConsoleRun(
        folder.path(), recordOf("a", estate::RecordKind::Stale, "consoles/a"));
    EXPECT_EQ(estate::RecordKind::ToolError, run.record.kind);
    EXPECT_EQ("bundle unreadable: " + folder.path() +
                  "/consoles/a/bundle.json: schema_version is not 1",
              run.record.message);
}

TEST(ConsoleRun, ABundlePathOutsideTheCollectFolderIsNotRead) {
    CollectFolder const folder;
    for (std::string const bundle : {"../a", "/etc", "consoles/../../a", ""}) {
        estate::ConsoleRun const run = estate::readConsoleRun(
            folder.path(), recordOf("a", estate::RecordKind::Collected, bundle));
        EXPECT_EQ(estate::RecordKind::ToolError, run.record.kind) << bundle;
        EXPECT_EQ("bundle unreadable: the bundle path " + bundle +
                      " is not inside the collect folder",
                  run.record.message);
    }
}

TEST(ConsoleRun, ACollectedConsoleWithoutBundleIsAToolError) {
    CollectFolder const folder;
    estate::ConsoleRun const run = estate::readConsoleRun(
        folder.path(), recordOf("a", estate::RecordKind::Collected, std::nullopt));
    EXPECT_EQ(estate::RecordKind::ToolError, run.record.kind);
    EXPECT_EQ("bundle unreadable: records.json names no bundle for a collected console",
              run.record.message);
}

TEST(ConsoleRun, AnUnreachableConsoleKeepsItsRecordAndMessage) {
    CollectFolder const folder;
    estate::ConsoleRecord record = recordOf("a", estate::RecordKind::Unreachable, std::nullopt);
    record.message = "Connection refused";
    estate::ConsoleRun const run = estate::readConsoleRun(folder.path(), record);
    EXPECT_EQ(estate::RecordKind::Unreachable, run.record.kind);
    EXPECT_EQ("Connection refused", run.record.message);
    EXPECT_FALSE(estate::readSummary(run));
}

} // namespace
