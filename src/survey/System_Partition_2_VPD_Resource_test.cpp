#include "survey/System_Partition_2_VPD_Resource.h"

#include "system/MTMS.h"
#include "system/Partition.h"
#include "vpd/Property.h"
#include "vpd/Resource.h"

#include <gtest/gtest.h>

#include <stdexcept>
#include <string>
#include <vector>

namespace {

Quorvex::System::Partition u_make_Partition(std::string const& hostName) {
    Quorvex::System::Partition partition(Quorvex::System::MTMS("1234-ABC_10ABCDE"), "3", hostName);
    partition.set_IP("10.1.1.13");
    partition.set_ActiveStatus("3");
    partition.set_OperatingSystem_Name("Zeph");
    partition.set_OperatingSystem_Version("7.2");
    return partition;
}

std::string u_get_Value(Quorvex::VPD::Resource const& resource, std::string const& keyword) {
    return resource.get_ListOf_Properties().find(keyword).get_Value();
}

TEST(System_Partition_2_VPD_Resource, ResourceIsNamedAfterTheHostName) {
    Quorvex::VPD::Resource resource;
    Transform::System_Partition_2_VPD_Resource()(u_make_Partition("host3"), resource);
    EXPECT_EQ(resource.get_DisplayName(), "host3");
}

TEST(System_Partition_2_VPD_Resource, UniqueIdIsTheIdentityTextEvenWithAHostName) {
    Quorvex::VPD::Resource resource;
    Transform::System_Partition_2_VPD_Resource()(u_make_Partition("host3"), resource);
    EXPECT_EQ(resource.get_UniqueID(), "1234-ABC-10ABCDE-3");
}

TEST(System_Partition_2_VPD_Resource, PartitionWithoutHostNameIsNamedByItsIdentityText) {
    Quorvex::VPD::Resource resource;
    Transform::System_Partition_2_VPD_Resource()(u_make_Partition(""), resource);
    EXPECT_EQ(resource.get_DisplayName(), "1234-ABC-10ABCDE-3");
    EXPECT_EQ(resource.get_UniqueID(), "1234-ABC-10ABCDE-3");
    ASSERT_TRUE(resource.has_Property("HN"));
    EXPECT_EQ(u_get_Value(resource, "HN"), "");
}

TEST(System_Partition_2_VPD_Resource, PropertiesCarryTheRecordAndItsMachine) {
    Quorvex::VPD::Resource resource;
    Transform::System_Partition_2_VPD_Resource()(u_make_Partition("host3"), resource);
    std::vector<std::string> keywords;
    for (auto const& entry : resource.get_ListOf_Properties()) {
        keywords.push_back(entry.second.get_Keyword());
        EXPECT_EQ(entry.second.get_Value().get_String_ValueType(), "string");
    }
    EXPECT_EQ(keywords, (std::vector<std::string>{"HN", "OS", "PT", "SE", "TM"}));
    EXPECT_EQ(u_get_Value(resource, "HN"), "host3");
    EXPECT_EQ(u_get_Value(resource, "OS"), "Zeph 7.2");
    EXPECT_EQ(u_get_Value(resource, "PT"), "3");
    EXPECT_EQ(u_get_Value(resource, "SE"), "10ABCDE");
    EXPECT_EQ(u_get_Value(resource, "TM"), "1234-ABC");
}

TEST(System_Partition_2_VPD_Resource, OperatingSystemOfEmptyNameAndVersionIsOneBlank) {
    Quorvex::System::Partition partition(Quorvex::System::MTMS("1234-ABC_10ABCDE"), "3", "h");
    Quorvex::VPD::Resource resource;
    Transform::System_Partition_2_VPD_Resource()(partition, resource);
    EXPECT_EQ(u_get_Value(resource, "OS"), " ");
}

TEST(System_Partition_2_VPD_Resource, ReturnsTheResourceItFilled) {
    Quorvex::VPD::Resource resource;
    Quorvex::VPD::Resource& filled =
        Transform::System_Partition_2_VPD_Resource()(u_make_Partition("host3"), resource);
    EXPECT_EQ(&filled, &resource);
}

TEST(System_Partition_2_VPD_Resource, TypeModelWithoutDashThrowsOutOfRange) {
    Quorvex::System::Partition partition(Quorvex::System::MTMS("ABCDEFG"), "3", "h");
    Quorvex::VPD::Resource resource;
    EXPECT_THROW(Transform::System_Partition_2_VPD_Resource()(partition, resource),
                 std::out_of_range);
}

} // namespace
