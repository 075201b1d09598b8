#include "estate/Estate.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <set>

namespace {

using QuorvexTest::CollectFolder;

TEST(Estate, ConsolesNotCollectedComeFirstInTheRecordTablesOrderThenByName) {
    CollectFolder const folder;
    std::string const summary = CollectFolder::summary({});
    for (char const* console : {"b", "a", "s"}) {
        folder.addBundle(console, summary);
    }
    folder.writeRecords(CollectFolder::records({CollectFolder::record("b", "collected", true),
                                                CollectFolder::record("s", "stale", true),
                                                CollectFolder::record("z", "unreachable", false),
                                                CollectFolder::record("a", "collected", true),
                                                CollectFolder::record("t", "timed_out", false),
                                                CollectFolder::record("e", "tool_error", false),
                                                CollectFolder::record("u", "unreachable", false)}));
    estate::Estate const estate = estate::readEstate(folder.path());
    std::string order;
    for (estate::ConsoleRun const& console : estate.consoles) {
        order += console.record.console;
    }
    EXPECT_EQ("uztesab", order);
    EXPECT_EQ("2026-11-24T18:00:00+00:00", estate.collected);
}

TEST(Estate, AConsolesFolderNameKeepsPlainNamesAsTheyAre) {
    EXPECT_EQ("site-a.example.com", estate::consoleFolderName("site-a.example.com"));
}

TEST(Estate, AConsolesFolderNameEscapesEveryOtherByte) {
    EXPECT_EQ("_2e.", estate::consoleFolderName(".."));
    EXPECT_EQ("a_2fb", estate::consoleFolderName("a/b"));
    EXPECT_EQ("a_5fb", estate::consoleFolderName("a_b"));
    EXPECT_EQ("a_20b_3c_26", estate::consoleFolderName("a b<&"));
    EXPECT_EQ("_c3_a9", estate::consoleFolderName("\xc3\xa9"));
    EXPECT_EQ("_", estate::consoleFolderName(""));
}

TEST(Estate, TwoConsolesNeverShareAFolder) {
    std::set<std::string> folders;
    for (char const* console : {"a_b", "a b", "a_20b", "a.b", "a/b", "a_2fb", "_", ""}) {
        EXPECT_TRUE(folders.insert(estate::consoleFolderName(console)).second) << console;
    }
}

} // namespace
