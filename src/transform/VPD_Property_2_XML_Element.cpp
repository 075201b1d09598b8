#include "transform/VPD_Property_2_XML_Element.h"

#include "transform/VPD_Value_2_XML_Element.h"

namespace Transform {

namespace {

// The text child and the value element.
constexpr unsigned long gc_NumberOf_PropertyChildren = 2;

} // namespace

VPD_Property_2_XML_Element::VPD_Property_2_XML_Element(XML::Element& target) : _Target(target) {}

XML::Element& VPD_Property_2_XML_Element::operator()(Quorvex::VPD::Property const& property) {
    _Target.set_Tag(XML::Tag::Type_BeginTag);
    _Target.set_Name("Property");
    _Target.insert_Attribute("name", property.get_Keyword());
    _Target.insert_Attribute("displayName", property.get_DisplayName());
    _Target.get_Content().reserve(_Target.get_NumberOfContent() + gc_NumberOf_PropertyChildren);
    // The keyword, not the display name. Kept for the inventory importers: see
    // docs/compatibility.md#property-text-is-keyword
    _Target.insert_Content(XML::Element(property.get_Keyword(), XML::Tag::Type_String));
    XML::Element value;
    _Target.insert_Content(VPD_Value_2_XML_Element{value}(property.get_Value()));
    return _Target;
}

} // namespace Transform
