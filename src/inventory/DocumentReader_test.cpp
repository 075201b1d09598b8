#include "inventory/DocumentReader.h"

#include "QuorvexTest.h"
#include "survey/Quorvex_PYLON_VPD_Survey_ClientPartition_Utility.h"
#include "transform/VPD_2_OStream.h"
#include "utility/SystemError.h"
#include "vpd/ResourceList.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <random>
#include <sstream>
#include <string>
#include <vector>

namespace {

using inventory::Component;
using inventory::ComponentKey;
using inventory::DocumentReading;
using inventory::Keyword;
using inventory::readDocument;
using Quorvex::VPD::Property;
using Quorvex::VPD::PropertyGroup;
using Quorvex::VPD::Resource;
using Quorvex::VPD::ResourceSet;

std::string written(Resource const& machine) {
    ResourceSet set("com.zor.inventory.Hardware", "Hardware", "1.0", "1700000000000");
    set.set_Resource(machine);
    std::ostringstream out;
    Transform::VPD_2_OStream{out}(set);
    return out.str();
}

Resource adapter(std::string const& name, std::string const& serial, std::string const& location) {
    Resource resource(name, "1234-ABC-10ABCDE-1-" + name);
    resource.insert_Property(Property("PN", "01FT739"));
    resource.insert_Property(Property("SN", serial));
    resource.insert_Property(Property("YL", location));
    return resource;
}

// A partition as a client surveys it: its own keywords, two adapters and a
// memory module.
Resource partitionWith(std::string const& hostName, std::string const& operatingSystem) {
    Resource partition(hostName, "1234-ABC-10ABCDE-1");
    partition.insert_Property(Property("CL", "FW950.80"));
    partition.insert_Property(Property("HN", hostName));
    partition.insert_Property(Property("OS", operatingSystem));
    partition.insert_Resource("Adapters", adapter("ent0", "Y050BG52D018", "U78D5.ND1-P1-C6-T1"));
    partition.insert_Resource("Adapters", adapter("fcs0", "YA50HG5CU0B3", "U78D5.ND1-P1-C3-T1"));
    Resource memory("DIMM-C17", "1234-ABC-10ABCDE-1-DIMM-C17");
    memory.insert_Property(Property("SZ", "64GB"));
    memory.insert_Property(Property("YL", "U78D5.ND1-P1-C17"));
    partition.insert_Resource("Memory", memory);
    return partition;
}

Resource machineWith(Resource const& partition) {
    Resource machine("1234-ABC-10ABCDE", "1234-ABC-10ABCDE");
    machine.insert_Resource("Partitions", partition);
    return machine;
}

std::string inventoryDocument(std::string const& hostName = "aurora",
                              std::string const& operatingSystem = "Zeph 7.2") {
    return written(machineWith(partitionWith(hostName, operatingSystem)));
}

std::string defaultDocument(std::string const& reason) {
    ResourceSet set;
    Quorvex_PYLON_VPD_Survey_ClientPartition_Utility::u_create_VPD_ResourceSet_forFailedPartition(
        QuorvexTest::examplePartition("1"), reason, set);
    std::ostringstream out;
    Transform::VPD_2_OStream{out}(set);
    return out.str();
}

std::vector<std::string> identities(DocumentReading const& reading) {
    std::vector<std::string> result(reading.components.size());
    std::transform(reading.components.begin(), reading.components.end(), result.begin(),
                   [](Component const& component) { return component.key.identity(); });
    return result;
}

Component const& componentNamed(DocumentReading const& reading, std::string const& name) {
    auto const found =
        std::find_if(reading.components.begin(), reading.components.end(),
                     [&name](Component const& component) { return component.displayName == name; });
    if (found == reading.components.end()) {
        throw std::runtime_error("no component " + name);
    }
    return *found;
}

unsigned long linesOf(std::string const& text) {
    return static_cast<unsigned long>(std::count(text.begin(), text.end(), '\n')) + 1;
}

std::string e2eDocument(std::string const& scenario, std::string const& name) {
    return QuorvexTest::readFile(QuorvexTest::sourceRoot() + "/tests/e2e/scenarios/" + scenario +
                                 "/expected/VPD/quorvexPYLON_VPD_Survey_ClientPartition_" + name);
}

TEST(InventoryDocumentReader, WrittenDocumentGivesEveryResourceInDocumentOrder) {
    DocumentReading const reading = readDocument(inventoryDocument());
    EXPECT_FALSE(reading.isUnreadable()) << reading.unreadableText();
    EXPECT_EQ(DocumentReading::Kind::Inventory, reading.kind);
    EXPECT_EQ(
        (std::vector<std::string>{"1234-ABC-10ABCDE", "1234-ABC-10ABCDE-1", "U78D5.ND1-P1-C6-T1",
                                  "U78D5.ND1-P1-C3-T1", "U78D5.ND1-P1-C17"}),
        identities(reading));
    EXPECT_EQ("", reading.unreadableText());
}

TEST(InventoryDocumentReader, KeywordsComeInDocumentOrderWithDisplayNamesAndValues) {
    DocumentReading const reading = readDocument(inventoryDocument());
    EXPECT_EQ((std::vector<Keyword>{{"PN", "PartNumber of assembly", "01FT739", ""},
                                    {"SN", "Serial Number", "Y050BG52D018", ""},
                                    {"YL", "Hardware Location Code", "U78D5.ND1-P1-C6-T1", ""}}),
              componentNamed(reading, "ent0").keywords);
    EXPECT_EQ("FW950.80", componentNamed(reading, "aurora").valueOf("CL"));
}

TEST(InventoryDocumentReader, ComponentsKnowTheirListAndTheResourceHoldingThem) {
    DocumentReading const reading = readDocument(inventoryDocument());
    Component const& machine = reading.components[0];
    Component const& partition = reading.components[1];
    Component const& memory = componentNamed(reading, "DIMM-C17");
    EXPECT_EQ("", machine.list);
    EXPECT_FALSE(machine.parent.has_value());
    EXPECT_EQ("Partitions", partition.list);
    EXPECT_EQ(0u, partition.parent);
    EXPECT_EQ("Memory", memory.list);
    EXPECT_EQ(1u, memory.parent);
    EXPECT_EQ("1234-ABC-10ABCDE-1-DIMM-C17", memory.uniqueId);
}

TEST(InventoryDocumentReader, LocationCodeKeysAComponentAndUniqueIdOneWithout) {
    DocumentReading const reading = readDocument(inventoryDocument());
    EXPECT_EQ((ComponentKey{ComponentKey::Kind::LocationCode, "U78D5.ND1-P1-C3-T1", 1}),
              componentNamed(reading, "fcs0").key);
    EXPECT_EQ((ComponentKey{ComponentKey::Kind::UniqueId, "1234-ABC-10ABCDE-1", 1}),
              componentNamed(reading, "aurora").key);
}

TEST(InventoryDocumentReader, ShippedSimulatedDocumentReadsWhole) {
    DocumentReading const reading = inventory::readDocumentFile(
        QuorvexTest::sourceRoot() + "/sim/scenarios/documents/aurora.VPD.xml");
    EXPECT_FALSE(reading.isUnreadable()) << reading.unreadableText();
    ASSERT_EQ(7u, reading.components.size());
    EXPECT_EQ("U78D5.ND1.CSS5G2T-P1-C18", reading.components[6].key.text);
    EXPECT_EQ("YH10MU6AL055", reading.components[6].valueOf("SN"));
}

TEST(InventoryDocumentReader, DefaultDocumentIsRecognisedAndGivesNoComponents) {
    DocumentReading const reading = readDocument(defaultDocument("Partition not surveyed"));
    EXPECT_TRUE(reading.isDefaultDocument());
    EXPECT_FALSE(reading.isUnreadable()) << reading.unreadableText();
    EXPECT_TRUE(reading.components.empty());
    EXPECT_EQ("Partition not surveyed", reading.failureReason);
}

TEST(InventoryDocumentReader, DefaultDocumentWithMarkupInHostAndReasonIsRecognisedWhole) {
    DocumentReading const reading =
        readDocument(e2eDocument("markup-characters", "1234-ABC_10ABCDE-1.VPD.xml"));
    EXPECT_TRUE(reading.isDefaultDocument());
    EXPECT_FALSE(reading.isUnreadable()) << reading.unreadableText();
    EXPECT_EQ("Partition not surveyed, reason: \nRELAY Failed.\n\n[     Rc] = 1\n[  RcCmd] = 0\n"
              "[RetStr1] = cannot <reach> \"a&b\"\n[RetStr2] = &amp;\n\n\n",
              reading.failureReason);
}

TEST(InventoryDocumentReader, DefaultDocumentCutInItsReasonKeepsTheReasonReadSoFar) {
    std::string const document = defaultDocument("first line\nsecond line");
    DocumentReading const reading = readDocument(document.substr(0, document.find("\nsecond")));
    EXPECT_TRUE(reading.isDefaultDocument());
    EXPECT_TRUE(reading.isUnreadable());
    EXPECT_EQ("first line", reading.failureReason);
}

TEST(InventoryDocumentReader, BareAmpersandInValueIsReadAsWritten) {
    DocumentReading const reading = readDocument(inventoryDocument("aurora", "Zeph & Co"));
    EXPECT_FALSE(reading.isUnreadable()) << reading.unreadableText();
    EXPECT_EQ("Zeph & Co", componentNamed(reading, "aurora").valueOf("OS"));
}

TEST(InventoryDocumentReader, BareLessThanInValueIsReadAsWritten) {
    DocumentReading const reading = readDocument(inventoryDocument("aurora", "Zeph <7> < 8"));
    EXPECT_FALSE(reading.isUnreadable()) << reading.unreadableText();
    EXPECT_EQ("Zeph <7> < 8", componentNamed(reading, "aurora").valueOf("OS"));
}

TEST(InventoryDocumentReader, ValueThatLooksLikeTheDocumentsOwnTagsIsReadAsWritten) {
    DocumentReading const reading =
        readDocument(inventoryDocument("aurora", "<Resource> </Property> </Value>"));
    EXPECT_FALSE(reading.isUnreadable()) << reading.unreadableText();
    EXPECT_EQ("<Resource> </Property> </Value>", componentNamed(reading, "aurora").valueOf("OS"));
}

TEST(InventoryDocumentReader, MarkupAndQuotesInAttributesAreReadAsWritten) {
    DocumentReading const reading = readDocument(inventoryDocument("a&b<c\"d\">e", "Zeph"));
    EXPECT_FALSE(reading.isUnreadable()) << reading.unreadableText();
    EXPECT_EQ("a&b<c\"d\">e", reading.components.at(1).displayName);
    EXPECT_EQ("a&b<c\"d\">e", reading.components.at(1).valueOf("HN"));
}

TEST(InventoryDocumentReader, HostNameThatLooksLikeTheDocumentsOwnTagsIsReadAsWritten) {
    std::string const hostName = R"(  <Property name="x"><Value type="string">)";
    DocumentReading const reading = readDocument(inventoryDocument(hostName, "Zeph"));
    EXPECT_FALSE(reading.isUnreadable()) << reading.unreadableText();
    EXPECT_EQ(hostName, reading.components.at(1).displayName);
    EXPECT_EQ(hostName, reading.components.at(1).valueOf("HN"));
    EXPECT_EQ(3u, reading.components.at(1).keywords.size());
}

TEST(InventoryDocumentReader, TextThatLooksEscapedIsTakenAsWritten) {
    DocumentReading const reading = readDocument(inventoryDocument("aurora", "&amp; &#60; &lt;"));
    EXPECT_EQ("&amp; &#60; &lt;", componentNamed(reading, "aurora").valueOf("OS"));
}

TEST(InventoryDocumentReader, HugeValueIsReadWhole) {
    std::string const huge(5 * 1024 * 1024 + 17, 'x');
    DocumentReading const reading = readDocument(inventoryDocument("aurora", huge + "&<"));
    EXPECT_FALSE(reading.isUnreadable()) << reading.unreadableText();
    EXPECT_EQ(huge + "&<", componentNamed(reading, "aurora").valueOf("OS"));
    EXPECT_EQ(5u, reading.components.size());
}

TEST(InventoryDocumentReader, ResourceWithoutKeywordsHasNone) {
    Resource partition("bare", "1234-ABC-10ABCDE-9");
    partition.insert_Resource("Adapters", Resource("ent9", ""));
    DocumentReading const reading = readDocument(written(machineWith(partition)));
    EXPECT_FALSE(reading.isUnreadable()) << reading.unreadableText();
    EXPECT_TRUE(componentNamed(reading, "bare").keywords.empty());
    EXPECT_EQ(std::nullopt, componentNamed(reading, "bare").valueOf("SN"));
    EXPECT_EQ((ComponentKey{ComponentKey::Kind::DisplayName, "ent9", 1}),
              componentNamed(reading, "ent9").key);
}

TEST(InventoryDocumentReader, PropertyWithoutValueHasAnEmptyValue) {
    std::string document = inventoryDocument();
    std::string const value = "<Value type=\"string\">FW950.80</Value>";
    document.erase(document.find(value), value.size());
    DocumentReading const reading = readDocument(document);
    EXPECT_FALSE(reading.isUnreadable()) << reading.unreadableText();
    EXPECT_EQ("", componentNamed(reading, "aurora").valueOf("CL"));
}

// The writer writes one value per property: what looks like a second one is
// the text of the first, which runs to the end tag before the property's.
TEST(InventoryDocumentReader, ValueRunsToTheEndTagBeforeThePropertysEnd) {
    DocumentReading const reading = readDocument(
        "<com.zor.inventory>\n<Resource displayName=\"r\">\n<Property name=\"SN\">\n"
        "<Value type=\"string\">ab</Value>\n<Value type=\"string\">cd</Value>\n</Property>\n"
        "</Resource>\n</com.zor.inventory>");
    EXPECT_FALSE(reading.isUnreadable()) << reading.unreadableText();
    EXPECT_EQ("ab</Value>\n<Value type=\"string\">cd", componentNamed(reading, "r").valueOf("SN"));
}

TEST(InventoryDocumentReader, EmptyElementFormsRead) {
    DocumentReading const reading =
        readDocument("<com.zor.inventory>\n<Resource displayName=\"r\" uniqueId=\"u\"/>\n"
                     "<Resource displayName=\"s\">\n<Property name=\"SN\">\n"
                     "<Value type=\"string\"/>\n</Property>\n</Resource>\n</com.zor.inventory>");
    EXPECT_FALSE(reading.isUnreadable()) << reading.unreadableText();
    EXPECT_EQ((std::vector<std::string>{"u", "s"}), identities(reading));
    EXPECT_EQ("", componentNamed(reading, "s").valueOf("SN"));
}

TEST(InventoryDocumentReader, PropertyOutsideAnyResourceIsIgnored) {
    DocumentReading const reading = readDocument(
        "<com.zor.inventory>\n<Property name=\"VD\">\n<Value type=\"string\">x</Value>\n"
        "</Property>\n</com.zor.inventory>");
    EXPECT_FALSE(reading.isUnreadable()) << reading.unreadableText();
    EXPECT_EQ(DocumentReading::Kind::Inventory, reading.kind);
    EXPECT_TRUE(reading.components.empty());
}

TEST(InventoryDocumentReader, DuplicateLocationCodesAreNumberedInDocumentOrder) {
    Resource partition("twins", "1234-ABC-10ABCDE-2");
    partition.insert_Resource("Adapters", adapter("ent0", "A1", "U1-P1-C1"));
    partition.insert_Resource("Adapters", adapter("ent1", "A2", "U1-P1-C1"));
    DocumentReading const reading = readDocument(written(machineWith(partition)));
    EXPECT_EQ((std::vector<std::string>{"1234-ABC-10ABCDE", "1234-ABC-10ABCDE-2", "U1-P1-C1",
                                        "U1-P1-C1 #2"}),
              identities(reading));
    EXPECT_EQ("A2", componentNamed(reading, "ent1").valueOf("SN"));
}

TEST(InventoryDocumentReader, PropertyGroupKeywordsBelongToTheirResourceWithTheGroup) {
    Resource machine("m", "m");
    PropertyGroup memory("Memory");
    memory.insert(Property("SZ", "4096"));
    machine.insert_PropertyGroup(memory);
    machine.insert_PropertyGroup(PropertyGroup("Empty"));
    DocumentReading const reading = readDocument(written(machine));
    EXPECT_FALSE(reading.isUnreadable()) << reading.unreadableText();
    ASSERT_EQ(1u, reading.components.size());
    EXPECT_EQ((std::vector<Keyword>{{"SZ", "Size", "4096", "Memory"}}),
              reading.components[0].keywords);
}

TEST(InventoryDocumentReader, EmptyResourceListAndOneLineResourceRead) {
    Resource machine("m", "m");
    machine.insert_Resource("Adapters", Resource("leaf\">x", "u"));
    DocumentReading const reading = readDocument(written(machine));
    EXPECT_FALSE(reading.isUnreadable()) << reading.unreadableText();
    ASSERT_EQ(2u, reading.components.size());
    EXPECT_EQ("leaf\">x", reading.components[1].displayName);
    EXPECT_EQ("u", reading.components[1].uniqueId);
}

// Cut at every kind of place: in the declaration, in a begin tag, in an
// attribute value, in a value, between elements, before the last end tag.
TEST(InventoryDocumentReader, TruncatedDocumentIsReadAsFarAsItGoes) {
    std::string const document = inventoryDocument();
    for (std::string const& cutBefore :
         {std::string("encoding"), std::string("Resource displayName=\"1234"),
          std::string("BG52D018"), std::string("FW950"), std::string("\n   </ResourceSet>"),
          std::string("</com.zor.inventory>")}) {
        std::string const cut = document.substr(0, document.find(cutBefore));
        DocumentReading const reading = readDocument(cut);
        ASSERT_TRUE(reading.isUnreadable()) << cutBefore;
        EXPECT_EQ(linesOf(cut), reading.stop->line) << cutBefore;
        EXPECT_EQ(0u, reading.unreadableText().rfind(
                          "document unreadable at line " + std::to_string(linesOf(cut)) + ": ", 0))
            << reading.unreadableText();
    }
}

TEST(InventoryDocumentReader, TruncatedDocumentKeepsTheComponentsBeforeTheCut) {
    std::string const document = inventoryDocument();
    DocumentReading const reading = readDocument(document.substr(0, document.find("fcs0")));
    EXPECT_EQ("document unreadable at line " +
                  std::to_string(linesOf(document.substr(0, document.find("fcs0")))) +
                  ": not well-formed (invalid token)",
              reading.unreadableText());
    EXPECT_EQ(
        (std::vector<std::string>{"1234-ABC-10ABCDE", "1234-ABC-10ABCDE-1", "U78D5.ND1-P1-C6-T1"}),
        identities(reading));
}

TEST(InventoryDocumentReader, DocumentCutInAValueDropsOnlyThatKeyword) {
    std::string const document = inventoryDocument();
    DocumentReading const reading = readDocument(document.substr(0, document.find("BG52D018")));
    ASSERT_TRUE(reading.isUnreadable());
    EXPECT_EQ((std::vector<Keyword>{{"PN", "PartNumber of assembly", "01FT739", ""}}),
              componentNamed(reading, "ent0").keywords);
}

TEST(InventoryDocumentReader, DeclarationCutShortIsUnreadable) {
    EXPECT_EQ("document unreadable at line 1: unclosed token",
              readDocument("<?xml version=\"1.0\"").unreadableText());
}

TEST(InventoryDocumentReader, EmptyDocumentIsUnreadableAtLineOne) {
    EXPECT_EQ("document unreadable at line 1: no element found", readDocument("").unreadableText());
}

TEST(InventoryDocumentReader, PlainTextIsUnreadable) {
    DocumentReading const reading = readDocument("Partition list:\nnothing here\n");
    EXPECT_EQ("document unreadable at line 1: syntax error", reading.unreadableText());
    EXPECT_TRUE(reading.components.empty());
}

TEST(InventoryDocumentReader, OtherXmlDocumentIsNotAnInventoryDocument) {
    DocumentReading const reading = readDocument("<?xml version=\"1.0\"?>\n<Value>1</Value>\n");
    EXPECT_EQ("document unreadable at line 2: not an inventory document: its root element is "
              "<Value>",
              reading.unreadableText());
}

TEST(InventoryDocumentReader, OtherXmlDocumentOfOneEmptyElementIsNotAnInventoryDocument) {
    EXPECT_EQ("document unreadable at line 1: not an inventory document: its root element is "
              "<Resource>",
              readDocument("<Resource/>").unreadableText());
}

TEST(InventoryDocumentReader, BytesThatAreNotUtf8StopTheReadingAtTheirLine) {
    std::string const document = inventoryDocument("aurora", "Zeph \xff");
    DocumentReading const reading = readDocument(document);
    EXPECT_EQ("document unreadable at line " +
                  std::to_string(linesOf(document.substr(0, document.find('\xff')))) +
                  ": not well-formed (invalid token)",
              reading.unreadableText());
    EXPECT_EQ("FW950.80", componentNamed(reading, "aurora").valueOf("CL"));
}

TEST(InventoryDocumentReader, DeclaredEntitiesAreNeverExpanded) {
    DocumentReading const reading =
        readDocument("<!DOCTYPE x [<!ENTITY e \"boom\">]>\n<com.zor.inventory>&e;"
                     "</com.zor.inventory>");
    EXPECT_TRUE(reading.isUnreadable());
    EXPECT_TRUE(reading.components.empty());
}

TEST(InventoryDocumentReader, RandomBytesAreUnreadableNeverACrash) {
    std::mt19937 generator(20261124);
    std::uniform_int_distribution<int> byte(0, 255);
    for (int round = 0; round < 200; ++round) {
        std::string bytes(static_cast<std::size_t>(round * 7), '\0');
        std::generate(bytes.begin(), bytes.end(),
                      [&] { return static_cast<char>(byte(generator)); });
        DocumentReading const reading = readDocument(bytes);
        EXPECT_TRUE(reading.isUnreadable()) << round;
        // Expat counts a carriage return as a line end too.
        auto const lineEnds = std::count_if(bytes.begin(), bytes.end(),
                                            [](char c) { return c == '\n' || c == '\r'; });
        EXPECT_LE(reading.stop->line, static_cast<unsigned long>(lineEnds) + 1) << round;
    }
}

std::string inFolder(std::string folder, std::string const& name) {
    folder += '/';
    folder += name;
    return folder;
}

// The documents the end-to-end scenarios expect the survey tool to write or
// fetch.
std::vector<std::string> scenarioDocuments() {
    std::vector<std::string> documents;
    std::string const scenarios = QuorvexTest::sourceRoot() + "/tests/e2e/scenarios";
    for (std::string const& scenario : QuorvexTest::listFolder(scenarios)) {
        std::string const folder = inFolder(inFolder(scenarios, scenario), "expected/VPD");
        if (!QuorvexTest::fileExists(folder)) {
            continue;
        }
        for (std::string const& name : QuorvexTest::listFolder(folder)) {
            if (name.size() > 8 && name.compare(name.size() - 8, 8, ".VPD.xml") == 0) {
                documents.push_back(inFolder(folder, name));
            }
        }
    }
    return documents;
}

TEST(InventoryDocumentReader, EveryDefaultDocumentOfTheScenariosIsRecognisedAndReadWhole) {
    unsigned defaults = 0;
    for (std::string const& path : scenarioDocuments()) {
        if (QuorvexTest::readFile(path).find("name=\"VD\"") == std::string::npos) {
            continue;
        }
        DocumentReading const reading = inventory::readDocumentFile(path);
        EXPECT_TRUE(reading.isDefaultDocument()) << path;
        EXPECT_FALSE(reading.isUnreadable()) << path << ": " << reading.unreadableText();
        EXPECT_FALSE(reading.failureReason.empty()) << path;
        ++defaults;
    }
    EXPECT_LT(20u, defaults);
}

TEST(InventoryDocumentReader, EveryClientDocumentOfTheSimulatedConsoleReadsWhole) {
    for (std::string const& name :
         QuorvexTest::listFolder(QuorvexTest::sourceRoot() + "/sim/scenarios/documents")) {
        DocumentReading const reading = inventory::readDocumentFile(
            QuorvexTest::sourceRoot() + "/sim/scenarios/documents/" + name);
        EXPECT_EQ(DocumentReading::Kind::Inventory, reading.kind) << name;
        EXPECT_FALSE(reading.isUnreadable()) << name << ": " << reading.unreadableText();
        EXPECT_LE(4u, reading.components.size()) << name;
    }
}

TEST(InventoryDocumentReader, MissingFileIsASystemError) {
    QuorvexTest::TemporaryDirectory const folder;
    EXPECT_THROW(static_cast<void>(inventory::readDocumentFile(folder.file("absent.VPD.xml"))),
                 util::SystemError);
}

} // namespace
