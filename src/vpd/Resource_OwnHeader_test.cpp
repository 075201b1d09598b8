// A unit that includes nothing but the resource's own header can read and
// change the resource's lists: the header completes ResourceList itself.
#include "vpd/Resource.h"

#include <gtest/gtest.h>

#include <string>

namespace {

using Quorvex::VPD::Resource;

TEST(VPD_Resource_OwnHeader, ListsAreUsableWithTheResourceHeaderAlone) {
    Resource machine("m", "m");
    EXPECT_TRUE(machine.insert_Resource("Partitions", Resource("p", "p")));
    EXPECT_EQ(machine.get_ListOf_ResourceLists().find("Partitions").get_DisplayName(),
              "Partitions");
    EXPECT_EQ(machine.get_ListOf_ResourceLists().find("Partitions").find("p").get_DisplayName(),
              "p");
    std::string names;
    for (auto const& list : machine.get_ListOf_ResourceLists()) {
        names += list.second.get_DisplayName() + ";";
    }
    EXPECT_EQ(names, "Partitions;");
}

} // namespace
