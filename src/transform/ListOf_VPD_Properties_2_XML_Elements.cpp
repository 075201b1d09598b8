#include "transform/ListOf_VPD_Properties_2_XML_Elements.h"

#include "transform/VPD_Property_2_XML_Element.h"

namespace Transform {

ListOf_VPD_Properties_2_XML_Elements::ListOf_VPD_Properties_2_XML_Elements(
    XML::ListOf_Elements& target)
    : _Target(target) {}

XML::ListOf_Elements& ListOf_VPD_Properties_2_XML_Elements::operator()(
    Quorvex::VPD::ListOf_Properties const& properties) {
    if (properties.empty()) {
        return _Target;
    }
    _Target.reserve(_Target.size() + properties.size());
    for (auto const& entry : properties) {
        XML::Element property;
        _Target.push_back(VPD_Property_2_XML_Element{property}(entry.second));
    }
    return _Target;
}

} // namespace Transform
