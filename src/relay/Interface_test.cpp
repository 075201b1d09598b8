#include "relay/Interface.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <type_traits>

using Quorvex::RELAY::Base;
using Quorvex::RELAY::GetFileFromPartition;
using Quorvex::RELAY::Interface;
using Quorvex::RELAY::PutFileToPartition;
using Quorvex::RELAY::RunCommandOnPartition;
using Quorvex::RELAY::TargetPartition;
using QuorvexTest::examplePartition;

namespace {

std::string const gc_TargetCommand =
    "/usr/bin/runact-api -c ZOR.ServiceEvent::::ERROR_NO_ACTION::CallerID::0::"
    "CecMT::\"1234-ABC\"::CecMS::\"10ABCDE\"::PartitionId::\"3\"";

} // namespace

TEST(Interface, AllThreeOperationsReachTheSameBaseSubobject) {
    Interface iface{TargetPartition(examplePartition())};
    // The conversion to Base compiles only when there is exactly one Base.
    Base* const direct = &iface;
    Base* const viaGet = static_cast<GetFileFromPartition*>(&iface);
    Base* const viaPut = static_cast<PutFileToPartition*>(&iface);
    Base* const viaRun = static_cast<RunCommandOnPartition*>(&iface);
    EXPECT_EQ(direct, viaGet);
    EXPECT_EQ(direct, viaPut);
    EXPECT_EQ(direct, viaRun);
}

TEST(Interface, HoldsRoomForOneBaseOnly) {
    // Each operation adds only the pointer that finds the shared Base.
    EXPECT_LT(sizeof(Interface), 2 * sizeof(Base));
    EXPECT_LE(sizeof(Interface), sizeof(Base) + 3 * sizeof(void*));
}

TEST(Interface, DerivesFromTheThreeOperationsAndHasNoVirtualFunctions) {
    EXPECT_TRUE((std::is_base_of<GetFileFromPartition, Interface>::value));
    EXPECT_TRUE((std::is_base_of<PutFileToPartition, Interface>::value));
    EXPECT_TRUE((std::is_base_of<RunCommandOnPartition, Interface>::value));
    EXPECT_FALSE(std::is_polymorphic<Interface>::value);
}

TEST(Interface, SharedBaseIsBuiltWithTheGivenTarget) {
    Interface const iface{TargetPartition(examplePartition())};
    EXPECT_EQ(iface.createString_Command(), gc_TargetCommand);
}

TEST(Interface, EachOperationStandingAloneIsBuiltWithTheGivenTarget) {
    TargetPartition const target(examplePartition());
    EXPECT_EQ(GetFileFromPartition(target).createString_Command(), gc_TargetCommand);
    EXPECT_EQ(PutFileToPartition(target).createString_Command(), gc_TargetCommand);
    EXPECT_EQ(RunCommandOnPartition(target).createString_Command(), gc_TargetCommand);
}

TEST(Interface, ChangesThroughOneOperationAreSeenThroughTheOthers) {
    Interface iface{TargetPartition(examplePartition())};
    static_cast<PutFileToPartition&>(iface).set_Action("putFileToPartition");
    static_cast<PutFileToPartition&>(iface).get_TargetPartition().use_PartitionArray();
    std::string const expected =
        "/usr/bin/runact-api -c ZOR.ServiceEvent::::putFileToPartition::CallerID::0::"
        "CecMT::\"1234-ABC\"::CecMS::\"10ABCDE\"::PartitionArray::{\"3\"}";
    EXPECT_EQ(static_cast<GetFileFromPartition&>(iface).createString_Command(), expected);
    EXPECT_EQ(static_cast<RunCommandOnPartition&>(iface).createString_Command(), expected);
}
