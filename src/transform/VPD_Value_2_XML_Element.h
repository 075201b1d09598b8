#pragma once

#include "vpd/Value.h"
#include "xml/Element.h"

namespace Transform {

// A value as a "Value" element: its type name as "type", its text as the
// only child.
class VPD_Value_2_XML_Element {
public:
    explicit VPD_Value_2_XML_Element(XML::Element& target);

    XML::Element& operator()(Quorvex::VPD::Value const& value);

private:
    XML::Element& _Target;
};

} // namespace Transform
