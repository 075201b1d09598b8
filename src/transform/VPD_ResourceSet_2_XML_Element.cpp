#include "transform/VPD_ResourceSet_2_XML_Element.h"

#include "transform/VPD_ResourceList_2_XML_Element.h"
#include "transform/VPD_Resource_2_XML_Element.h"

namespace Transform {

VPD_ResourceSet_2_XML_Element::VPD_ResourceSet_2_XML_Element(XML::Element& target)
    : _Target(target) {}

XML::Element& VPD_ResourceSet_2_XML_Element::operator()(Quorvex::VPD::ResourceSet const& set) {
    _Target.set_Tag(XML::Tag::Type_BeginTag);
    _Target.set_Name("ResourceSet");
    _Target.insert_Attribute("class", set.get_Class());
    _Target.insert_Attribute("type", set.get_Type());
    _Target.insert_Attribute("version", set.get_Version());
    _Target.insert_Attribute("timestamp", set.get_TimeStamp());
    _Target.get_Content().reserve(_Target.get_NumberOfContent() + 1 +
                                  set.get_NumberOf_ResourceLists());
    XML::Element resource;
    _Target.insert_Content(VPD_Resource_2_XML_Element{resource}(set.get_Resource()));
    if (set.get_NumberOf_ResourceLists() != 0) {
        for (auto const& entry : set.get_ListOf_ResourceLists()) {
            XML::Element list;
            _Target.insert_Content(VPD_ResourceList_2_XML_Element{list}(entry.second));
        }
    }
    return _Target;
}

} // namespace Transform
