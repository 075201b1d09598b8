#pragma once

#include "vpd/ListOf_Properties.h"
#include "xml/ListOf_Elements.h"

namespace Transform {

// Appends one "Property" element per property, in keyword order, to the
// target list. Fill a list in place: assigning one list to another copies
// nothing.
class ListOf_VPD_Properties_2_XML_Elements {
public:
    explicit ListOf_VPD_Properties_2_XML_Elements(XML::ListOf_Elements& target);

    XML::ListOf_Elements& operator()(Quorvex::VPD::ListOf_Properties const& properties);

private:
    XML::ListOf_Elements& _Target;
};

} // namespace Transform
