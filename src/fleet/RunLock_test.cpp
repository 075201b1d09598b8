#include "fleet/RunLock.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <sys/stat.h>

namespace {

using fleet::RunLock;
using QuorvexTest::TemporaryDirectory;

// A flock belongs to an open file, so two locks of one process exclude each
// other as two runs do.
TEST(RunLock, TakingWritesTheHolderIntoTheFile) {
    TemporaryDirectory const folder;
    RunLock lock(folder.file("lock"));
    ASSERT_TRUE(lock.tryTake("PID 1, started then"));
    EXPECT_EQ(QuorvexTest::readFile(folder.file("lock")), "PID 1, started then\n");
    EXPECT_EQ(lock.holder(), "PID 1, started then");
}

TEST(RunLock, ASecondRunIsRefusedAndReadsWhoHoldsIt) {
    TemporaryDirectory const folder;
    RunLock first(folder.file("lock"));
    ASSERT_TRUE(first.tryTake("PID 1, started then"));
    RunLock second(folder.file("lock"));
    EXPECT_FALSE(second.tryTake("PID 2, started now"));
    EXPECT_EQ(second.holder(), "PID 1, started then");
    EXPECT_EQ(QuorvexTest::readFile(folder.file("lock")), "PID 1, started then\n");
}

TEST(RunLock, TheHolderRemovesTheFileAndANextRunTakesIt) {
    TemporaryDirectory const folder;
    RunLock second(folder.file("lock"));
    {
        RunLock first(folder.file("lock"));
        ASSERT_TRUE(first.tryTake("PID 1"));
    }
    EXPECT_FALSE(QuorvexTest::fileExists(folder.file("lock")));
    EXPECT_TRUE(second.tryTake("PID 2"));
    EXPECT_EQ(second.holder(), "PID 2");
}

TEST(RunLock, AFileLeftByAKilledRunIsTakenAndRewritten) {
    TemporaryDirectory const folder;
    QuorvexTest::writeFile(folder.file("lock"), "PID 99, started long ago and more text\n");
    RunLock lock(folder.file("lock"));
    ASSERT_TRUE(lock.tryTake("PID 3"));
    EXPECT_EQ(QuorvexTest::readFile(folder.file("lock")), "PID 3\n");
}

TEST(RunLock, AMissingFolderLeavesTheRunUnlocked) {
    TemporaryDirectory const folder;
    RunLock lock(folder.file("missing/lock"));
    EXPECT_TRUE(lock.tryTake("PID 1"));
    EXPECT_FALSE(QuorvexTest::fileExists(folder.file("missing")));
}

TEST(RunLock, WaitingForAFreeLockTakesItAtOnce) {
    TemporaryDirectory const folder;
    RunLock lock(folder.file("lock"));
    EXPECT_TRUE(lock.waitToTake("PID 1", -1));
    EXPECT_EQ(lock.holder(), "PID 1");
}

} // namespace
