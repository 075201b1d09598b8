#include "survey/Utility_VPD_XML.h"

#include "system/MTMS.h"
#include "vpd/ResourceSet.h"

#include <gtest/gtest.h>

#include <ctime>
#include <stdexcept>
#include <string>

namespace {

TEST(Utility_VPD_XML, DefaultSetHasTheHardwareAttributes) {
    Quorvex::VPD::ResourceSet set;
    Quorvex::PYLON::Utility_VPD_XML::initialize_Default_VPD_ResourceSet(
        set, Quorvex::System::MTMS("1234-ABC_10ABCDE"));
    EXPECT_EQ(set.get_Class(), "com.zor.inventory.Hardware");
    EXPECT_EQ(set.get_Type(), "Hardware");
    EXPECT_EQ(set.get_Version(), "1.0");
}

TEST(Utility_VPD_XML, DefaultSetTimeStampIsTheCurrentSecondFollowedByThreeZeros) {
    Quorvex::VPD::ResourceSet set;
    long const before = static_cast<long>(std::time(nullptr));
    Quorvex::PYLON::Utility_VPD_XML::initialize_Default_VPD_ResourceSet(
        set, Quorvex::System::MTMS("1234-ABC_10ABCDE"));
    long const after = static_cast<long>(std::time(nullptr));
    std::string const& timeStamp = set.get_TimeStamp();
    ASSERT_EQ(timeStamp.size(), 13u);
    EXPECT_EQ(timeStamp.substr(10), "000");
    long const seconds = std::stol(timeStamp.substr(0, 10));
    EXPECT_GE(seconds, before);
    EXPECT_LE(seconds, after);
}

TEST(Utility_VPD_XML, MachineResourceIsNamedAndIdentifiedWithDashes) {
    Quorvex::VPD::ResourceSet set;
    Quorvex::PYLON::Utility_VPD_XML::initialize_Default_VPD_ResourceSet(
        set, Quorvex::System::MTMS("1234-ABC_10ABCDE"));
    EXPECT_TRUE(set.ResourceSet_ContainerInterface_Element_Resource::isActive());
    EXPECT_EQ(set.get_Resource().get_DisplayName(), "1234-ABC-10ABCDE");
    EXPECT_EQ(set.get_Resource().get_UniqueID(), "1234-ABC-10ABCDE");
    EXPECT_EQ(set.get_Resource().get_NumberOf_Properties(), 0u);
    EXPECT_EQ(set.get_Resource().get_NumberOf_ResourceLists(), 0u);
}

TEST(Utility_VPD_XML, OnlyTheFirstDashOfTheTypeModelIsReplaced) {
    Quorvex::VPD::ResourceSet set;
    Quorvex::PYLON::Utility_VPD_XML::initialize_Default_VPD_ResourceSet(
        set, Quorvex::System::MTMS("A_B-C-D_SER"));
    EXPECT_EQ(set.get_Resource().get_UniqueID(), "A_B-C-D-SER");
}

TEST(Utility_VPD_XML, TypeModelWithoutDashThrowsAndLeavesTheSetUnchanged) {
    Quorvex::VPD::ResourceSet set;
    EXPECT_THROW(Quorvex::PYLON::Utility_VPD_XML::initialize_Default_VPD_ResourceSet(
                     set, Quorvex::System::MTMS("1234MMA_10ABCDE")),
                 std::out_of_range);
    EXPECT_EQ(set.get_Class(), "");
    EXPECT_EQ(set.get_TimeStamp(), "");
    EXPECT_FALSE(set.ResourceSet_ContainerInterface_Element_Resource::isActive());
}

} // namespace
