#include "transform/ListOf_VPD_Properties_2_XML_Elements.h"

#include <gtest/gtest.h>

namespace {

using Quorvex::VPD::ListOf_Properties;
using Quorvex::VPD::Property;

TEST(Transform_ListOf_VPD_Properties_2_XML_Elements, AppendsOnePropertyPerKeywordInKeyOrder) {
    ListOf_Properties properties;
    properties.insert(Property("TM", "1"));
    properties.insert(Property("HN", "2"));
    XML::ListOf_Elements elements;
    elements.push_back(XML::Element("already there", XML::Tag::Type_String));
    XML::ListOf_Elements& result =
        Transform::ListOf_VPD_Properties_2_XML_Elements{elements}(properties);
    EXPECT_EQ(&result, &elements);
    ASSERT_EQ(elements.size(), 3u);
    EXPECT_EQ(elements[0].get_Name(), "already there");
    EXPECT_EQ(elements[1].get_AttributeValue("name"), "HN");
    EXPECT_EQ(elements[2].get_AttributeValue("name"), "TM");
}

TEST(Transform_ListOf_VPD_Properties_2_XML_Elements, EmptyListAddsNothing) {
    XML::ListOf_Elements elements;
    Transform::ListOf_VPD_Properties_2_XML_Elements{elements}(ListOf_Properties());
    EXPECT_TRUE(elements.empty());
}

} // namespace
