#include "transform/VPD_Value_2_XML_Element.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

namespace {

using Quorvex::VPD::Value;
using QuorvexTest::elementText;

TEST(Transform_VPD_Value_2_XML_Element, ValueIsOneLineWithItsTypeName) {
    XML::Element element;
    Transform::VPD_Value_2_XML_Element{element}(Value("4096", 2));
    EXPECT_EQ(elementText(element), "<Value type=\"integer\">4096</Value>");
}

TEST(Transform_VPD_Value_2_XML_Element, HasExactlyOneTextChild) {
    XML::Element element;
    XML::Element& result = Transform::VPD_Value_2_XML_Element{element}(Value("x", 0));
    EXPECT_EQ(&result, &element);
    EXPECT_EQ(element.get_Name(), "Value");
    ASSERT_EQ(element.get_NumberOfContent(), 1u);
    EXPECT_EQ(element.get_Content().front().get_Tag().get_Type(), XML::Tag::Type_String);
    EXPECT_EQ(element.get_Content().front().get_Name(), "x");
}

TEST(Transform_VPD_Value_2_XML_Element, EmptyValueHasEmptyText) {
    XML::Element element;
    Transform::VPD_Value_2_XML_Element{element}(Value());
    EXPECT_EQ(elementText(element), "<Value type=\"string\"></Value>");
}

TEST(Transform_VPD_Value_2_XML_Element, LineFeedsInTheTextAreKept) {
    XML::Element element;
    Transform::VPD_Value_2_XML_Element{element}(Value("a\nb\n", 0));
    EXPECT_EQ(elementText(element), "<Value type=\"string\">a\nb\n</Value>");
}

} // namespace
