#include "relay/Base.h"

#include "relay/PutFileToPartition.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

using Quorvex::RELAY::Base;
using Quorvex::RELAY::cBlankReturnCode;
using Quorvex::RELAY::TargetPartition;
using QuorvexTest::examplePartition;

TEST(Base, UnsetActionGivesErrorNoActionInTheCommandLine) {
    Base const base{TargetPartition(examplePartition())};
    EXPECT_EQ(base.createString_Command(),
              "/usr/bin/runact-api -c ZOR.ServiceEvent::::ERROR_NO_ACTION::CallerID::0::"
              "CecMT::\"1234-ABC\"::CecMS::\"10ABCDE\"::PartitionId::\"3\"");
}

TEST(Base, ClassNameIsFollowedByFourColonsThenTheAction) {
    Base base{TargetPartition(examplePartition())};
    base.set_Action("runCmdOnPartition");
    std::string const command = base.createString_Command();
    EXPECT_EQ(command.rfind(
                  "/usr/bin/runact-api -c ZOR.ServiceEvent::::runCmdOnPartition::CallerID::0::", 0),
              0u);
}

TEST(Base, DefaultConstructedAddressesAnEmptyPartition) {
    Base const base;
    EXPECT_EQ(base.createString_Command(),
              "/usr/bin/runact-api -c ZOR.ServiceEvent::::ERROR_NO_ACTION::CallerID::0::"
              "CecMT::\"\"::CecMS::\"\"::PartitionId::\"\"");
}

TEST(Base, TargetIsReachableForChangingTheAddressingMode) {
    Base base{TargetPartition(examplePartition())};
    base.get_TargetPartition().use_PartitionArray();
    EXPECT_EQ(base.createString_Command(),
              "/usr/bin/runact-api -c ZOR.ServiceEvent::::ERROR_NO_ACTION::CallerID::0::"
              "CecMT::\"1234-ABC\"::CecMS::\"10ABCDE\"::PartitionArray::{\"3\"}");
}

TEST(Base, CompletePutCommandLineIsBuiltByteForByte) {
    Base base{TargetPartition(examplePartition())};
    base.set_Action("putFileToPartition");
    base.get_TargetPartition().use_PartitionArray();
    std::string const line =
        base.createString_Command() + "::" +
        Quorvex::RELAY::PutFileToPartition::createString_PutFileParameters("/tmp/quorvex.tar");
    EXPECT_EQ(line, "/usr/bin/runact-api -c ZOR.ServiceEvent::::putFileToPartition::CallerID::0::"
                    "CecMT::\"1234-ABC\"::CecMS::\"10ABCDE\"::PartitionArray::{\"3\"}::"
                    "LocalFN::\"/tmp/quorvex.tar\"::RemoteFN::\"/tmp/quorvex.tar\"::"
                    "RemoteFileInfo::\"FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=system\"");
}

TEST(Base, BeforeAnyRunTheReturnCodeIsTheBlankOne) {
    Base const base;
    EXPECT_EQ(&base.get_ReturnCode(), &cBlankReturnCode);
    EXPECT_EQ(base.get_ReturnCode().get_Rc(), -1);
    EXPECT_TRUE(base.get_ListOf_ReturnCodes().empty());
    EXPECT_TRUE(base.get_Output().empty());
}

TEST(Base, HasNoVirtualFunctions) {
    EXPECT_FALSE(std::is_polymorphic<Base>::value);
}
