#include "transform/VPD_Value_2_XML_Element.h"

namespace Transform {

VPD_Value_2_XML_Element::VPD_Value_2_XML_Element(XML::Element& target) : _Target(target) {}

XML::Element& VPD_Value_2_XML_Element::operator()(Quorvex::VPD::Value const& value) {
    _Target.set_Tag(XML::Tag::Type_BeginTag);
    _Target.set_Name("Value");
    _Target.insert_Attribute("type", value.get_String_ValueType());
    _Target.insert_Content(XML::Element(value, XML::Tag::Type_String));
    return _Target;
}

} // namespace Transform
