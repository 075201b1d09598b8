#include "relay/GetFileFromPartition.h"

#include <gtest/gtest.h>

using Quorvex::RELAY::GetFileFromPartition;

TEST(GetFileFromPartition, ParameterTextNamesRemoteThenLocalWithConsoleAttributes) {
    EXPECT_EQ(
        GetFileFromPartition::createString_GetFileParameters("/tmp/quorvex.out", "/var/tmp/p3.out"),
        "RemoteFN::\"/tmp/quorvex.out\"::LocalFN::\"/var/tmp/p3.out\"::"
        "LocalFileInfo::\"FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=pylon\"");
}

TEST(GetFileFromPartition, ValuesWithQuotesAndDoubleColonsAreWrittenUnescaped) {
    EXPECT_EQ(GetFileFromPartition::createString_GetFileParameters("a\"b", "c::d"),
              "RemoteFN::\"a\"b\"::LocalFN::\"c::d\"::"
              "LocalFileInfo::\"FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=pylon\"");
}

TEST(GetFileFromPartition, HasNoVirtualFunctions) {
    EXPECT_FALSE(std::is_polymorphic<GetFileFromPartition>::value);
}
