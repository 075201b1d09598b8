#include "survey/Quorvex_PYLON_VPD_Survey_ClientPartition_Utility.h"

#include "relay/ReturnCode.h"
#include "system/MTMS.h"
#include "system/Partition.h"
#include "transform/VPD_2_OStream.h"
#include "vpd/Property.h"
#include "vpd/Resource.h"
#include "vpd/ResourceList.h"
#include "vpd/ResourceSet.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>
#include <sstream>
#include <stdexcept>
#include <string>
#include <vector>

namespace {

namespace Survey_Utility = ::Quorvex_PYLON_VPD_Survey_ClientPartition_Utility;

Quorvex::System::Partition u_make_Partition(std::string const& identity, std::string const& id,
                                            std::string const& hostName) {
    Quorvex::System::Partition partition(Quorvex::System::MTMS(identity), id, hostName);
    partition.set_IP("10.1.1.12");
    partition.set_ActiveStatus("3");
    partition.set_OperatingSystem_Name("Zeph");
    partition.set_OperatingSystem_Version("7.1");
    return partition;
}

unsigned int u_read_ActiveStatus(std::string const& text) {
    Quorvex::System::Partition partition;
    partition.set_ActiveStatus(text);
    return Survey_Utility::_u_get_ActiveStatus(partition);
}

// The keywords of a resource's properties, in their order.
std::vector<std::string> u_get_Keywords(Quorvex::VPD::Resource const& resource) {
    std::vector<std::string> keywords;
    std::transform(resource.get_ListOf_Properties().begin(), resource.get_ListOf_Properties().end(),
                   std::back_inserter(keywords),
                   [](auto const& entry) { return entry.second.get_Keyword(); });
    return keywords;
}

// The one partition resource of a default document's "Partitions" list.
Quorvex::VPD::Resource const& u_get_PartitionResource(Quorvex::VPD::ResourceSet const& set) {
    Quorvex::VPD::ResourceList const& list =
        set.get_Resource().get_ListOf_ResourceLists().find("Partitions");
    return list.begin()->second;
}

constexpr char gc_ChannelFailureReason[] = "Partition not surveyed, reason: \n"
                                           "RELAY Failed.\n"
                                           "\n[     Rc] = 1\n[  RcCmd] = 0\n"
                                           "[RetStr1] = timeout\n[RetStr2] = \n\n\n";

TEST(Survey_ClientPartition_Utility, ActiveStatusOfABlankThenThreeReadsThree) {
    EXPECT_EQ(u_read_ActiveStatus(" 3"), 3u);
}

TEST(Survey_ClientPartition_Utility, ActiveStatusOfLettersReadsZero) {
    EXPECT_EQ(u_read_ActiveStatus("abc"), 0u);
}

TEST(Survey_ClientPartition_Utility, EmptyActiveStatusReadsZero) {
    EXPECT_EQ(u_read_ActiveStatus(""), 0u);
}

TEST(Survey_ClientPartition_Utility, ActiveStatusOfBlanksOnlyReadsZero) {
    EXPECT_EQ(u_read_ActiveStatus("   "), 0u);
}

TEST(Survey_ClientPartition_Utility, ActiveStatusReadingStopsAtTheFirstNonDigit) {
    EXPECT_EQ(u_read_ActiveStatus("3abc"), 3u);
    EXPECT_EQ(u_read_ActiveStatus("12 7"), 12u);
}

TEST(Survey_ClientPartition_Utility, ActiveStatusWithSignsFollowsTheUnsignedStreamReading) {
    EXPECT_EQ(u_read_ActiveStatus("+3"), 3u);
    EXPECT_EQ(u_read_ActiveStatus("-1"), 4294967295u);
}

TEST(Survey_ClientPartition_Utility, ActiveStatusReadsWhatAnUnsignedStreamReads) {
    std::vector<std::string> const texts = {"0",
                                            "007",
                                            " \t\n\v\f\r5",
                                            "-0",
                                            "-4294967295",
                                            "-4294967296",
                                            "+",
                                            "-",
                                            "- 5",
                                            "+-3",
                                            "99999999999999999999",
                                            std::string("3\0"
                                                        "4",
                                                        3),
                                            std::string("\0"
                                                        "3",
                                                        2),
                                            "12345678901",
                                            "4294967295x"};
    for (std::string const& text : texts) {
        std::istringstream stream(text);
        unsigned int expected = 0;
        if (!(stream >> expected)) {
            expected = 0;
        }
        EXPECT_EQ(u_read_ActiveStatus(text), expected) << '"' << text << '"';
    }
}

TEST(Survey_ClientPartition_Utility, ActiveStatusBeyondThirtyTwoBitsReadsZero) {
    EXPECT_EQ(u_read_ActiveStatus("4294967296"), 0u);
    EXPECT_EQ(u_read_ActiveStatus("4294967295"), 4294967295u);
}

TEST(Survey_ClientPartition_Utility, ReturnCodeTextIsItsPairsBetweenLineEnds) {
    Quorvex::RELAY::ReturnCode const returnCode("Rc::1::RcCmd::0::RetStr1::timeout::RetStr2::");
    EXPECT_EQ(Survey_Utility::u_transform_RELAY_ReturnCode_2_String(returnCode),
              "\n[     Rc] = 1\n[  RcCmd] = 0\n[RetStr1] = timeout\n[RetStr2] = \n\n\n");
}

TEST(Survey_ClientPartition_Utility, EmptyReturnCodeTextIsThreeLineEnds) {
    EXPECT_EQ(Survey_Utility::u_transform_RELAY_ReturnCode_2_String(Quorvex::RELAY::ReturnCode()),
              "\n\n\n");
}

TEST(Survey_ClientPartition_Utility, ReturnCodeTextListsKeysInByteOrder) {
    Quorvex::RELAY::ReturnCode const returnCode("b::2::Rc::0::a::1");
    EXPECT_EQ(Survey_Utility::u_transform_RELAY_ReturnCode_2_String(returnCode),
              "\n[Rc] = 0\n[ a] = 1\n[ b] = 2\n\n\n");
}

TEST(Survey_ClientPartition_Utility, DefaultSetHasHardwareAttributesAndTheMachineAsResource) {
    Quorvex::VPD::ResourceSet set;
    Survey_Utility::u_create_VPD_ResourceSet_forFailedPartition(
        u_make_Partition("1234-ABC_10ABCDE", "2", "host2"), "why", set);
    EXPECT_EQ(set.get_Class(), "com.zor.inventory.Hardware");
    EXPECT_EQ(set.get_Type(), "Hardware");
    EXPECT_EQ(set.get_Version(), "1.0");
    EXPECT_EQ(set.get_Resource().get_DisplayName(), "1234-ABC-10ABCDE");
    EXPECT_EQ(set.get_Resource().get_UniqueID(), "1234-ABC-10ABCDE");
    EXPECT_EQ(set.get_NumberOf_ResourceLists(), 0u);
    ASSERT_EQ(set.get_Resource().get_NumberOf_ResourceLists(), 1u);
    ASSERT_TRUE(set.get_Resource().has_ResourceList("Partitions"));
    EXPECT_EQ(set.get_Resource().get_ListOf_ResourceLists().find("Partitions").size(), 1u);
}

TEST(Survey_ClientPartition_Utility, PartitionResourceCarriesItsRecordAndTheReason) {
    Quorvex::VPD::ResourceSet set;
    Survey_Utility::u_create_VPD_ResourceSet_forFailedPartition(
        u_make_Partition("1234-ABC_10ABCDE", "2", "host2"), gc_ChannelFailureReason, set);
    Quorvex::VPD::Resource const& partition = u_get_PartitionResource(set);
    EXPECT_EQ(partition.get_DisplayName(), "host2");
    EXPECT_EQ(partition.get_UniqueID(), "1234-ABC-10ABCDE-2");
    Quorvex::VPD::ListOf_Properties const& properties = partition.get_ListOf_Properties();
    EXPECT_EQ(properties.find("HN").get_Value(), "host2");
    EXPECT_EQ(properties.find("OS").get_Value(), "Zeph 7.1");
    EXPECT_EQ(properties.find("PT").get_Value(), "2");
    EXPECT_EQ(properties.find("SE").get_Value(), "10ABCDE");
    EXPECT_EQ(properties.find("TM").get_Value(), "1234-ABC");
    EXPECT_EQ(properties.find("VD").get_Value(), gc_ChannelFailureReason);
}

TEST(Survey_ClientPartition_Utility, ReasonIsAlwaysTheLastPropertyOfThePartition) {
    Quorvex::VPD::ResourceSet set;
    Survey_Utility::u_create_VPD_ResourceSet_forFailedPartition(
        u_make_Partition("1234-ABC_10ABCDE", "2", "host2"), "why", set);
    std::vector<std::string> const keywords = u_get_Keywords(u_get_PartitionResource(set));
    ASSERT_FALSE(keywords.empty());
    EXPECT_EQ(keywords.back(), "VD");
    EXPECT_EQ(keywords, (std::vector<std::string>{"HN", "OS", "PT", "SE", "TM", "VD"}));
}

TEST(Survey_ClientPartition_Utility, PartitionWithoutHostNameIsNamedByItsIdentityText) {
    Quorvex::VPD::ResourceSet set;
    Survey_Utility::u_create_VPD_ResourceSet_forFailedPartition(
        u_make_Partition("1234-ABC_10ABCDE", "7", ""), "why", set);
    Quorvex::VPD::Resource const& partition = u_get_PartitionResource(set);
    EXPECT_EQ(partition.get_DisplayName(), "1234-ABC-10ABCDE-7");
    EXPECT_EQ(partition.get_ListOf_Properties().find("HN").get_Value(), "");
}

TEST(Survey_ClientPartition_Utility, ReasonWithMarkupCharactersIsStoredUnchanged) {
    Quorvex::VPD::ResourceSet set;
    Survey_Utility::u_create_VPD_ResourceSet_forFailedPartition(
        u_make_Partition("1234-ABC_10ABCDE", "2", "a&b"), "<\"&>", set);
    Quorvex::VPD::Resource const& partition = u_get_PartitionResource(set);
    EXPECT_EQ(partition.get_DisplayName(), "a&b");
    EXPECT_EQ(partition.get_ListOf_Properties().find("VD").get_Value(), "<\"&>");
}

TEST(Survey_ClientPartition_Utility, IdentityWithoutDashInTypeModelThrowsOutOfRange) {
    Quorvex::VPD::ResourceSet set;
    EXPECT_THROW(Survey_Utility::u_create_VPD_ResourceSet_forFailedPartition(
                     u_make_Partition("1234MMA_10ABCDE", "2", "host2"), "why", set),
                 std::out_of_range);
}

TEST(Survey_ClientPartition_Utility, DefaultDocumentOfAChannelFailureIsWrittenExactly) {
    Quorvex::VPD::ResourceSet set;
    Survey_Utility::u_create_VPD_ResourceSet_forFailedPartition(
        u_make_Partition("1234-ABC_10ABCDE", "2", "host2"), gc_ChannelFailureReason, set);
    set.set_TimeStamp("1700000000000");
    std::ostringstream document;
    Transform::VPD_2_OStream{document}(set);
    EXPECT_EQ(document.str(),
              "<?xml version=\"1.0\" encoding=\"UTF-8\"?><com.zor.inventory version=\"1.0\">\n"
              "   <ResourceSet class=\"com.zor.inventory.Hardware\" timestamp=\"1700000000000\" "
              "type=\"Hardware\" version=\"1.0\">\n"
              "      <Resource displayName=\"1234-ABC-10ABCDE\" uniqueId=\"1234-ABC-10ABCDE\">\n"
              "         1234-ABC-10ABCDE\n"
              "         <ResourceList displayName=\"Partitions\">\n"
              "            <Resource displayName=\"host2\" uniqueId=\"1234-ABC-10ABCDE-2\">\n"
              "               host2\n"
              "               <Property displayName=\"HostName\" name=\"HN\">\n"
              "                  HN\n"
              "                  <Value type=\"string\">host2</Value>\n"
              "               </Property>\n"
              "               <Property displayName=\"Operating System\" name=\"OS\">\n"
              "                  OS\n"
              "                  <Value type=\"string\">Zeph 7.1</Value>\n"
              "               </Property>\n"
              "               <Property displayName=\"Partition ID\" name=\"PT\">\n"
              "                  PT\n"
              "                  <Value type=\"string\">2</Value>\n"
              "               </Property>\n"
              "               <Property displayName=\"Machine or Cabinet Serial Number\" "
              "name=\"SE\">\n"
              "                  SE\n"
              "                  <Value type=\"string\">10ABCDE</Value>\n"
              "               </Property>\n"
              "               <Property displayName=\"Machine Type-Model\" name=\"TM\">\n"
              "                  TM\n"
              "                  <Value type=\"string\">1234-ABC</Value>\n"
              "               </Property>\n"
              "               <Property displayName=\"VD\" name=\"VD\">\n"
              "                  VD\n"
              "                  <Value type=\"string\">Partition not surveyed, reason: \n"
              "RELAY Failed.\n"
              "\n"
              "[     Rc] = 1\n"
              "[  RcCmd] = 0\n"
              "[RetStr1] = timeout\n"
              "[RetStr2] = \n"
              "\n"
              "\n"
              "</Value>\n"
              "               </Property>\n"
              "            </Resource>\n"
              "         </ResourceList>\n"
              "      </Resource>\n"
              "   </ResourceSet>\n"
              "</com.zor.inventory>");
}

} // namespace
