#include "vpd/Resource.h"

#include "vpd/ResourceList.h"
#include "vpd/ResourceSet.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <exception>
#include <string>
#include <type_traits>
#include <utility>
#include <vector>

namespace {

using Quorvex::VPD::Property;
using Quorvex::VPD::PropertyGroup;
using Quorvex::VPD::Resource;
using Quorvex::VPD::ResourceList;
using QuorvexTest::resourceText;

Resource u_resource(std::string const& id, std::vector<Property> const& properties) {
    Resource resource("name-" + id, id);
    for (Property const& property : properties) {
        resource.insert_Property(property);
    }
    return resource;
}

// machine > Partitions > part1 > Adapters > card1 > Ports > port1
Resource u_threeLevelTree() {
    Resource port = u_resource("port1", {Property("LO", "P1-C1-T1")});
    Resource card = u_resource("card1", {Property("FN", "00E1234")});
    card.insert_Resource("Ports", port);
    Resource partition = u_resource("part1", {Property("HN", "host1")});
    partition.insert_Resource("Adapters", card);
    Resource machine = u_resource("machine", {Property("TM", "1234-ABC")});
    machine.insert_Resource("Partitions", partition);
    return machine;
}

std::string const gc_ThreeLevelTree = "(name-machine|machine|){TM=1234-ABC;}[Partitions/Partitions:"
                                      "(name-part1|part1|){HN=host1;}[Adapters/Adapters:"
                                      "(name-card1|card1|){FN=00E1234;}[Ports/Ports:"
                                      "(name-port1|port1|){LO=P1-C1-T1;}]]]";

TEST(VPD_Resource, DefaultIsEmpty) {
    Resource const resource;
    EXPECT_EQ(resourceText(resource), "(||){}");
    EXPECT_EQ(resource.get_NumberOf_Properties(), 0u);
    EXPECT_EQ(resource.get_NumberOf_PropertyGroups(), 0u);
    EXPECT_EQ(resource.get_NumberOf_ResourceLists(), 0u);
}

TEST(VPD_Resource, KeyIsTheUniqueID) {
    Resource const resource("host1", "1234-ABC-10ABCDE-1");
    EXPECT_EQ(static_cast<std::string>(resource), "1234-ABC-10ABCDE-1");
    EXPECT_EQ(resource.get_DisplayName(), "host1");
    EXPECT_EQ(resource.get_References(), "");
}

TEST(VPD_Resource, InsertResourceWithEmptyListNameReturnsFalseAndAddsNothing) {
    Resource machine("m", "m");
    EXPECT_FALSE(machine.insert_Resource("", Resource("p", "p")));
    EXPECT_EQ(machine.get_NumberOf_ResourceLists(), 0u);
    EXPECT_FALSE(machine.has_ResourceList(""));
}

TEST(VPD_Resource, InsertResourceCreatesAListNamedAfterItsKey) {
    Resource machine("m", "m");
    EXPECT_TRUE(machine.insert_Resource("Partitions", Resource("p", "p")));
    EXPECT_TRUE(machine.has_ResourceList("Partitions"));
    EXPECT_EQ(machine.get_ListOf_ResourceLists().find("Partitions").get_DisplayName(),
              "Partitions");
}

TEST(VPD_Resource, InsertResourceNamesAnUnnamedListFoundUnderTheKey) {
    Resource machine("m", "m");
    machine.get_ListOf_ResourceLists().find_orCreate("Cards");
    machine.insert_Resource("Cards", Resource("c", "c"));
    EXPECT_EQ(resourceText(machine), "(m|m|){}[Cards/Cards:(c|c|){}]");
}

TEST(VPD_Resource, SameUniqueIDInOneListMergesPropertiesFirstValueKept) {
    Resource machine("m", "m");
    machine.insert_Resource("Partitions",
                            u_resource("p1", {Property("HN", "first"), Property("OS", "Zeph")}));
    machine.insert_Resource("Partitions",
                            u_resource("p1", {Property("HN", "second"), Property("PT", "1")}));
    EXPECT_EQ(resourceText(machine),
              "(m|m|){}[Partitions/Partitions:(name-p1|p1|){HN=first;OS=Zeph;PT=1;}]");
}

TEST(VPD_Resource, ResourcesIterateByUniqueIDAndListsByName) {
    Resource machine("m", "m");
    machine.insert_Resource("Partitions", Resource("z", "B-2"));
    machine.insert_Resource("Partitions", Resource("y", "A-10"));
    machine.insert_Resource("Partitions", Resource("x", "A-1"));
    machine.insert_Resource("Enclosures", Resource("e", "E"));
    machine.insert_Resource("Cards", Resource("c", "C"));
    EXPECT_EQ(resourceText(machine),
              "(m|m|){}[Cards/Cards:(c|C|){}][Enclosures/Enclosures:(e|E|){}]"
              "[Partitions/Partitions:(x|A-1|){}(y|A-10|){}(z|B-2|){}]");
}

TEST(VPD_Resource, MergeWithDifferentUniqueIDLeavesItUnchanged) {
    Resource machine = u_threeLevelTree();
    Resource other = u_resource("other", {Property("SE", "x")});
    other.insert_Resource("Partitions", Resource("p9", "p9"));
    machine += other;
    EXPECT_EQ(resourceText(machine), gc_ThreeLevelTree);
}

TEST(VPD_Resource, MergeKeepsDisplayNameAndReferences) {
    Resource resource("first", "id");
    resource.set_References("ref-1");
    Resource other("second", "id");
    other.set_References("ref-2");
    other.insert_Property(Property("SE", "x"));
    resource += other;
    EXPECT_EQ(resourceText(resource), "(first|id|ref-1){SE=x;}");
}

TEST(VPD_Resource, MergeJoinsNestedTreesRecursively) {
    Resource machine = u_threeLevelTree();

    Resource port2 = u_resource("port2", {});
    Resource card = u_resource("card1", {Property("FN", "other"), Property("SN", "Y1")});
    card.insert_Resource("Ports", port2);
    Resource partition = u_resource("part1", {Property("HN", "other")});
    partition.insert_Resource("Adapters", card);
    partition.insert_Resource("Disks", u_resource("disk1", {}));
    Resource other = u_resource("machine", {Property("SE", "10ABCDE")});
    other.insert_Resource("Partitions", partition);
    other.insert_Resource("Partitions", u_resource("part2", {}));
    other.insert_Resource("Enclosures", u_resource("enc1", {}));

    machine += other;
    EXPECT_EQ(resourceText(machine),
              "(name-machine|machine|){SE=10ABCDE;TM=1234-ABC;}"
              "[Enclosures/Enclosures:(name-enc1|enc1|){}]"
              "[Partitions/Partitions:"
              "(name-part1|part1|){HN=host1;}"
              "[Adapters/Adapters:(name-card1|card1|){FN=00E1234;SN=Y1;}"
              "[Ports/Ports:(name-port1|port1|){LO=P1-C1-T1;}(name-port2|port2|){}]]"
              "[Disks/Disks:(name-disk1|disk1|){}]"
              "(name-part2|part2|){}]");
}

TEST(VPD_Resource, MergeJoinsPropertyGroupsOfTheSameName) {
    Resource resource("r", "r");
    PropertyGroup first("Memory");
    first.insert(Property("SZ", "1"));
    resource.insert_PropertyGroup(first);
    Resource other("r", "r");
    PropertyGroup second("Memory");
    second.insert(Property("SZ", "2"));
    second.insert(Property("LO", "slot"));
    other.insert_PropertyGroup(second);
    other.insert_PropertyGroup(PropertyGroup("Cpu"));
    resource += other;
    EXPECT_EQ(resourceText(resource), "(r|r|){}<Cpu{}><Memory{LO=slot;SZ=1;}>");
}

TEST(VPD_Resource, MergeWithItselfChangesNothing) {
    Resource machine = u_threeLevelTree();
    machine += machine;
    EXPECT_EQ(resourceText(machine), gc_ThreeLevelTree);
}

TEST(VPD_Resource, CopiedResourceNestedListsAreIndependent) {
    Resource const source = u_threeLevelTree();
    Resource copy(source);
    Resource& partition =
        copy.get_ListOf_ResourceLists().find_orCreate("Partitions").find_orCreate("part1");
    Resource& card =
        partition.get_ListOf_ResourceLists().find_orCreate("Adapters").find_orCreate("card1");
    card.insert_Resource("Ports", Resource("port2", "port2"));
    card.insert_Property(Property("SN", "changed"));
    partition.insert_Resource("Disks", Resource("disk1", "disk1"));
    copy.insert_Resource("Enclosures", Resource("enc1", "enc1"));

    EXPECT_EQ(resourceText(source), gc_ThreeLevelTree);
    EXPECT_NE(resourceText(copy), gc_ThreeLevelTree);
}

TEST(VPD_Resource, ChangingTheSourceLeavesTheCopyUnchanged) {
    Resource source = u_threeLevelTree();
    Resource const copy(source);
    source.get_ListOf_ResourceLists()
        .find_orCreate("Partitions")
        .find_orCreate("part1")
        .insert_Resource("Adapters", Resource("card2", "card2"));
    EXPECT_EQ(resourceText(copy), gc_ThreeLevelTree);
}

TEST(VPD_Resource, AssignedResourceIsADeepIndependentCopy) {
    Resource const source = u_threeLevelTree();
    Resource target = u_resource("old", {Property("OS", "x")});
    target.insert_Resource("Old", Resource("o", "o"));
    target = source;
    EXPECT_EQ(resourceText(target), gc_ThreeLevelTree);
    target.get_ListOf_ResourceLists()
        .find_orCreate("Partitions")
        .find_orCreate("part1")
        .insert_Property(Property("OS", "changed"));
    EXPECT_EQ(resourceText(source), gc_ThreeLevelTree);
}

TEST(VPD_Resource, SelfAssignmentKeepsTheTree) {
    Resource resource = u_threeLevelTree();
    Resource& same = resource;
    resource = same;
    EXPECT_EQ(resourceText(resource), gc_ThreeLevelTree);
}

TEST(VPD_Resource, AssigningANestedResourceToItsOwnAncestorIsSafe) {
    Resource machine = u_threeLevelTree();
    machine = machine.get_ListOf_ResourceLists().find("Partitions").find("part1");
    EXPECT_EQ(resourceText(machine), "(name-part1|part1|){HN=host1;}[Adapters/Adapters:"
                                     "(name-card1|card1|){FN=00E1234;}[Ports/Ports:"
                                     "(name-port1|port1|){LO=P1-C1-T1;}]]");
}

// A resource owns its resource lists through a pointer that only its copy
// operations fill, with a deep copy: moving copies, and the test reads the
// source after the move to show it kept its lists.
TEST(VPD_Resource, MovingCopiesAndLeavesTheSourceWhole) {
    Resource source = u_threeLevelTree();
    Resource const moved(std::move(source)); // NOLINT(performance-move-const-arg)
    EXPECT_EQ(resourceText(moved), gc_ThreeLevelTree);
    // cppcheck-suppress accessMoved
    EXPECT_EQ(resourceText(source), gc_ThreeLevelTree); // NOLINT(bugprone-use-after-move)
    Resource target;
    // cppcheck-suppress accessMoved
    target = std::move(source); // NOLINT(performance-move-const-arg)
    // cppcheck-suppress accessMoved
    EXPECT_EQ(resourceText(source), gc_ThreeLevelTree); // NOLINT(bugprone-use-after-move)
    EXPECT_TRUE(source.insert_Resource("Partitions", Resource("p", "p")));
}

TEST(VPD_Resource, FindOfMissingListThrowsElementNotFound) {
    Resource const machine = u_threeLevelTree();
    EXPECT_THROW(machine.get_ListOf_ResourceLists().find("Enclosures"),
                 Quorvex::VPD::ListOf_<ResourceList>::Error_ElementNotFound);
}

TEST(VPD_Resource, InsertResourceListMergesAListOfTheSameName) {
    Resource machine("m", "m");
    ResourceList first("Partitions");
    first.insert(Resource("a", "a"));
    ResourceList second("Partitions");
    second.insert(Resource("b", "b"));
    machine.insert_ResourceList(first);
    machine.insert_ResourceList(second);
    EXPECT_EQ(resourceText(machine), "(m|m|){}[Partitions/Partitions:(a|a|){}(b|b|){}]");
}

TEST(VPD_Resource, PropertiesAndGroupsAreReachableByKey) {
    Resource resource("r", "r");
    resource.insert_Property(Property("HN", "host1"));
    resource.insert_PropertyGroup(PropertyGroup("Cpu"));
    EXPECT_TRUE(resource.has_Property("HN"));
    EXPECT_FALSE(resource.has_Property("HostName"));
    EXPECT_TRUE(resource.has_PropertyGroup("Cpu"));
    EXPECT_FALSE(resource.has_PropertyGroup("Memory"));
}

TEST(VPD_Resource, ModelClassesHaveOnlyTheKeyAsVirtualAndNoVirtualDestructor) {
    EXPECT_FALSE(std::is_polymorphic<Quorvex::VPD::Base>::value);
    EXPECT_TRUE(std::is_polymorphic<Resource>::value);
    EXPECT_FALSE(std::has_virtual_destructor<Quorvex::VPD::Base_StringValue>::value);
    EXPECT_FALSE(std::has_virtual_destructor<Property>::value);
    EXPECT_FALSE(std::has_virtual_destructor<PropertyGroup>::value);
    EXPECT_FALSE(std::has_virtual_destructor<Resource>::value);
    EXPECT_FALSE(std::has_virtual_destructor<ResourceList>::value);
    EXPECT_FALSE(std::has_virtual_destructor<Quorvex::VPD::ResourceSet>::value);
}

TEST(VPD_Resource, ErrorTypesAreEmptyAndOutsideTheStandardExceptions) {
    using NullContent =
        Quorvex::VPD::Resource_ContainerInterface_ListOf_ResourceLists::Error_ContentPtrIs_NULL;
    using NotFound = Quorvex::VPD::ListOf_<ResourceList>::Error_ElementNotFound;
    EXPECT_TRUE(std::is_empty<NullContent>::value);
    EXPECT_TRUE(std::is_empty<NotFound>::value);
    // A catch of the standard base anywhere must not swallow them.
    EXPECT_FALSE((std::is_base_of<std::exception, NullContent>::value));
    EXPECT_FALSE((std::is_base_of<std::exception, NotFound>::value));
}

} // namespace
