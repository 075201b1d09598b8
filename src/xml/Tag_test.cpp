#include "xml/Tag.h"

#include "xml/Element.h"

#include <gtest/gtest.h>

#include <string>

namespace {

using XML::Tag;

struct Delimiters {
    unsigned long code;
    const char* beginStart;
    const char* beginEnd;
    const char* endStart;
    const char* endEnd;
};

TEST(XML_Tag, DefaultElementHasBeginTagWhileBareTagHasUndefined) {
    EXPECT_EQ(Tag().get_Type(), 0u);
    EXPECT_EQ(XML::Element().get_Tag().get_Type(), 1u);
    EXPECT_TRUE(XML::Element().get_Tag() == Tag::Type_BeginTag);
}

TEST(XML_Tag, OnlyBeginTagHasAnEndTag) {
    for (unsigned long code = 0; code < 8; ++code) {
        Tag const tag(code);
        EXPECT_EQ(tag.has_EndTag(), code == 1) << "code " << code;
        EXPECT_EQ(tag.get_EndTag_StartDelimiter(), code == 1 ? "</" : "") << "code " << code;
        EXPECT_EQ(tag.get_EndTag_EndDelimiter(), code == 1 ? ">" : "") << "code " << code;
    }
}

TEST(XML_Tag, EveryKindHasItsDelimiters) {
    Delimiters const expected[] = {
        {Tag::Type_Undefined, "", "", "", ""},
        {Tag::Type_BeginTag, "<", ">", "</", ">"},
        {Tag::Type_EmptyElementTag, "<", "/>", "", ""},
        {Tag::Type_EndTag, "</", ">", "", ""},
        {Tag::Type_String, "", "", "", ""},
        {Tag::Type_Content, ">", "<", "", ""},
        {Tag::Type_Comment, "<!--", "-->", "", ""},
        {Tag::Type_Declaration, "<?", "?>", "", ""},
    };
    for (Delimiters const& row : expected) {
        Tag const tag(row.code);
        EXPECT_EQ(tag.get_BeginTag_StartDelimiter(), row.beginStart) << "code " << row.code;
        EXPECT_EQ(tag.get_BeginTag_EndDelimiter(), row.beginEnd) << "code " << row.code;
        EXPECT_EQ(tag.get_EndTag_StartDelimiter(), row.endStart) << "code " << row.code;
        EXPECT_EQ(tag.get_EndTag_EndDelimiter(), row.endEnd) << "code " << row.code;
    }
}

TEST(XML_Tag, CodesCanBeSetAssignedAndCompared) {
    Tag tag;
    tag = Tag::Type_Comment;
    EXPECT_EQ(tag.get_Type(), 6u);
    tag.set_Type(Tag::Type_String);
    EXPECT_TRUE(tag == Tag::Type_String);
    EXPECT_TRUE(tag != Tag::Type_Comment);
    EXPECT_FALSE(tag != Tag::Type_String);
    Tag copy(tag);
    EXPECT_TRUE(copy == tag);
    copy = copy;
    EXPECT_EQ(copy.get_Type(), 4u);
    EXPECT_FALSE(Tag(Tag::Type_BeginTag) == Tag(Tag::Type_EndTag));
}

TEST(XML_Tag, ACodeStandsWhereATagIsExpected) {
    Tag const tag = Tag::Type_String;
    EXPECT_EQ(tag.get_Type(), 4u);
    EXPECT_TRUE(Tag::Type_Comment == Tag(Tag::Type_Comment));
    EXPECT_FALSE(Tag::Type_Comment == tag);
}

TEST(XML_Tag, CodeNamesAreAlsoInTheNamespace) {
    EXPECT_EQ(XML::Type_Undefined, 0u);
    EXPECT_EQ(XML::Type_BeginTag, 1u);
    EXPECT_EQ(XML::Type_EmptyElementTag, 2u);
    EXPECT_EQ(XML::Type_EndTag, 3u);
    EXPECT_EQ(XML::Type_String, 4u);
    EXPECT_EQ(XML::Type_Content, 5u);
    EXPECT_EQ(XML::Type_Comment, 6u);
    EXPECT_EQ(XML::Type_Declaration, 7u);
}

} // namespace
