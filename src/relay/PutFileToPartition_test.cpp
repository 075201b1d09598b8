#include "relay/PutFileToPartition.h"

#include <gtest/gtest.h>

using Quorvex::RELAY::PutFileToPartition;

TEST(PutFileToPartition, ParameterTextUsesOneNameTwiceWithClientAttributes) {
    EXPECT_EQ(PutFileToPartition::createString_PutFileParameters("/tmp/quorvex.tar"),
              "LocalFN::\"/tmp/quorvex.tar\"::RemoteFN::\"/tmp/quorvex.tar\"::"
              "RemoteFileInfo::\"FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=system\"");
}

TEST(PutFileToPartition, EmptyFileNameGivesEmptyQuotes) {
    EXPECT_EQ(PutFileToPartition::createString_PutFileParameters(""),
              "LocalFN::\"\"::RemoteFN::\"\"::"
              "RemoteFileInfo::\"FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=system\"");
}

TEST(PutFileToPartition, HasNoVirtualFunctionsAndAVirtualBase) {
    EXPECT_FALSE(std::is_polymorphic<PutFileToPartition>::value);
    EXPECT_TRUE((std::is_base_of<Quorvex::RELAY::Base, PutFileToPartition>::value));
}
