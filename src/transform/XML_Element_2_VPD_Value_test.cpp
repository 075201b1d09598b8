#include "transform/XML_Element_2_VPD_Value.h"

#include "transform/VPD_Value_2_XML_Element.h"

#include <gtest/gtest.h>

#include <string>

namespace {

using Quorvex::VPD::Value;
using Transform::XML_Element_2_VPD_Value;
using XML::Element;
using XML::Tag;

Element u_valueElement(std::string const& type, Element const& child) {
    Element element("Value", Tag::Type_BeginTag);
    element.insert_Attribute("type", type);
    element.insert_Content(child);
    return element;
}

std::string u_text(Value const& value) {
    return value;
}

TEST(Transform_XML_Element_2_VPD_Value, ValueElementGivesAStringValueWhateverItsType) {
    Value value("old", 3);
    Value& result =
        XML_Element_2_VPD_Value{value}(u_valueElement("integer", Element("42", Tag::Type_String)));
    EXPECT_EQ(&result, &value);
    EXPECT_EQ(u_text(value), "42");
    EXPECT_EQ(value.get_ValueType(), 0u);
}

TEST(Transform_XML_Element_2_VPD_Value, ReadsBackWhatTheForwardTransformWrote) {
    Element element;
    Transform::VPD_Value_2_XML_Element{element}(Value("0x1F", 5));
    Value value;
    XML_Element_2_VPD_Value{value}(element);
    EXPECT_EQ(u_text(value), "0x1F");
    EXPECT_EQ(value.get_String_ValueType(), "string");
}

TEST(Transform_XML_Element_2_VPD_Value, ElementNamedOtherwiseThrowsAndLeavesTheTarget) {
    Element element = u_valueElement("string", Element("x", Tag::Type_String));
    element.set_Name("Property");
    Value value("kept", 2);
    EXPECT_THROW(XML_Element_2_VPD_Value{value}(element),
                 XML_Element_2_VPD_Value::Error_ElementIsNotValue);
    EXPECT_EQ(u_text(value), "kept");
    EXPECT_EQ(value.get_ValueType(), 2u);
}

TEST(Transform_XML_Element_2_VPD_Value, ElementWithoutChildrenThrows) {
    Value value;
    EXPECT_THROW(XML_Element_2_VPD_Value{value}(Element("Value", Tag::Type_BeginTag)),
                 XML_Element_2_VPD_Value::Error_ElementIsNotValue);
}

TEST(Transform_XML_Element_2_VPD_Value, ElementWithTwoChildrenThrows) {
    Element element = u_valueElement("string", Element("a", Tag::Type_String));
    element.insert_Content(Element("b", Tag::Type_String));
    Value value;
    EXPECT_THROW(XML_Element_2_VPD_Value{value}(element),
                 XML_Element_2_VPD_Value::Error_ElementIsNotValue);
}

TEST(Transform_XML_Element_2_VPD_Value, OnlyChildThatIsNotTextThrows) {
    Value value;
    EXPECT_THROW(XML_Element_2_VPD_Value{value}(u_valueElement("string", Element("x", 1))),
                 XML_Element_2_VPD_Value::Error_ElementIsNotValue);
}

TEST(Transform_XML_Element_2_VPD_Value, ValueElementOfAnotherTagKindThrows) {
    Element element = u_valueElement("string", Element("x", Tag::Type_String));
    element.set_Tag(Tag::Type_EmptyElementTag);
    Value value;
    EXPECT_THROW(XML_Element_2_VPD_Value{value}(element),
                 XML_Element_2_VPD_Value::Error_ElementIsNotValue);
}

} // namespace
