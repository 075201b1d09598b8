#include "transform/VPD_ResourceList_2_XML_Element.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

namespace {

using Quorvex::VPD::Resource;
using Quorvex::VPD::ResourceList;
using QuorvexTest::elementText;

TEST(Transform_VPD_ResourceList_2_XML_Element, EmptyListIsABeginTagFollowedByItsEndTag) {
    XML::Element element;
    Transform::VPD_ResourceList_2_XML_Element{element}(ResourceList("Partitions"));
    EXPECT_EQ(elementText(element), "<ResourceList displayName=\"Partitions\"></ResourceList>");
}

TEST(Transform_VPD_ResourceList_2_XML_Element, ResourcesComeInUniqueIDOrder) {
    ResourceList list("Partitions");
    list.insert(Resource("second", "b"));
    list.insert(Resource("first", "a"));
    XML::Element element;
    Transform::VPD_ResourceList_2_XML_Element{element}(list);
    EXPECT_EQ(elementText(element),
              "<ResourceList displayName=\"Partitions\">\n"
              "   <Resource displayName=\"first\" uniqueId=\"a\">first</Resource>\n"
              "   <Resource displayName=\"second\" uniqueId=\"b\">second</Resource>\n"
              "</ResourceList>");
}

} // namespace
