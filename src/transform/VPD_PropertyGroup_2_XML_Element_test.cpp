#include "transform/VPD_PropertyGroup_2_XML_Element.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

namespace {

using Quorvex::VPD::Property;
using Quorvex::VPD::PropertyGroup;
using QuorvexTest::elementText;

TEST(Transform_VPD_PropertyGroup_2_XML_Element, GroupHoldsItsPropertiesWithoutText) {
    PropertyGroup group("Memory");
    group.insert(Property("SZ", "4096"));
    XML::Element element;
    Transform::VPD_PropertyGroup_2_XML_Element{element}(group);
    EXPECT_EQ(elementText(element), "<PropertyGroup displayName=\"Memory\">\n"
                                    "   <Property displayName=\"Size\" name=\"SZ\">\n"
                                    "      SZ\n"
                                    "      <Value type=\"string\">4096</Value>\n"
                                    "   </Property>\n"
                                    "</PropertyGroup>");
}

TEST(Transform_VPD_PropertyGroup_2_XML_Element, GroupWithoutPropertiesLeavesTheTargetUntouched) {
    XML::Element element;
    Transform::VPD_PropertyGroup_2_XML_Element{element}(PropertyGroup("Empty"));
    EXPECT_EQ(element.get_Name(), "");
    EXPECT_EQ(element.get_Tag().get_Type(), XML::Tag::Type_BeginTag);
    EXPECT_EQ(element.get_NumberOfAttribute(), 0u);
    EXPECT_EQ(elementText(element), "<></>");

    XML::Element used("kept", XML::Tag::Type_Comment);
    Transform::VPD_PropertyGroup_2_XML_Element{used}(PropertyGroup("Empty"));
    EXPECT_EQ(elementText(used), "<!--kept-->");
}

} // namespace
