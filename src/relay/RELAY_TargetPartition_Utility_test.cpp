#include "relay/RELAY_TargetPartition_Utility.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

using Quorvex::RELAY::RELAY_TargetPartition_Utility;
using QuorvexTest::examplePartition;

TEST(RELAY_TargetPartition_Utility, MachineTypeModelIsTheCecMTParameter) {
    EXPECT_EQ(RELAY_TargetPartition_Utility::_u_get_MachineType_Model(examplePartition()),
              "CecMT::\"1234-ABC\"");
}

TEST(RELAY_TargetPartition_Utility, SerialIsTheCecMSParameter) {
    EXPECT_EQ(RELAY_TargetPartition_Utility::_u_get_Machine_Serial(examplePartition()),
              "CecMS::\"10ABCDE\"");
}

TEST(RELAY_TargetPartition_Utility, PartitionIdentifierIsQuoted) {
    EXPECT_EQ(RELAY_TargetPartition_Utility::_u_get_PartitionID(examplePartition("12")),
              "PartitionId::\"12\"");
}

TEST(RELAY_TargetPartition_Utility, PartitionArrayHoldsTheQuotedIdentifierInBraces) {
    EXPECT_EQ(RELAY_TargetPartition_Utility::_u_get_PartitionArray(examplePartition("12")),
              "PartitionArray::{\"12\"}");
}

TEST(RELAY_TargetPartition_Utility, EmptyPartitionGivesEmptyValues) {
    Quorvex::System::Partition const empty;
    EXPECT_EQ(RELAY_TargetPartition_Utility::_u_get_MachineType_Model(empty), "CecMT::\"\"");
    EXPECT_EQ(RELAY_TargetPartition_Utility::_u_get_Machine_Serial(empty), "CecMS::\"\"");
    EXPECT_EQ(RELAY_TargetPartition_Utility::_u_get_PartitionID(empty), "PartitionId::\"\"");
    EXPECT_EQ(RELAY_TargetPartition_Utility::_u_get_PartitionArray(empty),
              "PartitionArray::{\"\"}");
}
