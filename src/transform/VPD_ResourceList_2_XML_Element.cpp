#include "transform/VPD_ResourceList_2_XML_Element.h"

#include "transform/VPD_Resource_2_XML_Element.h"

namespace Transform {

VPD_ResourceList_2_XML_Element::VPD_ResourceList_2_XML_Element(XML::Element& target)
    : _Target(target) {}

XML::Element& VPD_ResourceList_2_XML_Element::operator()(Quorvex::VPD::ResourceList const& list) {
    _Target.set_Tag(XML::Tag::Type_BeginTag);
    _Target.set_Name("ResourceList");
    _Target.insert_Attribute("displayName", list.get_DisplayName());
    _Target.get_Content().reserve(_Target.get_NumberOfContent() + list.size());
    for (auto const& entry : list) {
        XML::Element resource;
        _Target.insert_Content(VPD_Resource_2_XML_Element{resource}(entry.second));
    }
    return _Target;
}

} // namespace Transform
