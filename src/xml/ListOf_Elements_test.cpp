#include "xml/ListOf_Elements.h"

#include <gtest/gtest.h>

#include <utility>

namespace {

using XML::Element;
using XML::ListOf_Elements;
using XML::Tag;

ListOf_Elements u_list(char const* name) {
    ListOf_Elements list;
    list.push_back(Element(name, Tag::Type_String));
    return list;
}

TEST(XML_ListOf_Elements, CopyConstructionCopiesTheElements) {
    ListOf_Elements const source = u_list("a");
    // NOLINTNEXTLINE(performance-unnecessary-copy-initialization): the copy is under test
    ListOf_Elements const copy(source);
    ASSERT_EQ(copy.size(), 1u);
    EXPECT_EQ(copy.front().get_Name(), "a");
}

TEST(XML_ListOf_Elements, AssignmentCopiesNothingAndRefersToTheSource) {
    ListOf_Elements const source = u_list("source");
    ListOf_Elements target = u_list("target");
    ListOf_Elements& result = (target = source);
    ASSERT_EQ(target.size(), 1u);
    EXPECT_EQ(target.front().get_Name(), "target");
    EXPECT_EQ(&result, &source);
}

TEST(XML_ListOf_Elements, AssigningATemporaryCopiesNothing) {
    ListOf_Elements target;
    target = u_list("temporary");
    EXPECT_TRUE(target.empty());
}

TEST(XML_ListOf_Elements, SelfAssignmentRefersToItself) {
    ListOf_Elements list = u_list("a");
    ListOf_Elements& same = list;
    EXPECT_EQ(&(list = same), &list);
    EXPECT_EQ(list.size(), 1u);
}

TEST(XML_ListOf_Elements, SwapExchangesNothing) {
    ListOf_Elements a = u_list("a");
    ListOf_Elements b = u_list("b");
    std::swap(a, b);
    EXPECT_EQ(a.front().get_Name(), "a");
    EXPECT_EQ(b.front().get_Name(), "b");
}

TEST(XML_ListOf_Elements, PassesWholeToAnElement) {
    ListOf_Elements list = u_list("a");
    list.push_back(Element("b", Tag::Type_BeginTag));
    Element parent;
    EXPECT_EQ(parent.insert_Content(list), 2u);
}

} // namespace
