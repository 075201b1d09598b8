#include "relay/TargetPartition.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <string>

using Quorvex::RELAY::TargetPartition;
using Quorvex::System::MTMS;
using Quorvex::System::Partition;
using QuorvexTest::examplePartition;

TEST(TargetPartition, AddressesByIdentifierWhenConstructed) {
    TargetPartition const target(examplePartition());
    EXPECT_EQ(target.createString_Target(),
              "CecMT::\"1234-ABC\"::CecMS::\"10ABCDE\"::PartitionId::\"3\"");
}

TEST(TargetPartition, ArrayModeWritesTheIdentifierInBraces) {
    TargetPartition target(examplePartition());
    target.use_PartitionArray();
    EXPECT_EQ(target.createString_Target(),
              "CecMT::\"1234-ABC\"::CecMS::\"10ABCDE\"::PartitionArray::{\"3\"}");
}

TEST(TargetPartition, IdentifierModeAfterArrayModeSwitchesBack) {
    TargetPartition target(examplePartition());
    target.use_PartitionArray();
    target.use_PartitionID();
    EXPECT_EQ(target.createString_Target(),
              "CecMT::\"1234-ABC\"::CecMS::\"10ABCDE\"::PartitionId::\"3\"");
}

TEST(TargetPartition, DefaultConstructedAddressesAnEmptyPartitionByIdentifier) {
    TargetPartition const target;
    EXPECT_EQ(target.createString_Target(), "CecMT::\"\"::CecMS::\"\"::PartitionId::\"\"");
    EXPECT_EQ(target.get_Partition().__StringValue(), "_-");
}

TEST(TargetPartition, KeepsThePartitionItWasGiven) {
    TargetPartition const target(examplePartition("7"));
    EXPECT_EQ(target.get_Partition().__StringValue(), "1234-ABC_10ABCDE-7");
    EXPECT_EQ(target.get_Partition().get_HostName(), "p7.example");
}

TEST(TargetPartition, CopyKeepsTheAddressingMode) {
    TargetPartition original(examplePartition());
    original.use_PartitionArray();
    TargetPartition const copy(original);
    TargetPartition assigned;
    assigned = original;
    original.use_PartitionID();
    EXPECT_EQ(copy.createString_Target(), assigned.createString_Target());
    EXPECT_NE(copy.createString_Target().find("PartitionArray::{\"3\"}"), std::string::npos);
}

TEST(TargetPartition, ValuesWithQuotesAndDoubleColonsAreWrittenAsTheyAre) {
    TargetPartition target(Partition(MTMS("12\"34-A", "SER::X"), "3::LocalFN::\"/x", ""));
    EXPECT_EQ(target.createString_Target(),
              "CecMT::\"12\"34-A\"::CecMS::\"SER::X\"::PartitionId::\"3::LocalFN::\"/x\"");
    target.use_PartitionArray();
    EXPECT_EQ(target.createString_Target(),
              "CecMT::\"12\"34-A\"::CecMS::\"SER::X\"::PartitionArray::{\"3::LocalFN::\"/x\"}");
}

TEST(TargetPartition, TextAlreadyWrittenFollowsEachLaterChangeOfMode) {
    TargetPartition target(examplePartition());
    std::string const byIdentifier = target.createString_Target();
    target.use_PartitionArray();
    EXPECT_EQ(target.createString_Target(),
              "CecMT::\"1234-ABC\"::CecMS::\"10ABCDE\"::PartitionArray::{\"3\"}");
    target.use_PartitionID();
    EXPECT_EQ(target.createString_Target(), byIdentifier);
}

TEST(TargetPartition, AssignedTargetWritesTheNewPartition) {
    TargetPartition target(examplePartition());
    static_cast<void>(target.createString_Target());
    target = TargetPartition();
    EXPECT_EQ(target.createString_Target(), TargetPartition().createString_Target());
    EXPECT_EQ(target.createString_Target().find("10ABCDE"), std::string::npos);
}
