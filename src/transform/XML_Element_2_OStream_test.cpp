#include "transform/XML_Element_2_OStream.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <sstream>
#include <streambuf>
#include <string>

namespace {

using QuorvexTest::elementText;
using Transform::XML_Element_2_OStream;
using XML::Element;
using XML::Tag;

Element u_element(std::string const& name, unsigned long const& type = Tag::Type_BeginTag) {
    return Element(name, type);
}

Element u_withChildren(std::string const& name, unsigned long const& type,
                       std::initializer_list<Element> children) {
    Element element(name, type);
    for (Element const& child : children) {
        element.insert_Content(child);
    }
    return element;
}

// Counts the flushes that reach the buffer, and keeps the text.
class CountingBuffer : public std::stringbuf {
public:
    int flushes = 0;

protected:
    int sync() override {
        ++flushes;
        return std::stringbuf::sync();
    }
};

TEST(Transform_XML_Element_2_OStream, LoneChildlessElementAtDepthZeroHasNoLineFeedAround) {
    EXPECT_EQ(elementText(u_element("A")), "<A></A>");
}

TEST(Transform_XML_Element_2_OStream, NewLineAtDepthZeroWritesNothingBefore) {
    std::ostringstream out;
    XML_Element_2_OStream writer(out, 2);
    writer(u_element("A"), true, 0);
    EXPECT_EQ(out.str(), "<A></A>");
}

TEST(Transform_XML_Element_2_OStream, TwoTopLevelCallsPutBothElementsOnOneLine) {
    std::ostringstream out;
    XML_Element_2_OStream writer(out, 0);
    writer(u_element("A"), true, 0);
    writer(u_element("B"), true, 0);
    EXPECT_EQ(out.str(), "<A></A><B></B>");
}

TEST(Transform_XML_Element_2_OStream, OneTextChildStandsBetweenTheTagsOnOneLine) {
    Element const element =
        u_withChildren("A", Tag::Type_BeginTag, {u_element("text", Tag::Type_String)});
    EXPECT_EQ(elementText(element), "<A>text</A>");
}

TEST(Transform_XML_Element_2_OStream, TextAndElementChildrenEachStandOnTheirOwnIndentedLine) {
    Element const element = u_withChildren("A", Tag::Type_BeginTag,
                                           {u_element("text", Tag::Type_String), u_element("B")});
    EXPECT_EQ(elementText(element), "<A>\n   text\n   <B></B>\n</A>");
}

TEST(Transform_XML_Element_2_OStream, NestedChildrenIndentThreeSpacesPerLevel) {
    Element const inner =
        u_withChildren("C", Tag::Type_BeginTag, {u_element("x", Tag::Type_String), u_element("D")});
    Element const element = u_withChildren("A", Tag::Type_BeginTag, {inner, u_element("E")});
    EXPECT_EQ(elementText(element), "<A>\n"
                                    "   <C>\n"
                                    "      x\n"
                                    "      <D></D>\n"
                                    "   </C>\n"
                                    "   <E></E>\n"
                                    "</A>");
}

TEST(Transform_XML_Element_2_OStream, AttributesInsertedVersionThenClassAreWrittenClassFirst) {
    Element element = u_element("A");
    element.insert_Attribute("version", "1.0");
    element.insert_Attribute("class", "c");
    EXPECT_EQ(elementText(element), "<A class=\"c\" version=\"1.0\"></A>");
}

TEST(Transform_XML_Element_2_OStream, DeclarationWritesVersionFirstThenEncoding) {
    Element declaration = u_element("xml", Tag::Type_Declaration);
    declaration.insert_Attribute("encoding", "UTF-8");
    declaration.insert_Attribute("version", "1.0");
    EXPECT_EQ(elementText(declaration), "<?xml version=\"1.0\" encoding=\"UTF-8\"?>");
}

TEST(Transform_XML_Element_2_OStream, DeclarationWritesOtherAttributesSortedAfterVersion) {
    Element declaration = u_element("xml", Tag::Type_Declaration);
    declaration.insert_Attribute("standalone", "yes");
    declaration.insert_Attribute("encoding", "UTF-8");
    declaration.insert_Attribute("version", "1.0");
    EXPECT_EQ(elementText(declaration),
              "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"yes\"?>");
}

TEST(Transform_XML_Element_2_OStream, DeclarationWithoutVersionWritesSortedAttributes) {
    Element declaration = u_element("xml", Tag::Type_Declaration);
    declaration.insert_Attribute("standalone", "yes");
    declaration.insert_Attribute("encoding", "UTF-8");
    EXPECT_EQ(elementText(declaration), "<?xml encoding=\"UTF-8\" standalone=\"yes\"?>");
}

TEST(Transform_XML_Element_2_OStream, OtherInstructionsWriteSortedAttributes) {
    Element instruction = u_element("style", Tag::Type_Declaration);
    instruction.insert_Attribute("version", "2");
    instruction.insert_Attribute("href", "a.css");
    EXPECT_EQ(elementText(instruction), "<?style href=\"a.css\" version=\"2\"?>");
}

TEST(Transform_XML_Element_2_OStream, QuoteAndAmpersandInValuesAreWrittenUnchanged) {
    Element element =
        u_withChildren("A", Tag::Type_BeginTag, {u_element("x < y & \"z\"", Tag::Type_String)});
    element.insert_Attribute("v", "say \"hi\" & <bye>");
    EXPECT_EQ(elementText(element), "<A v=\"say \"hi\" & <bye>\">x < y & \"z\"</A>");
}

TEST(Transform_XML_Element_2_OStream, ControlCharactersAndBytesAbove127AreWrittenUnchanged) {
    std::string const odd = std::string("\t\x01\r\xC3\xA9\xFF", 6) + std::string(1, '\0') + "]]>";
    Element element = u_withChildren(odd, Tag::Type_BeginTag, {u_element(odd, Tag::Type_String)});
    element.insert_Attribute(odd, odd);
    EXPECT_EQ(elementText(element),
              "<" + odd + " " + odd + "=\"" + odd + "\">" + odd + "</" + odd + ">");
}

TEST(Transform_XML_Element_2_OStream, IndentationAtLevelFourIsTwelveSpaces) {
    std::ostringstream out;
    XML_Element_2_OStream writer(out, 4);
    writer(u_element("A"), true, 1);
    EXPECT_EQ(out.str(), "\n            <A></A>");
}

TEST(Transform_XML_Element_2_OStream, NoNewLineBelowTopLevelWritesNoIndentation) {
    std::ostringstream out;
    XML_Element_2_OStream writer(out, 4);
    writer(u_element("A"), false, 1);
    EXPECT_EQ(out.str(), "<A></A>");
}

TEST(Transform_XML_Element_2_OStream, EmptyElementTagWithChildrenWritesThemAndNoEndTag) {
    Element const element =
        u_withChildren("A", Tag::Type_EmptyElementTag, {u_element("B"), u_element("C")});
    EXPECT_EQ(elementText(element), "<A/>\n   <B></B>\n   <C></C>\n");
}

TEST(Transform_XML_Element_2_OStream,
     EmptyElementTagWithChildrenBelowTopLevelEndsAtItsOwnIndentation) {
    Element const element =
        u_withChildren("A", Tag::Type_EmptyElementTag, {u_element("B"), u_element("C")});
    std::ostringstream out;
    XML_Element_2_OStream(out, 1)(element, true, 1);
    EXPECT_EQ(out.str(), "\n   <A/>\n      <B></B>\n      <C></C>\n   ");
}

TEST(Transform_XML_Element_2_OStream, EmptyElementTagWithoutChildrenIsOneShortTag) {
    Element element = u_element("A", Tag::Type_EmptyElementTag);
    element.insert_Attribute("x", "1");
    EXPECT_EQ(elementText(element), "<A x=\"1\"/>");
}

TEST(Transform_XML_Element_2_OStream, DeclarationChildrenStayAtTheDeclarationsIndentation) {
    Element declaration =
        u_withChildren("xml", Tag::Type_Declaration, {u_element("B"), u_element("C")});
    declaration.insert_Attribute("version", "1.0");
    EXPECT_EQ(elementText(declaration), "<?xml version=\"1.0\"?>\n<B></B>\n<C></C>\n");
    std::ostringstream out;
    XML_Element_2_OStream(out, 1)(declaration, true, 1);
    EXPECT_EQ(out.str(), "\n   <?xml version=\"1.0\"?>\n   <B></B>\n   <C></C>\n   ");
}

TEST(Transform_XML_Element_2_OStream, NamespaceAndColonPrecedeTheNameInBothTags) {
    Element element = u_element("e");
    element.set_Namespace("n");
    EXPECT_EQ(elementText(element), "<n:e></n:e>");
}

TEST(Transform_XML_Element_2_OStream, CommentIsWrittenWithItsDelimiters) {
    EXPECT_EQ(elementText(u_element(" note ", Tag::Type_Comment)), "<!-- note -->");
}

TEST(Transform_XML_Element_2_OStream, UnnamedElementIsWrittenWithEmptyTags) {
    EXPECT_EQ(elementText(Element()), "<></>");
}

TEST(Transform_XML_Element_2_OStream, TextAmongSeveralChildrenIsAloneOnItsLine) {
    Element const element = u_withChildren(
        "A", Tag::Type_BeginTag,
        {u_element("B"), u_element("one", Tag::Type_String), u_element("two", Tag::Type_String)});
    EXPECT_EQ(elementText(element), "<A>\n   <B></B>\n   one\n   two\n</A>");
}

TEST(Transform_XML_Element_2_OStream, EveryLineBreakFlushesTheStream) {
    CountingBuffer buffer;
    std::ostream out(&buffer);
    Element const element =
        u_withChildren("A", Tag::Type_BeginTag, {u_element("B"), u_element("C")});
    XML_Element_2_OStream(out, 0)(element, true, 0);
    EXPECT_EQ(buffer.str(), "<A>\n   <B></B>\n   <C></C>\n</A>");
    EXPECT_EQ(buffer.flushes, 3);
}

TEST(Transform_XML_Element_2_OStream, ReturnsTheStream) {
    std::ostringstream out;
    XML_Element_2_OStream writer(out, 0);
    EXPECT_EQ(&writer(u_element("A"), true, 0), &out);
}

// The writer's own header brings the holder of its predicate.
TEST(Transform_Utility__XML_Element_2_OStream, EmptyElementTagIsAlwaysShortForm) {
    Element element = u_element("A", Tag::Type_EmptyElementTag);
    EXPECT_TRUE(Transform::Utility__XML_Element_2_OStream::_u_usingEmptyElementTag(element));
    element.insert_Content(u_element("B"));
    EXPECT_TRUE(Transform::Utility__XML_Element_2_OStream::_u_usingEmptyElementTag(element));
}

TEST(Transform_Utility__XML_Element_2_OStream, ChildlessBeginTagQualifiesButIsNotWrittenShort) {
    Element const element = u_element("A");
    EXPECT_TRUE(Transform::Utility__XML_Element_2_OStream::_u_usingEmptyElementTag(element));
    EXPECT_EQ(elementText(element), "<A></A>");
}

TEST(Transform_Utility__XML_Element_2_OStream, OtherElementsDoNotQualify) {
    Element const parent = u_withChildren("A", Tag::Type_BeginTag, {u_element("B")});
    EXPECT_FALSE(Transform::Utility__XML_Element_2_OStream::_u_usingEmptyElementTag(parent));
    EXPECT_FALSE(Transform::Utility__XML_Element_2_OStream::_u_usingEmptyElementTag(
        u_element("t", Tag::Type_String)));
    EXPECT_FALSE(Transform::Utility__XML_Element_2_OStream::_u_usingEmptyElementTag(
        u_element("xml", Tag::Type_Declaration)));
}

} // namespace
