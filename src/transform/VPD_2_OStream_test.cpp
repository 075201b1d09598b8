#include "transform/VPD_2_OStream.h"

#include "vpd/ResourceList.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdio>
#include <fstream>
#include <iterator>
#include <sstream>
#include <string>

namespace {

using Quorvex::VPD::Property;
using Quorvex::VPD::PropertyGroup;
using Quorvex::VPD::Resource;
using Quorvex::VPD::ResourceList;
using Quorvex::VPD::ResourceSet;

std::string u_document(ResourceSet const& set) {
    std::ostringstream out;
    Transform::VPD_2_OStream{out}(set);
    return out.str();
}

std::string u_document(Resource const& resource) {
    std::ostringstream out;
    Transform::VPD_2_OStream{out}(resource);
    return out.str();
}

ResourceSet u_hardwareSet(std::string const& timeStamp, Resource const& resource) {
    ResourceSet set("com.zor.inventory.Hardware", "Hardware", "1.0", timeStamp);
    set.set_Resource(resource);
    return set;
}

Resource u_leaf(std::string const& name) {
    return Resource(name, name);
}

// Machine M with property K (display name D, value R) and one partition P;
// both unique IDs stay empty.
ResourceSet u_exampleSet() {
    Property property("K", "R");
    property.set_DisplayName("D");
    Resource machine("M", "");
    machine.insert_Property(property);
    machine.insert_Resource("Partitions", Resource("P", ""));
    return u_hardwareSet("T", machine);
}

std::string const gc_ExampleDocument =
    R"(<?xml version="1.0" encoding="UTF-8"?><com.zor.inventory version="1.0">
   <ResourceSet class="com.zor.inventory.Hardware" timestamp="T" type="Hardware" version="1.0">
      <Resource displayName="M">
         M
         <Property displayName="D" name="K">
            K
            <Value type="string">R</Value>
         </Property>
         <ResourceList displayName="Partitions">
            <Resource displayName="P">P</Resource>
         </ResourceList>
      </Resource>
   </ResourceSet>
</com.zor.inventory>)";

TEST(Transform_VPD_2_OStream, ExampleDocumentOfFourteenLines) {
    std::string const document = u_document(u_exampleSet());
    EXPECT_EQ(document, gc_ExampleDocument);
    EXPECT_EQ(std::count(document.begin(), document.end(), '\n'), 13);
    EXPECT_EQ(document.find('\r'), std::string::npos);
}

TEST(Transform_VPD_2_OStream, FirstLineHoldsDeclarationAndOuterBeginTag) {
    std::string const document = u_document(u_exampleSet());
    EXPECT_EQ(document.substr(0, document.find('\n')),
              "<?xml version=\"1.0\" encoding=\"UTF-8\"?><com.zor.inventory version=\"1.0\">");
}

TEST(Transform_VPD_2_OStream, DocumentEndsWithoutALineFeed) {
    std::string const document = u_document(u_exampleSet());
    std::string const lastLine = "\n</com.zor.inventory>";
    ASSERT_GE(document.size(), lastLine.size());
    EXPECT_EQ(document.substr(document.size() - lastLine.size()), lastLine);
}

TEST(Transform_VPD_2_OStream, ListsOfAResourceComePartitionsEnclosuresThenOthers) {
    Resource machine = u_leaf("m");
    machine.insert_Resource("Zones", u_leaf("z"));
    machine.insert_Resource("Enclosures", u_leaf("e"));
    machine.insert_Resource("Adapters", u_leaf("a"));
    machine.insert_Resource("Partitions", u_leaf("p"));
    EXPECT_EQ(u_document(u_hardwareSet("1", machine)),
              R"(<?xml version="1.0" encoding="UTF-8"?><com.zor.inventory version="1.0">
   <ResourceSet class="com.zor.inventory.Hardware" timestamp="1" type="Hardware" version="1.0">
      <Resource displayName="m" uniqueId="m">
         m
         <ResourceList displayName="Partitions">
            <Resource displayName="p" uniqueId="p">p</Resource>
         </ResourceList>
         <ResourceList displayName="Enclosures">
            <Resource displayName="e" uniqueId="e">e</Resource>
         </ResourceList>
         <ResourceList displayName="Adapters">
            <Resource displayName="a" uniqueId="a">a</Resource>
         </ResourceList>
         <ResourceList displayName="Zones">
            <Resource displayName="z" uniqueId="z">z</Resource>
         </ResourceList>
      </Resource>
   </ResourceSet>
</com.zor.inventory>)");
}

TEST(Transform_VPD_2_OStream, EmptyPropertyGroupIsAnUnnamedElement) {
    Resource machine = u_leaf("m");
    PropertyGroup memory("Memory");
    memory.insert(Property("SZ", "4096"));
    machine.insert_PropertyGroup(memory);
    machine.insert_PropertyGroup(PropertyGroup("Empty"));
    EXPECT_EQ(u_document(u_hardwareSet("1", machine)),
              R"(<?xml version="1.0" encoding="UTF-8"?><com.zor.inventory version="1.0">
   <ResourceSet class="com.zor.inventory.Hardware" timestamp="1" type="Hardware" version="1.0">
      <Resource displayName="m" uniqueId="m">
         m
         <></>
         <PropertyGroup displayName="Memory">
            <Property displayName="Size" name="SZ">
               SZ
               <Value type="string">4096</Value>
            </Property>
         </PropertyGroup>
      </Resource>
   </ResourceSet>
</com.zor.inventory>)");
}

TEST(Transform_VPD_2_OStream, EmptyPartitionsListIsWrittenAndOtherEmptyListsOnlyAtSetLevel) {
    Resource machine = u_leaf("m");
    machine.insert_ResourceList(ResourceList("Partitions"));
    machine.insert_ResourceList(ResourceList("Disks"));
    ResourceSet set = u_hardwareSet("1", machine);
    set.insert_ResourceList(ResourceList("Disks"));
    EXPECT_EQ(u_document(set),
              R"(<?xml version="1.0" encoding="UTF-8"?><com.zor.inventory version="1.0">
   <ResourceSet class="com.zor.inventory.Hardware" timestamp="1" type="Hardware" version="1.0">
      <Resource displayName="m" uniqueId="m">
         m
         <ResourceList displayName="Partitions"></ResourceList>
      </Resource>
      <ResourceList displayName="Disks"></ResourceList>
   </ResourceSet>
</com.zor.inventory>)");
}

TEST(Transform_VPD_2_OStream, AmpersandLessThanAndQuoteAreWrittenUnchanged) {
    Resource machine("R&D <lab> \"A\"", "id<&\">");
    machine.set_References("a&b");
    Property property("Q&", "x < y & \"z\"");
    property.set_DisplayName("<\"&\">");
    machine.insert_Property(property);
    ResourceSet set("c&<\"", "t", "v", "1");
    set.set_Resource(machine);
    EXPECT_EQ(u_document(set),
              R"(<?xml version="1.0" encoding="UTF-8"?><com.zor.inventory version="1.0">
   <ResourceSet class="c&<"" timestamp="1" type="t" version="v">
      <Resource displayName="R&D <lab> "A"" references="a&b" uniqueId="id<&">">
         R&D <lab> "A"
         <Property displayName="<"&">" name="Q&">
            Q&
            <Value type="string">x < y & "z"</Value>
         </Property>
      </Resource>
   </ResourceSet>
</com.zor.inventory>)");
}

TEST(Transform_VPD_2_OStream, ResourcesNestedThreeLevelsDeep) {
    Resource port = u_leaf("port1");
    port.insert_Property(Property("LO", "P1-C1-T1"));
    Resource card = u_leaf("card1");
    card.insert_Resource("Ports", port);
    Resource partition = u_leaf("part1");
    partition.insert_Resource("Adapters", card);
    Resource machine = u_leaf("m");
    machine.insert_Resource("Partitions", partition);
    EXPECT_EQ(u_document(u_hardwareSet("1", machine)),
              R"(<?xml version="1.0" encoding="UTF-8"?><com.zor.inventory version="1.0">
   <ResourceSet class="com.zor.inventory.Hardware" timestamp="1" type="Hardware" version="1.0">
      <Resource displayName="m" uniqueId="m">
         m
         <ResourceList displayName="Partitions">
            <Resource displayName="part1" uniqueId="part1">
               part1
               <ResourceList displayName="Adapters">
                  <Resource displayName="card1" uniqueId="card1">
                     card1
                     <ResourceList displayName="Ports">
                        <Resource displayName="port1" uniqueId="port1">
                           port1
                           <Property displayName="Location" name="LO">
                              LO
                              <Value type="string">P1-C1-T1</Value>
                           </Property>
                        </Resource>
                     </ResourceList>
                  </Resource>
               </ResourceList>
            </Resource>
         </ResourceList>
      </Resource>
   </ResourceSet>
</com.zor.inventory>)");
}

TEST(Transform_VPD_2_OStream, LoneResourceStartsAtColumnZeroWithoutDeclarationOrFinalLineFeed) {
    Resource partition("host1", "1234-ABC-10ABCDE-1");
    partition.insert_Property(Property("HN", "host1"));
    partition.insert_Resource("Cards", u_leaf("c"));
    EXPECT_EQ(u_document(partition), R"(<Resource displayName="host1" uniqueId="1234-ABC-10ABCDE-1">
   host1
   <Property displayName="HostName" name="HN">
      HN
      <Value type="string">host1</Value>
   </Property>
   <ResourceList displayName="Cards">
      <Resource displayName="c" uniqueId="c">c</Resource>
   </ResourceList>
</Resource>)");
}

TEST(Transform_VPD_2_OStream, LoneResourceWithOnlyADisplayNameIsOneLine) {
    EXPECT_EQ(u_document(Resource("x", "")), "<Resource displayName=\"x\">x</Resource>");
}

TEST(Transform_VPD_2_OStream, SetWithoutResourceStillWritesAnUnnamedResource) {
    EXPECT_EQ(u_document(ResourceSet()),
              R"(<?xml version="1.0" encoding="UTF-8"?><com.zor.inventory version="1.0">
   <ResourceSet class="" timestamp="" type="" version="">
      <Resource displayName=""></Resource>
   </ResourceSet>
</com.zor.inventory>)");
}

// The document written for a partition that could not be surveyed.
ResourceSet u_failedPartitionSet() {
    Resource partition("host2", "1234-ABC-10ABCDE-2");
    partition.insert_Property(Property("HN", "host2"));
    partition.insert_Property(Property("OS", "Zeph 7.1"));
    partition.insert_Property(Property("PT", "2"));
    partition.insert_Property(Property("SE", "10ABCDE"));
    partition.insert_Property(Property("TM", "1234-ABC"));
    partition.insert_Property(Property("VD", "Partition not surveyed, reason: \nRELAY Failed.\n"
                                             "\n[     Rc] = 1\n[  RcCmd] = 0\n"
                                             "[RetStr1] = timeout\n[RetStr2] = \n\n\n"));
    Resource machine("1234-ABC-10ABCDE", "1234-ABC-10ABCDE");
    machine.insert_Resource("Partitions", partition);
    return u_hardwareSet("1700000000000", machine);
}

// Two lines end in a blank, written here as a separate piece before "\n".
std::string const gc_FailedPartitionDocument =
    R"(<?xml version="1.0" encoding="UTF-8"?><com.zor.inventory version="1.0">
   <ResourceSet class="com.zor.inventory.Hardware" timestamp="1700000000000" type="Hardware" version="1.0">
      <Resource displayName="1234-ABC-10ABCDE" uniqueId="1234-ABC-10ABCDE">
         1234-ABC-10ABCDE
         <ResourceList displayName="Partitions">
            <Resource displayName="host2" uniqueId="1234-ABC-10ABCDE-2">
               host2
               <Property displayName="HostName" name="HN">
                  HN
                  <Value type="string">host2</Value>
               </Property>
               <Property displayName="Operating System" name="OS">
                  OS
                  <Value type="string">Zeph 7.1</Value>
               </Property>
               <Property displayName="Partition ID" name="PT">
                  PT
                  <Value type="string">2</Value>
               </Property>
               <Property displayName="Machine or Cabinet Serial Number" name="SE">
                  SE
                  <Value type="string">10ABCDE</Value>
               </Property>
               <Property displayName="Machine Type-Model" name="TM">
                  TM
                  <Value type="string">1234-ABC</Value>
               </Property>
               <Property displayName="VD" name="VD">
                  VD
                  <Value type="string">Partition not surveyed, reason: )"
    "\n"
    R"(RELAY Failed.

[     Rc] = 1
[  RcCmd] = 0
[RetStr1] = timeout
[RetStr2] = )"
    "\n"
    R"(

</Value>
               </Property>
            </Resource>
         </ResourceList>
      </Resource>
   </ResourceSet>
</com.zor.inventory>)";

TEST(Transform_VPD_2_OStream, DefaultDocumentOfAFailedPartitionHasFortyFiveLines) {
    std::string const document = u_document(u_failedPartitionSet());
    EXPECT_EQ(document, gc_FailedPartitionDocument);
    EXPECT_EQ(std::count(document.begin(), document.end(), '\n'), 44);
}

TEST(Transform_VPD_2_OStream, ValueEndTagAfterLineFeedsInTheTextStartsAtColumnZero) {
    std::string const document = u_document(u_failedPartitionSet());
    EXPECT_NE(document.find("\n\n\n</Value>\n"), std::string::npos);
}

TEST(Transform_VPD_2_OStream, FileHoldsExactlyTheDocument) {
    std::string const path = ::testing::TempDir() + "vpd_2_ostream_document.xml";
    {
        std::ofstream file(path, std::ios::out | std::ios::trunc | std::ios::binary);
        Transform::VPD_2_OStream{file}(u_failedPartitionSet());
    }
    std::ifstream file(path, std::ios::binary);
    std::string const written((std::istreambuf_iterator<char>(file)),
                              std::istreambuf_iterator<char>());
    std::remove(path.c_str());
    EXPECT_EQ(written, gc_FailedPartitionDocument);
}

TEST(Transform_VPD_2_OStream, ReturnsTheStream) {
    std::ostringstream out;
    Transform::VPD_2_OStream write(out);
    EXPECT_EQ(&write(ResourceSet()), &out);
    EXPECT_EQ(&write(Resource()), &out);
}

} // namespace
