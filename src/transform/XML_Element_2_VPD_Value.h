#pragma once

#include "vpd/Value.h"
#include "xml/Element.h"

namespace Transform {

// Reads a "Value" element back into a value of the "string" type, whatever
// its "type" attribute says.
class XML_Element_2_VPD_Value {
public:
    class Error_ElementIsNotValue {};

    explicit XML_Element_2_VPD_Value(Quorvex::VPD::Value& target);

    // Throws Error_ElementIsNotValue, leaving the target unchanged, unless the
    // element is a begin-tag element named "Value" whose one child is text.
    // Nothing else leaves: any other failure ends the program.
    Quorvex::VPD::Value& operator()(XML::Element const& element);

private:
    static bool _isValueElement(XML::Element const& element);

    Quorvex::VPD::Value& _Target;
};

} // namespace Transform
