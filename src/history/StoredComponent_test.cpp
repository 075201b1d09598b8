#include "history/StoredComponent.h"

#include <gtest/gtest.h>

namespace {

using history::decodeComponents;
using history::encodeComponents;
using history::StoredComponent;

inventory::Component component(inventory::ComponentKey key, std::string const& name,
                               std::vector<inventory::Keyword> keywords) {
    inventory::Component result;
    result.key = std::move(key);
    result.displayName = name;
    result.list = "Adapters";
    result.keywords = std::move(keywords);
    return result;
}

TEST(HistoryStoredComponent, EncodesOneLinePerComponentAndProperty) {
    std::vector<inventory::Component> const components{
        component({inventory::ComponentKey::Kind::LocationCode, "U1-C6", 2}, "ent0",
                  {{"SN", "Serial Number", "Y050", ""}, {"FN", "", "01F", "Group"}})};
    EXPECT_EQ("L\tU1-C6 #2\tent0\tAdapters\n\tSN\t\tY050\n\tFN\tGroup\t01F\n",
              encodeComponents(components));
}

TEST(HistoryStoredComponent, ControlCharactersAndBackslashesReadBackExactly) {
    std::string const value = "a\tb\nc\r\\d\\t";
    std::vector<inventory::Component> const components{component(
        {inventory::ComponentKey::Kind::UniqueId, "u\n1", 1}, "n\\t", {{"SN", "", value, "g\t"}})};
    std::vector<StoredComponent> const read = decodeComponents(encodeComponents(components));
    ASSERT_EQ(1u, read.size());
    EXPECT_EQ('U', read[0].keyKind);
    EXPECT_EQ("u\n1", read[0].key);
    EXPECT_EQ("n\\t", read[0].displayName);
    ASSERT_EQ(1u, read[0].properties.size());
    EXPECT_EQ(value, read[0].properties[0].value);
    EXPECT_EQ("g\t", read[0].properties[0].group);
    EXPECT_EQ(value, read[0].valueOf("SN"));
    EXPECT_EQ("", read[0].valueOf("PN"));
}

TEST(HistoryStoredComponent, NoComponentsIsEmptyText) {
    EXPECT_EQ("", encodeComponents({}));
    EXPECT_TRUE(decodeComponents("").empty());
}

TEST(HistoryStoredComponent, DisplayNameKeyKindIsD) {
    std::vector<StoredComponent> const read = decodeComponents(encodeComponents(
        {component({inventory::ComponentKey::Kind::DisplayName, "x", 1}, "x", {})}));
    ASSERT_EQ(1u, read.size());
    EXPECT_EQ('D', read[0].keyKind);
}

} // namespace
