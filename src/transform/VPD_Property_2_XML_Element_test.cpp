#include "transform/VPD_Property_2_XML_Element.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

namespace {

using Quorvex::VPD::Property;
using Quorvex::VPD::Value;
using QuorvexTest::elementText;

TEST(Transform_VPD_Property_2_XML_Element, TextLineRepeatsTheKeywordNotTheDisplayName) {
    XML::Element element;
    Transform::VPD_Property_2_XML_Element{element}(Property("SE", "10ABCDE"));
    EXPECT_EQ(elementText(element), "<Property displayName=\"Machine or Cabinet Serial Number\" "
                                    "name=\"SE\">\n"
                                    "   SE\n"
                                    "   <Value type=\"string\">10ABCDE</Value>\n"
                                    "</Property>");
}

TEST(Transform_VPD_Property_2_XML_Element, KeepsTheValueType) {
    XML::Element element;
    Transform::VPD_Property_2_XML_Element{element}(Property("ZZ", Value("true", 4)));
    EXPECT_EQ(elementText(element), "<Property displayName=\"ZZ\" name=\"ZZ\">\n"
                                    "   ZZ\n"
                                    "   <Value type=\"boolean\">true</Value>\n"
                                    "</Property>");
}

TEST(Transform_VPD_Property_2_XML_Element, ReturnsTheTarget) {
    XML::Element element;
    EXPECT_EQ(&Transform::VPD_Property_2_XML_Element{element}(Property("HN", "h")), &element);
    EXPECT_EQ(element.get_NumberOfContent(), 2u);
}

} // namespace
