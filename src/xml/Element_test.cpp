#include "xml/Element.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>
#include <string>
#include <vector>

namespace {

using XML::Element;
using XML::Tag;

std::vector<std::string> u_attributeNames(Element const& element) {
    std::vector<std::string> names;
    std::transform(element.get_Attribute().begin(), element.get_Attribute().end(),
                   std::back_inserter(names),
                   [](auto const& attribute) { return attribute.first; });
    return names;
}

TEST(XML_Element, DefaultIsAnUnnamedBeginTagElement) {
    Element const element;
    EXPECT_EQ(element.get_Tag().get_Type(), Tag::Type_BeginTag);
    EXPECT_EQ(element.get_Namespace(), "");
    EXPECT_EQ(element.get_Name(), "");
    EXPECT_EQ(element.get_NumberOfAttribute(), 0u);
    EXPECT_EQ(element.get_NumberOfContent(), 0u);
}

TEST(XML_Element, NameAndTypeConstructor) {
    Element const element("some text", Tag::Type_String);
    EXPECT_EQ(element.get_Tag().get_Type(), Tag::Type_String);
    EXPECT_EQ(element.get_Name(), "some text");
}

TEST(XML_Element, AttributesReadInNameOrderWithUpperCaseFirst) {
    Element element("e", Tag::Type_BeginTag);
    element.insert_Attribute("version", "1.0");
    element.insert_Attribute("class", "c");
    element.insert_Attribute("Zulu", "z");
    EXPECT_EQ(u_attributeNames(element), (std::vector<std::string>{"Zulu", "class", "version"}));
}

TEST(XML_Element, SameAttributeTwiceReturnsZeroAndKeepsFirstValue) {
    Element element;
    EXPECT_EQ(element.insert_Attribute("type", "string"), 1u);
    EXPECT_EQ(element.insert_Attribute("name", "SE"), 2u);
    EXPECT_EQ(element.insert_Attribute("type", "integer"), 0u);
    EXPECT_EQ(element.get_AttributeValue("type"), "string");
    EXPECT_EQ(element.get_NumberOfAttribute(), 2u);
}

TEST(XML_Element, AbsentAttributeReadsEmptyAndIsNotPresent) {
    Element element;
    element.insert_Attribute("present", "");
    EXPECT_EQ(element.get_AttributeValue("absent"), "");
    EXPECT_FALSE(element.has_Attribute("absent"));
    EXPECT_TRUE(element.has_Attribute("present"));
    EXPECT_EQ(element.get_NumberOfAttribute(), 1u);
}

TEST(XML_Element, AssignmentKeepsTargetNamespaceWhileCopyConstructionCopiesIt) {
    Element source("e", Tag::Type_Comment);
    source.set_Namespace("a");
    source.insert_Attribute("x", "1");
    source.insert_Content(Element("text", Tag::Type_String));
    Element target;
    target.set_Namespace("b");
    target = source;
    EXPECT_EQ(target.get_Namespace(), "b");
    EXPECT_EQ(target.get_Name(), "e");
    EXPECT_EQ(target.get_Tag().get_Type(), Tag::Type_Comment);
    EXPECT_EQ(target.get_AttributeValue("x"), "1");
    EXPECT_EQ(target.get_NumberOfContent(), 1u);
    Element const copy(source);
    EXPECT_EQ(copy.get_Namespace(), "a");
}

TEST(XML_Element, AssigningATemporaryKeepsTargetNamespace) {
    Element target;
    target.set_Namespace("b");
    Element source("e", Tag::Type_BeginTag);
    source.set_Namespace("a");
    target = Element(source);
    EXPECT_EQ(target.get_Namespace(), "b");
    EXPECT_EQ(target.get_Name(), "e");
}

TEST(XML_Element, InsertingAnEmptyVectorReturnsZeroAndChangesNothing) {
    Element element;
    element.insert_Content(Element("a", Tag::Type_String));
    EXPECT_EQ(element.insert_Content(std::vector<Element>()), 0u);
    EXPECT_EQ(element.get_NumberOfContent(), 1u);
}

TEST(XML_Element, AppendingReturnsTheNewNumberOfChildren) {
    Element element;
    EXPECT_EQ(element.insert_Content(Element("a", Tag::Type_String)), 1u);
    std::vector<Element> const two = {Element("b", Tag::Type_BeginTag),
                                      Element("c", Tag::Type_Comment)};
    EXPECT_EQ(element.insert_Content(two), 3u);
    ASSERT_EQ(element.get_NumberOfContent(), 3u);
    EXPECT_EQ(element.get_Content()[0].get_Name(), "a");
    EXPECT_EQ(element.get_Content()[1].get_Name(), "b");
    EXPECT_EQ(element.get_Content()[2].get_Name(), "c");
}

TEST(XML_Element, AppendingItsOwnChildrenDoublesThem) {
    Element element;
    element.insert_Content(Element("a", Tag::Type_String));
    element.insert_Content(Element("b", Tag::Type_String));
    EXPECT_EQ(element.insert_Content(element.get_Content()), 4u);
    EXPECT_EQ(element.get_Content()[2].get_Name(), "a");
    EXPECT_EQ(element.get_Content()[3].get_Name(), "b");
}

TEST(XML_Element, ChangingAChildAfterAddingItLeavesTheParentsCopyUnchanged) {
    Element parent;
    Element child("child", Tag::Type_BeginTag);
    child.insert_Content(Element("grandchild", Tag::Type_String));
    parent.insert_Content(child);
    child.set_Name("changed");
    child.insert_Attribute("x", "1");
    child.get_Content().front().set_Name("changed too");
    Element const& kept = parent.get_Content().front();
    EXPECT_EQ(kept.get_Name(), "child");
    EXPECT_EQ(kept.get_NumberOfAttribute(), 0u);
    EXPECT_EQ(kept.get_Content().front().get_Name(), "grandchild");
}

TEST(XML_Element, CopyIsADeepCopyOfTheSubtree) {
    Element parent("p", Tag::Type_BeginTag);
    parent.insert_Content(Element("c", Tag::Type_BeginTag));
    Element copy(parent);
    copy.get_Content().front().set_Name("other");
    EXPECT_EQ(parent.get_Content().front().get_Name(), "c");
}

TEST(XML_Element, SettersReplaceTheirField) {
    Element element;
    element.set_Tag(Tag::Type_Declaration);
    EXPECT_EQ(element.get_Tag().get_Type(), Tag::Type_Declaration);
    element.set_Tag(Tag(Tag::Type_EmptyElementTag));
    EXPECT_EQ(element.get_Tag().get_Type(), Tag::Type_EmptyElementTag);
    element.set_Namespace("n");
    element.set_Name("e");
    EXPECT_EQ(element.get_Namespace(), "n");
    EXPECT_EQ(element.get_Name(), "e");
}

TEST(XML_Element, SelfAssignmentKeepsEverything) {
    Element element("e", Tag::Type_BeginTag);
    element.set_Namespace("n");
    element.insert_Content(Element("t", Tag::Type_String));
    Element& same = element;
    element = same;
    EXPECT_EQ(element.get_Namespace(), "n");
    EXPECT_EQ(element.get_NumberOfContent(), 1u);
}

// This unit includes nothing of the model but the element's own header.
TEST(XML_Element, ListsOfElementsComeWithTheElementHeader) {
    XML::ListOf_Elements children;
    children.push_back(Element("a", Tag::Type_String));
    children.push_back(Element("b", Tag::Type_BeginTag));
    Element parent;
    EXPECT_EQ(parent.insert_Content(children), 2u);
    EXPECT_EQ(parent.get_Content()[1].get_Name(), "b");
}

} // namespace
