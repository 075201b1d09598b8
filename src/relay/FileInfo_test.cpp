#include "relay/FileInfo.h"

#include "relay/RELAY_Utility.h"

#include <gtest/gtest.h>

using Quorvex::RELAY::FileInfo;

TEST(FileInfo, DefaultConstructedGivesEmptyAttributeText) {
    FileInfo const info;
    EXPECT_EQ(info.get_FileName(), "");
    EXPECT_EQ(info.get_FileInfoString(), "FILE_PERM=;FILE_OWNER=;FILE_GROUP=");
}

TEST(FileInfo, ConstructorTakesNameOwnerGroupPermissionInThisOrder) {
    FileInfo const info("/tmp/f", "user", "group", "640");
    EXPECT_EQ(info.get_FileName(), "/tmp/f");
    EXPECT_EQ(info.get_FileOwner(), "user");
    EXPECT_EQ(info.get_FileGroup(), "group");
    EXPECT_EQ(info.get_FilePermission(), "640");
}

TEST(FileInfo, AttributeTextPutsPermissionFirstAndLeavesOutTheName) {
    FileInfo const info("/tmp/f", "user", "group", "640");
    EXPECT_EQ(info.get_FileInfoString(), "FILE_PERM=640;FILE_OWNER=user;FILE_GROUP=group");
}

TEST(FileInfo, ConsoleDefaultsGiveTheConsoleAttributeText) {
    FileInfo info;
    Quorvex::RELAY::RELAY_Utility::set_Default_PYLON_FileInfo(info);
    EXPECT_EQ(info.get_FileInfoString(), "FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=pylon");
}

TEST(FileInfo, SettersReplaceEachField) {
    FileInfo info("a", "b", "c", "d");
    info.set_FileName("n");
    info.set_FileOwner("o");
    info.set_FileGroup("g");
    info.set_FilePermission("p");
    EXPECT_EQ(info.get_FileName(), "n");
    EXPECT_EQ(info.get_FileInfoString(), "FILE_PERM=p;FILE_OWNER=o;FILE_GROUP=g");
}

TEST(FileInfo, CopiesAndAssignmentsAreIndependentValues) {
    FileInfo original("a", "b", "c", "d");
    FileInfo copy(original);
    FileInfo assigned;
    assigned = original;
    original.set_FileOwner("changed");
    EXPECT_EQ(copy.get_FileInfoString(), "FILE_PERM=d;FILE_OWNER=b;FILE_GROUP=c");
    EXPECT_EQ(assigned.get_FileName(), "a");
    EXPECT_EQ(assigned.get_FileOwner(), "b");
}

TEST(FileInfo, AttributeValuesAreWrittenUnescaped) {
    FileInfo const info("", "a;b", "c=d", "6\"6");
    EXPECT_EQ(info.get_FileInfoString(), "FILE_PERM=6\"6;FILE_OWNER=a;b;FILE_GROUP=c=d");
}
