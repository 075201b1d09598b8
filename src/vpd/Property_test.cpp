#include "vpd/Property.h"

#include <gtest/gtest.h>

#include <string>

namespace {

using Quorvex::VPD::Property;
using Quorvex::VPD::Value;

std::string u_text(Value const& value) {
    return value;
}

// Made while the program starts, possibly before the unit that holds the
// keyword table has run its own start-up code.
std::string const gc_DisplayNameAtStartUp = Property("SE", "x").get_DisplayName();

TEST(VPD_Property, KeywordSEGivesStringTypeAndTableDisplayName) {
    Property const property("SE", "10ABCDE");
    EXPECT_EQ(property.get_Keyword(), "SE");
    EXPECT_EQ(u_text(property.get_Value()), "10ABCDE");
    EXPECT_EQ(property.get_Value().get_ValueType(), 0u);
    EXPECT_EQ(property.get_Value().get_String_ValueType(), "string");
    EXPECT_EQ(property.get_DisplayName(), "Machine or Cabinet Serial Number");
}

TEST(VPD_Property, UnknownKeywordIsItsOwnDisplayName) {
    Property const property("VD", "reason");
    EXPECT_EQ(property.get_DisplayName(), "VD");
}

TEST(VPD_Property, DefaultIsEmpty) {
    Property const property;
    EXPECT_EQ(property.get_Keyword(), "");
    EXPECT_EQ(property.get_DisplayName(), "");
    EXPECT_EQ(u_text(property.get_Value()), "");
    EXPECT_EQ(property.get_Value().get_ValueType(), 0u);
}

TEST(VPD_Property, ValueConstructorKeepsTheType) {
    Property const property("SZ", Value("4096", 2));
    EXPECT_EQ(property.get_Value().get_ValueType(), 2u);
    EXPECT_EQ(property.get_DisplayName(), "Size");
}

TEST(VPD_Property, SetValueWithTextResetsIntegerTypeToString) {
    Property property("SZ", Value("4096", 2));
    property.set_Value(std::string("8192"));
    EXPECT_EQ(u_text(property.get_Value()), "8192");
    EXPECT_EQ(property.get_Value().get_ValueType(), 0u);
}

TEST(VPD_Property, SetValueWithValueKeepsItsType) {
    Property property("SZ", "4096");
    property.set_Value(Value("1.5", 3));
    EXPECT_EQ(property.get_Value().get_ValueType(), 3u);
}

TEST(VPD_Property, KeyIsTheKeyword) {
    Property const property("TM", "1234-ABC");
    EXPECT_EQ(property.__StringValue(), "TM");
    EXPECT_EQ(static_cast<std::string>(property), "TM");
}

TEST(VPD_Property, SetKeywordOnEmptyDisplayNameLooksItUp) {
    Property property;
    property.set_Keyword("TM");
    EXPECT_EQ(property.get_DisplayName(), "Machine Type-Model");
}

TEST(VPD_Property, SetKeywordKeepsTheOldUnknownKeywordAsDisplayName) {
    Property property("ZZ", "x");
    property.set_Keyword("TM");
    // "ZZ" is neither empty nor the new keyword, so it stays.
    EXPECT_EQ(property.get_DisplayName(), "ZZ");
}

TEST(VPD_Property, SetKeywordKeepsAnEarlierTableName) {
    Property property("SE", "x");
    property.set_Keyword("TM");
    EXPECT_EQ(property.get_Keyword(), "TM");
    EXPECT_EQ(property.get_DisplayName(), "Machine or Cabinet Serial Number");
}

TEST(VPD_Property, ExplicitDisplayNameSurvivesSetKeyword) {
    Property property("SE", "x");
    property.set_DisplayName("Chosen");
    property.set_Keyword("TM");
    EXPECT_EQ(property.get_DisplayName(), "Chosen");
}

TEST(VPD_Property, DisplayNameEqualToKeywordIsLookedUpAgain) {
    Property property;
    property.set_DisplayName("TM");
    property.set_Keyword("TM");
    EXPECT_EQ(property.get_DisplayName(), "Machine Type-Model");
}

TEST(VPD_Property, MergeChangesNothing) {
    Property property("TM", "A");
    property += Property("TM", "B");
    EXPECT_EQ(u_text(property.get_Value()), "A");
}

TEST(VPD_Property, EqualityComparesKeywordAndTextButNotType) {
    EXPECT_TRUE(Property("SZ", Value("1", 2)) == Property("SZ", Value("1", 0)));
    EXPECT_FALSE(Property("SZ", "1") == Property("SZ", "2"));
    EXPECT_FALSE(Property("SZ", "1") == Property("SE", "1"));
    EXPECT_TRUE(Property("SZ", "1") != Property("SZ", "2"));
    EXPECT_FALSE(Property("SZ", "1") != Property("SZ", "1"));
}

TEST(VPD_Property, PropertyMadeAtStartUpFindsTheKeywordTable) {
    EXPECT_EQ(gc_DisplayNameAtStartUp, "Machine or Cabinet Serial Number");
}

TEST(VPD_Property, SharedTableIsTheBuiltInOne) {
    EXPECT_EQ(Property::ms_Keywords_DisplayName.size(), 104u);
    EXPECT_EQ(Property::ms_Keywords_DisplayName["HN"], "HostName");
}

TEST(VPD_Property, AnyBytesGoThroughUnchanged) {
    std::string const text("a\0b\x01\xff&<\"", 8);
    Property const property(std::string("\xc3\xa9", 2), text);
    EXPECT_EQ(u_text(property.get_Value()), text);
    EXPECT_EQ(property.get_DisplayName(), "\xc3\xa9");
}

} // namespace
