#pragma once

#include "vpd/PropertyGroup.h"
#include "xml/Element.h"

namespace Transform {

// A property group as a "PropertyGroup" element holding its properties.
// A group without properties leaves the target untouched, so a fresh
// target comes out as an element without a name: "<></>".
class VPD_PropertyGroup_2_XML_Element {
public:
    explicit VPD_PropertyGroup_2_XML_Element(XML::Element& target);

    XML::Element& operator()(Quorvex::VPD::PropertyGroup const& group);

private:
    XML::Element& _Target;
};

} // namespace Transform
