#include "vpd/ResourceSet.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <string>

namespace {

using Quorvex::VPD::Property;
using Quorvex::VPD::Resource;
using Quorvex::VPD::ResourceList;
using Quorvex::VPD::ResourceSet;
using QuorvexTest::resourceText;

using ResourcePart = Quorvex::VPD::ResourceSet_ContainerInterface_Element_Resource;
using ListsPart = Quorvex::VPD::ResourceSet_ContainerInterface_Element_ListOf_ResourceLists;

std::string u_lists(ResourceSet const& set) {
    std::string text;
    for (auto const& list : set.get_ListOf_ResourceLists()) {
        text += "[" + list.first + ":";
        for (auto const& member : list.second) {
            text += resourceText(member.second);
        }
        text += "]";
    }
    return text;
}

ResourceList u_list(std::string const& name, Resource const& member) {
    ResourceList list(name);
    list.insert(member);
    return list;
}

ResourceSet u_hardwareSet(std::string const& timeStamp) {
    return ResourceSet("com.zor.inventory.Hardware", "Hardware", "1.0", timeStamp);
}

TEST(VPD_ResourceSet, NewSetIsInactiveUntilResourceOrListIsSet) {
    ResourceSet set = u_hardwareSet("1");
    EXPECT_FALSE(set.ResourcePart::isActive());
    EXPECT_FALSE(set.ListsPart::isActive());
    set.set_Resource(Resource("m", "m"));
    EXPECT_TRUE(set.ResourcePart::isActive());
    EXPECT_FALSE(set.ListsPart::isActive());
    set.insert_ResourceList(ResourceList("Partitions"));
    EXPECT_TRUE(set.ListsPart::isActive());
}

TEST(VPD_ResourceSet, DefaultSetIsEmptyAndInactive) {
    ResourceSet const set;
    EXPECT_EQ(set.get_Class(), "");
    EXPECT_EQ(set.get_Type(), "");
    EXPECT_EQ(set.get_Version(), "");
    EXPECT_EQ(set.get_TimeStamp(), "");
    EXPECT_FALSE(set.ResourcePart::isActive());
    EXPECT_FALSE(set.ListsPart::isActive());
    EXPECT_EQ(set.get_NumberOf_ResourceLists(), 0u);
}

TEST(VPD_ResourceSet, AttributesKeepTheirConstructorOrder) {
    ResourceSet const set("C", "T", "V", "S");
    EXPECT_EQ(set.get_Class(), "C");
    EXPECT_EQ(set.get_Type(), "T");
    EXPECT_EQ(set.get_Version(), "V");
    EXPECT_EQ(set.get_TimeStamp(), "S");
    EXPECT_EQ(static_cast<std::string>(set), "C");
}

TEST(VPD_ResourceSet, SetsWithDifferentClassLeaveItUnchanged) {
    ResourceSet set = u_hardwareSet("1");
    set.set_Resource(Resource("m", "m"));
    ResourceSet other("com.zor.inventory.Software", "Hardware", "1.0", "1");
    Resource resource("m", "m");
    resource.insert_Property(Property("TM", "x"));
    other.set_Resource(resource);
    other.insert_ResourceList(u_list("Partitions", Resource("p", "p")));
    set += other;
    EXPECT_EQ(resourceText(set.get_Resource()), "(m|m|){}");
    EXPECT_EQ(set.get_NumberOf_ResourceLists(), 0u);
}

TEST(VPD_ResourceSet, MergeJoinsResourcesAndListsButNotAttributesOrFlags) {
    ResourceSet set = u_hardwareSet("1");
    Resource machine("m", "m");
    machine.insert_Property(Property("TM", "first"));
    set.set_Resource(machine);

    ResourceSet other("com.zor.inventory.Hardware", "Other", "2.0", "2");
    Resource otherMachine("m2", "m");
    otherMachine.insert_Property(Property("TM", "second"));
    otherMachine.insert_Property(Property("SE", "serial"));
    otherMachine.insert_Resource("Partitions", Resource("p", "p"));
    other.set_Resource(otherMachine);
    other.insert_ResourceList(u_list("Enclosures", Resource("e", "e")));

    set += other;
    EXPECT_EQ(resourceText(set.get_Resource()),
              "(m|m|){SE=serial;TM=first;}[Partitions/Partitions:(p|p|){}]");
    EXPECT_EQ(u_lists(set), "[Enclosures:(e|e|){}]");
    EXPECT_EQ(set.get_Type(), "Hardware");
    EXPECT_EQ(set.get_Version(), "1.0");
    EXPECT_EQ(set.get_TimeStamp(), "1");
    EXPECT_TRUE(set.ResourcePart::isActive());
    EXPECT_FALSE(set.ListsPart::isActive());
}

TEST(VPD_ResourceSet, MergeWithDifferentResourceIDKeepsTheResource) {
    ResourceSet set = u_hardwareSet("1");
    set.set_Resource(Resource("m", "m"));
    ResourceSet other = u_hardwareSet("1");
    Resource stranger("s", "s");
    stranger.insert_Property(Property("TM", "x"));
    other.set_Resource(stranger);
    other.insert_ResourceList(u_list("Cards", Resource("c", "c")));
    set += other;
    EXPECT_EQ(resourceText(set.get_Resource()), "(m|m|){}");
    EXPECT_EQ(u_lists(set), "[Cards:(c|c|){}]");
}

TEST(VPD_ResourceSet, MergeJoinsSetListsOfTheSameName) {
    ResourceSet set = u_hardwareSet("1");
    set.insert_ResourceList(u_list("Cards", Resource("a", "a")));
    ResourceSet other = u_hardwareSet("1");
    other.insert_ResourceList(u_list("Cards", Resource("b", "b")));
    set += other;
    EXPECT_EQ(u_lists(set), "[Cards:(a|a|){}(b|b|){}]");
}

TEST(VPD_ResourceSet, MergeWithASetWithoutListsKeepsTheListsAndStillJoinsTheResource) {
    ResourceSet set = u_hardwareSet("1");
    set.set_Resource(Resource("m", "m"));
    set.insert_ResourceList(u_list("Cards", Resource("a", "a")));
    ResourceSet other = u_hardwareSet("2");
    Resource machine("m2", "m");
    machine.insert_Property(Property("SE", "serial"));
    other.set_Resource(machine);
    set += other;
    EXPECT_EQ(resourceText(set.get_Resource()), "(m|m|){SE=serial;}");
    EXPECT_EQ(u_lists(set), "[Cards:(a|a|){}]");
}

TEST(VPD_ResourceSet, CopyIsDeepAndIndependent) {
    ResourceSet set = u_hardwareSet("1");
    Resource machine("m", "m");
    machine.insert_Resource("Partitions", Resource("p", "p"));
    set.set_Resource(machine);
    set.insert_ResourceList(u_list("Cards", Resource("c", "c")));

    ResourceSet copy(set);
    copy.get_Resource().insert_Resource("Partitions", Resource("q", "q"));
    copy.insert_ResourceList(u_list("Cards", Resource("d", "d")));

    EXPECT_EQ(resourceText(set.get_Resource()), "(m|m|){}[Partitions/Partitions:(p|p|){}]");
    EXPECT_EQ(u_lists(set), "[Cards:(c|c|){}]");
    EXPECT_TRUE(copy.ResourcePart::isActive());
    EXPECT_TRUE(copy.ListsPart::isActive());
}

TEST(VPD_ResourceSet, AssignmentCopiesFlagsAndContent) {
    ResourceSet active = u_hardwareSet("1");
    active.set_Resource(Resource("m", "m"));
    ResourceSet target;
    target = active;
    EXPECT_TRUE(target.ResourcePart::isActive());
    EXPECT_FALSE(target.ListsPart::isActive());
    EXPECT_EQ(resourceText(target.get_Resource()), "(m|m|){}");
    target = ResourceSet();
    EXPECT_FALSE(target.ResourcePart::isActive());
}

} // namespace
