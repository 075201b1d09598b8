#include "vpd/ResourceList.h"

#include <gtest/gtest.h>

#include <string>

namespace {

using Quorvex::VPD::Resource;
using Quorvex::VPD::ResourceList;

TEST(VPD_ResourceList, KeyIsTheName) {
    ResourceList const list("Partitions");
    EXPECT_EQ(static_cast<std::string>(list), "Partitions");
    EXPECT_TRUE(list.empty());
    EXPECT_EQ(ResourceList().get_DisplayName(), "");
}

TEST(VPD_ResourceList, NameAloneMakesAnEmptyList) {
    ResourceList const list = std::string("Partitions");
    EXPECT_EQ(list.get_DisplayName(), "Partitions");
    EXPECT_TRUE(list.empty());
}

TEST(VPD_ResourceList, ResourcesIterateInByteOrderOfUniqueIDs) {
    ResourceList list("Partitions");
    list.insert(Resource("b", "1234-ABC-10ABCDE-2"));
    list.insert(Resource("c", "1234-ABC-10ABCDE-10"));
    list.insert(Resource("a", "1234-ABC-10ABCDE-1"));
    std::string order;
    for (auto const& entry : list) {
        order += entry.second.get_DisplayName();
    }
    EXPECT_EQ(order, "acb");
}

TEST(VPD_ResourceList, MergingListsJoinsTheirResources) {
    ResourceList list("Partitions");
    list.insert(Resource("a", "a"));
    ResourceList other("Partitions");
    other.insert(Resource("again", "a"));
    other.insert(Resource("b", "b"));
    list += other;
    ASSERT_EQ(list.size(), 2u);
    EXPECT_EQ(list.find("a").get_DisplayName(), "a");
    EXPECT_TRUE(list.contains("b"));
}

TEST(VPD_ResourceList, AssigningANestedListToItsOwnAncestorIsSafe) {
    Resource card("card", "card");
    card.insert_Resource("Ports", Resource("port", "port"));
    ResourceList list("Adapters");
    list.insert(card);
    list = list.find("card").get_ListOf_ResourceLists().find("Ports");
    ASSERT_EQ(list.size(), 1u);
    EXPECT_EQ(list.get_DisplayName(), "Ports");
    EXPECT_EQ(list.find("port").get_DisplayName(), "port");
}

} // namespace
