#pragma once

#include "vpd/Property.h"
#include "xml/Element.h"

namespace Transform {

// A property as a "Property" element: keyword and display name as
// attributes, the keyword (not the display name) as text, then its value.
class VPD_Property_2_XML_Element {
public:
    explicit VPD_Property_2_XML_Element(XML::Element& target);

    XML::Element& operator()(Quorvex::VPD::Property const& property);

private:
    XML::Element& _Target;
};

} // namespace Transform
