#include "transform/VPD_ResourceSet_2_XML_Element.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

namespace {

using Quorvex::VPD::Resource;
using Quorvex::VPD::ResourceList;
using Quorvex::VPD::ResourceSet;
using QuorvexTest::elementText;

TEST(Transform_VPD_ResourceSet_2_XML_Element, EmptySetHasAllFourAttributesAndAnUnnamedResource) {
    XML::Element element;
    Transform::VPD_ResourceSet_2_XML_Element{element}(ResourceSet());
    EXPECT_EQ(elementText(element),
              "<ResourceSet class=\"\" timestamp=\"\" type=\"\" version=\"\">\n"
              "   <Resource displayName=\"\"></Resource>\n"
              "</ResourceSet>");
}

TEST(Transform_VPD_ResourceSet_2_XML_Element, AllSetListsAreWrittenInNameOrderEmptyOnesIncluded) {
    ResourceSet set("C", "T", "V", "S");
    set.set_Resource(Resource("m", "m"));
    ResourceList cards("Cards");
    cards.insert(Resource("c", "c"));
    set.insert_ResourceList(cards);
    set.insert_ResourceList(ResourceList("Disks"));
    set.insert_ResourceList(ResourceList("Partitions"));
    set.insert_ResourceList(ResourceList("Adapters"));
    XML::Element element;
    Transform::VPD_ResourceSet_2_XML_Element{element}(set);
    EXPECT_EQ(elementText(element),
              "<ResourceSet class=\"C\" timestamp=\"S\" type=\"T\" version=\"V\">\n"
              "   <Resource displayName=\"m\" uniqueId=\"m\">m</Resource>\n"
              "   <ResourceList displayName=\"Adapters\"></ResourceList>\n"
              "   <ResourceList displayName=\"Cards\">\n"
              "      <Resource displayName=\"c\" uniqueId=\"c\">c</Resource>\n"
              "   </ResourceList>\n"
              "   <ResourceList displayName=\"Disks\"></ResourceList>\n"
              "   <ResourceList displayName=\"Partitions\"></ResourceList>\n"
              "</ResourceSet>");
}

} // namespace
