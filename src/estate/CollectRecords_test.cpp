#include "estate/CollectRecords.h"

#include "QuorvexTest.h"
#include "utility/SystemError.h"

#include <gtest/gtest.h>

namespace {

using QuorvexTest::CollectFolder;

std::string refusal(std::string const& text) {
    try {
        (void)estate::parseCollectRecords(text, "records.json");
    } catch (estate::MalformedInput const& failure) {
        return failure.what();
    }
    return "accepted";
}

TEST(CollectRecords, ReadsEveryRecordWithItsFieldsInTheFilesOrder) {
    std::string const text = CollectFolder::records(
        {CollectFolder::record("b", "collected", true, "null", "4"),
         CollectFolder::record("a", "unreachable", false, "\"Connection refused\""),
         CollectFolder::record("c", "stale", true, "\"old\"", "0", "90000")});
    estate::CollectRecords const records = estate::parseCollectRecords(text, "records.json");
    EXPECT_EQ("2026-11-24T18:00:00+00:00", records.collected);
    ASSERT_EQ(3U, records.consoles.size());
    EXPECT_EQ("b", records.consoles[0].console);
    EXPECT_EQ(estate::RecordKind::Collected, records.consoles[0].kind);
    EXPECT_EQ(4, records.consoles[0].exitStatus);
    EXPECT_EQ("consoles/b", records.consoles[0].bundle);
    EXPECT_EQ("Connection refused", records.consoles[1].message);
    EXPECT_FALSE(records.consoles[1].bundle);
    EXPECT_EQ(estate::RecordKind::Stale, records.consoles[2].kind);
    EXPECT_EQ(90000, records.consoles[2].ageSeconds);
}

TEST(CollectRecords, RefusesATextThatIsNotJson) {
    EXPECT_EQ("records.json: not a JSON object", refusal("{\"schema_version\": 1,"));
    EXPECT_EQ("records.json: not a JSON object", refusal("[]"));
}

TEST(CollectRecords, RefusesAnotherSchemaVersion) {
    EXPECT_EQ("records.json: schema_version is not 1",
              refusal(R"({"schema_version": 2, "collected": "x", "consoles": []})"));
}

TEST(CollectRecords, RefusesAMissingConsoleList) {
    EXPECT_EQ("records.json: \"consoles\" is missing or not a list",
              refusal(R"({"schema_version": 1, "collected": "x"})"));
}

TEST(CollectRecords, RefusesAConsoleRecordedTwice) {
    EXPECT_EQ("records.json: console a is recorded more than once",
              refusal(CollectFolder::records({CollectFolder::record("a", "collected", true),
                                              CollectFolder::record("a", "unreachable", false)})));
}

TEST(CollectRecords, RefusesAnUnknownRecordNamingTheConsole) {
    EXPECT_EQ("records.json: console a: unknown record \"lost\"",
              refusal(CollectFolder::records({CollectFolder::record("a", "lost", false)})));
}

TEST(CollectRecords, RefusesAnEmptyConsoleName) {
    EXPECT_EQ("records.json: a console's name is empty",
              refusal(CollectFolder::records({CollectFolder::record("", "collected", false)})));
}

TEST(CollectRecords, RefusesAnExitStatusThatIsNoWholeNumber) {
    EXPECT_EQ("records.json: console a: \"exit_status\" is not a whole number",
              refusal(CollectFolder::records(
                  {CollectFolder::record("a", "tool_error", false, "null", "\"four\"")})));
}

TEST(CollectRecords, AMissingFileIsASystemErrorNamingIt) {
    CollectFolder const folder;
    try {
        (void)estate::readCollectRecords(folder.path());
        FAIL() << "read a missing records.json";
    } catch (util::SystemError const& failure) {
        EXPECT_EQ("cannot read " + folder.path() + "/records.json: No such file or directory",
                  std::string(failure.what()));
    }
}

} // namespace
