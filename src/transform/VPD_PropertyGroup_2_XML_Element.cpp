#include "transform/VPD_PropertyGroup_2_XML_Element.h"

#include "transform/ListOf_VPD_Properties_2_XML_Elements.h"
#include "xml/ListOf_Elements.h"

namespace Transform {

VPD_PropertyGroup_2_XML_Element::VPD_PropertyGroup_2_XML_Element(XML::Element& target)
    : _Target(target) {}

XML::Element&
VPD_PropertyGroup_2_XML_Element::operator()(Quorvex::VPD::PropertyGroup const& group) {
    // Left untouched: the resource adds an unnamed element.
    // Kept for the inventory importers: see docs/compatibility.md#unnamed-property-group
    if (group.empty()) {
        return _Target;
    }
    _Target.set_Tag(XML::Tag::Type_BeginTag);
    _Target.set_Name("PropertyGroup");
    _Target.insert_Attribute("displayName", group.get_DisplayName());
    XML::ListOf_Elements properties;
    ListOf_VPD_Properties_2_XML_Elements{properties}(group);
    _Target.insert_Content(properties);
    return _Target;
}

} // namespace Transform
