#include "inventory/ComponentKeys.h"

#include <gtest/gtest.h>

#include <vector>

namespace {

using inventory::Component;
using inventory::ComponentKey;

Component component(std::string const& displayName, std::string const& uniqueId,
                    std::vector<inventory::Keyword> keywords) {
    Component result;
    result.displayName = displayName;
    result.uniqueId = uniqueId;
    result.keywords = std::move(keywords);
    return result;
}

ComponentKey keyOf(Component const& one) {
    std::vector<Component> components{one};
    inventory::assignComponentKeys(components);
    return components[0].key;
}

TEST(InventoryComponentKeys, LocationCodeComesFirst) {
    EXPECT_EQ((ComponentKey{ComponentKey::Kind::LocationCode, "U1-P1", 1}),
              keyOf(component("ent0", "u", {{"SN", "", "1", ""}, {"YL", "", "U1-P1", ""}})));
}

TEST(InventoryComponentKeys, EmptyLocationCodeGivesWayToTheNextOne) {
    EXPECT_EQ((ComponentKey{ComponentKey::Kind::LocationCode, "U2", 1}),
              keyOf(component("ent0", "u", {{"YL", "", "", ""}, {"YL", "", "U2", ""}})));
}

TEST(InventoryComponentKeys, UniqueIdWithoutLocationCode) {
    EXPECT_EQ((ComponentKey{ComponentKey::Kind::UniqueId, "u", 1}),
              keyOf(component("ent0", "u", {{"YL", "", "", ""}})));
}

TEST(InventoryComponentKeys, DisplayNameWithoutEither) {
    EXPECT_EQ((ComponentKey{ComponentKey::Kind::DisplayName, "ent0", 1}),
              keyOf(component("ent0", "", {})));
}

TEST(InventoryComponentKeys, SharedKeysAreNumberedPerKindInDocumentOrder) {
    std::vector<Component> components{component("a", "x", {{"YL", "", "x", ""}}),
                                      component("b", "x", {}), component("c", "x", {}),
                                      component("d", "", {{"YL", "", "x", ""}})};
    inventory::assignComponentKeys(components);
    EXPECT_EQ("x", components[0].key.identity());
    EXPECT_EQ(ComponentKey::Kind::UniqueId, components[1].key.kind);
    EXPECT_EQ(1u, components[1].key.occurrence);
    EXPECT_EQ("x #2", components[2].key.identity());
    EXPECT_EQ((ComponentKey{ComponentKey::Kind::LocationCode, "x", 2}), components[3].key);
}

} // namespace
