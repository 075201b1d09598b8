#include "transform/VPD_Resource_2_XML_Element.h"

#include "vpd/ResourceList.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

namespace {

using Quorvex::VPD::Property;
using Quorvex::VPD::PropertyGroup;
using Quorvex::VPD::Resource;
using Quorvex::VPD::ResourceList;
using QuorvexTest::elementText;

std::string u_resourceText(Resource const& resource) {
    XML::Element element;
    Transform::VPD_Resource_2_XML_Element{element}(resource);
    return elementText(element);
}

TEST(Transform_VPD_Resource_2_XML_Element, EmptyUniqueIDAndReferencesLeaveOnlyDisplayName) {
    EXPECT_EQ(u_resourceText(Resource("M", "")), "<Resource displayName=\"M\">M</Resource>");
}

TEST(Transform_VPD_Resource_2_XML_Element, ReferencesAndUniqueIDAreWrittenWhenSet) {
    Resource resource("M", "id-1");
    resource.set_References("ref-1");
    EXPECT_EQ(u_resourceText(resource),
              "<Resource displayName=\"M\" references=\"ref-1\" uniqueId=\"id-1\">M</Resource>");
}

TEST(Transform_VPD_Resource_2_XML_Element, ResourceWithOnlyADisplayNameIsOneLine) {
    EXPECT_EQ(u_resourceText(Resource("host1", "")),
              "<Resource displayName=\"host1\">host1</Resource>");
}

TEST(Transform_VPD_Resource_2_XML_Element, EmptyDisplayNameWithPropertiesGivesALineOfSpacesOnly) {
    Resource resource("", "");
    resource.insert_Property(Property("HN", "h"));
    EXPECT_EQ(u_resourceText(resource), "<Resource displayName=\"\">\n"
                                        "   \n"
                                        "   <Property displayName=\"HostName\" name=\"HN\">\n"
                                        "      HN\n"
                                        "      <Value type=\"string\">h</Value>\n"
                                        "   </Property>\n"
                                        "</Resource>");
}

TEST(Transform_VPD_Resource_2_XML_Element, PropertyGroupWithoutPropertiesGivesAnUnnamedElement) {
    Resource resource("m", "");
    resource.insert_PropertyGroup(PropertyGroup("Empty"));
    EXPECT_EQ(u_resourceText(resource), "<Resource displayName=\"m\">\n"
                                        "   m\n"
                                        "   <></>\n"
                                        "</Resource>");
}

TEST(Transform_VPD_Resource_2_XML_Element, PropertiesThenGroupsThenLists) {
    Resource resource("m", "");
    PropertyGroup group("G");
    group.insert(Property("SZ", "1"));
    resource.insert_PropertyGroup(group);
    resource.insert_Resource("Cards", Resource("c", ""));
    resource.insert_Property(Property("TM", "t"));
    EXPECT_EQ(u_resourceText(resource),
              "<Resource displayName=\"m\">\n"
              "   m\n"
              "   <Property displayName=\"Machine Type-Model\" name=\"TM\">\n"
              "      TM\n"
              "      <Value type=\"string\">t</Value>\n"
              "   </Property>\n"
              "   <PropertyGroup displayName=\"G\">\n"
              "      <Property displayName=\"Size\" name=\"SZ\">\n"
              "         SZ\n"
              "         <Value type=\"string\">1</Value>\n"
              "      </Property>\n"
              "   </PropertyGroup>\n"
              "   <ResourceList displayName=\"Cards\">\n"
              "      <Resource displayName=\"c\">c</Resource>\n"
              "   </ResourceList>\n"
              "</Resource>");
}

TEST(Transform_VPD_Resource_2_XML_Element, EmptyPartitionsListIsWrittenButOtherEmptyListsAreNot) {
    Resource resource("m", "");
    resource.insert_ResourceList(ResourceList("Partitions"));
    resource.insert_ResourceList(ResourceList("Disks"));
    resource.insert_ResourceList(ResourceList("Adapters"));
    EXPECT_EQ(u_resourceText(resource),
              "<Resource displayName=\"m\">\n"
              "   m\n"
              "   <ResourceList displayName=\"Partitions\"></ResourceList>\n"
              "</Resource>");
}

TEST(Transform_VPD_Resource_2_XML_Element, EmptyEnclosuresListIsWrittenAfterPartitions) {
    Resource resource("m", "");
    resource.insert_ResourceList(ResourceList("Enclosures"));
    resource.insert_ResourceList(ResourceList("Partitions"));
    EXPECT_EQ(u_resourceText(resource),
              "<Resource displayName=\"m\">\n"
              "   m\n"
              "   <ResourceList displayName=\"Partitions\"></ResourceList>\n"
              "   <ResourceList displayName=\"Enclosures\"></ResourceList>\n"
              "</Resource>");
}

TEST(Transform_VPD_Resource_2_XML_Element, OnlyEmptyOtherListsGiveAResourceWithItsTextOnly) {
    Resource resource("m", "");
    resource.insert_ResourceList(ResourceList("Disks"));
    EXPECT_EQ(u_resourceText(resource), "<Resource displayName=\"m\">m</Resource>");
}

TEST(Transform_VPD_Resource_2_XML_Element, ListsComePartitionsEnclosuresThenOthersInNameOrder) {
    Resource resource("m", "");
    resource.insert_Resource("Zones", Resource("z", ""));
    resource.insert_Resource("Enclosures", Resource("e", ""));
    resource.insert_Resource("Adapters", Resource("a", ""));
    resource.insert_Resource("Partitions", Resource("p", ""));
    EXPECT_EQ(u_resourceText(resource), "<Resource displayName=\"m\">\n"
                                        "   m\n"
                                        "   <ResourceList displayName=\"Partitions\">\n"
                                        "      <Resource displayName=\"p\">p</Resource>\n"
                                        "   </ResourceList>\n"
                                        "   <ResourceList displayName=\"Enclosures\">\n"
                                        "      <Resource displayName=\"e\">e</Resource>\n"
                                        "   </ResourceList>\n"
                                        "   <ResourceList displayName=\"Adapters\">\n"
                                        "      <Resource displayName=\"a\">a</Resource>\n"
                                        "   </ResourceList>\n"
                                        "   <ResourceList displayName=\"Zones\">\n"
                                        "      <Resource displayName=\"z\">z</Resource>\n"
                                        "   </ResourceList>\n"
                                        "</Resource>");
}

TEST(Transform_VPD_Resource_2_XML_Element, ListDisplayNameIsWrittenNotItsKey) {
    Resource resource("m", "");
    resource.get_ListOf_ResourceLists()
        .find_orCreate("Partitions")
        .set_DisplayName("Client partitions");
    EXPECT_EQ(u_resourceText(resource),
              "<Resource displayName=\"m\">\n"
              "   m\n"
              "   <ResourceList displayName=\"Client partitions\"></ResourceList>\n"
              "</Resource>");
}

} // namespace
