#include "vpd/PropertyGroup.h"

#include "vpd/ListOf_.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

using Quorvex::VPD::ListOf_;
using Quorvex::VPD::Property;
using Quorvex::VPD::PropertyGroup;

PropertyGroup u_group(std::string const& name, std::vector<Property> const& properties) {
    PropertyGroup group(name);
    for (Property const& property : properties) {
        group.insert(property);
    }
    return group;
}

TEST(VPD_PropertyGroup, KeyIsTheName) {
    PropertyGroup const group("Cards");
    EXPECT_EQ(group.get_DisplayName(), "Cards");
    EXPECT_EQ(static_cast<std::string>(group), "Cards");
}

TEST(VPD_PropertyGroup, DefaultGroupHasAnEmptyNameAndKeyAndNoProperties) {
    PropertyGroup const group;
    EXPECT_EQ(group.get_DisplayName(), "");
    EXPECT_EQ(static_cast<std::string>(group), "");
    EXPECT_TRUE(group.empty());
}

TEST(VPD_PropertyGroup, NameAloneMakesAnEmptyGroup) {
    PropertyGroup const group = std::string("Memory");
    EXPECT_EQ(group.get_DisplayName(), "Memory");
    EXPECT_TRUE(group.empty());
    Quorvex::VPD::Base const base = std::string("Memory");
    EXPECT_EQ(base.get_DisplayName(), "Memory");
}

TEST(VPD_PropertyGroup, GroupsOfTheSameNameMergeWithFirstValueKept) {
    ListOf_<PropertyGroup> groups;
    groups.insert(u_group("G", {Property("a", "1"), Property("b", "2")}));
    groups.insert(u_group("G", {Property("b", "3"), Property("c", "4")}));
    ASSERT_EQ(groups.size(), 1u);
    PropertyGroup const& merged = groups.find("G");
    ASSERT_EQ(merged.size(), 3u);
    EXPECT_EQ(static_cast<std::string const&>(merged.find("a").get_Value()), "1");
    EXPECT_EQ(static_cast<std::string const&>(merged.find("b").get_Value()), "2");
    EXPECT_EQ(static_cast<std::string const&>(merged.find("c").get_Value()), "4");
}

TEST(VPD_PropertyGroup, GroupsOfDifferentNamesStaySeparateInNameOrder) {
    ListOf_<PropertyGroup> groups;
    groups.insert(u_group("Memory", {Property("SZ", "1")}));
    groups.insert(u_group("Cpu", {Property("SZ", "2")}));
    ASSERT_EQ(groups.size(), 2u);
    EXPECT_EQ(groups.begin()->first, "Cpu");
    EXPECT_EQ(std::next(groups.begin())->first, "Memory");
}

TEST(VPD_PropertyGroup, MergingAGroupIntoItselfChangesNothing) {
    PropertyGroup group = u_group("G", {Property("a", "1")});
    group += group;
    EXPECT_EQ(group.size(), 1u);
}

} // namespace
