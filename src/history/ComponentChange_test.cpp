#include "history/ComponentChange.h"

#include <gtest/gtest.h>

namespace {

using history::compareComponents;
using history::ComponentChange;
using history::StoredComponent;

StoredComponent adapter(std::string const& location, std::string const& serial,
                        std::string const& firmware = "1.0") {
    return {'L',
            location,
            "ent-" + location,
            "Adapters",
            {{"SN", "", serial}, {"FW", "", firmware}, {"YL", "", location}}};
}

TEST(HistoryComponentChange, SameComponentsGiveNoChange) {
    EXPECT_TRUE(compareComponents({adapter("C1", "S1")}, {adapter("C1", "S1")}).empty());
}

TEST(HistoryComponentChange, NewSerialAtTheSameLocationIsOneReplacement) {
    std::vector<ComponentChange> const expected{
        {"replaced", "C1", "ent-C1", std::nullopt, "S1", "S2"}};
    EXPECT_EQ(expected, compareComponents({adapter("C1", "S1")}, {adapter("C1", "S2", "2.0")}));
}

TEST(HistoryComponentChange, NewFirmwareIsAPropertyChangeWithOldAndNewValue) {
    std::vector<ComponentChange> const expected{
        {"property_changed", "C1", "ent-C1", "FW", "1.0", "2.0"}};
    EXPECT_EQ(expected, compareComponents({adapter("C1", "S1")}, {adapter("C1", "S1", "2.0")}));
}

TEST(HistoryComponentChange, AddedInNewOrderThenRemovedInOldOrder) {
    std::vector<ComponentChange> const expected{
        {"added", "C3", "ent-C3", std::nullopt, std::nullopt, std::nullopt},
        {"removed", "C1", "ent-C1", std::nullopt, std::nullopt, std::nullopt}};
    EXPECT_EQ(expected, compareComponents({adapter("C1", "S1"), adapter("C2", "S2")},
                                          {adapter("C3", "S3"), adapter("C2", "S2")}));
}

TEST(HistoryComponentChange, KeywordGainedOrLostHasOnlyOneValue) {
    StoredComponent before = adapter("C1", "S1");
    StoredComponent after = before;
    after.properties.push_back({"CC", "", "2CE3"});
    before.properties.push_back({"PN", "", "01F"});
    std::vector<ComponentChange> const expected{
        {"property_changed", "C1", "ent-C1", "CC", std::nullopt, "2CE3"},
        {"property_changed", "C1", "ent-C1", "PN", "01F", std::nullopt}};
    EXPECT_EQ(expected, compareComponents({before}, {after}));
}

TEST(HistoryComponentChange, SerialGainedIsAPropertyChangeNotAReplacement) {
    StoredComponent before = adapter("C1", "");
    std::vector<ComponentChange> const expected{
        {"property_changed", "C1", "ent-C1", "SN", "", "S1"}};
    EXPECT_EQ(expected, compareComponents({before}, {adapter("C1", "S1")}));
}

TEST(HistoryComponentChange, KeysOfDifferentKindsDoNotMatch) {
    StoredComponent byId = adapter("C1", "S1");
    byId.keyKind = 'U';
    std::vector<ComponentChange> const changes = compareComponents({adapter("C1", "S1")}, {byId});
    ASSERT_EQ(2u, changes.size());
    EXPECT_EQ("added", changes[0].kind);
    EXPECT_EQ("removed", changes[1].kind);
}

TEST(HistoryComponentChange, RepeatedKeywordComparesOccurrenceByOccurrence) {
    StoredComponent before = adapter("C1", "S1");
    before.properties.push_back({"Z1", "", "a"});
    before.properties.push_back({"Z1", "", "b"});
    StoredComponent after = adapter("C1", "S1");
    after.properties.push_back({"Z1", "", "a"});
    after.properties.push_back({"Z1", "", "c"});
    std::vector<ComponentChange> const expected{
        {"property_changed", "C1", "ent-C1", "Z1", "b", "c"}};
    EXPECT_EQ(expected, compareComponents({before}, {after}));
}

} // namespace
