#pragma once

#include "vpd/ResourceSet.h"
#include "xml/Element.h"

namespace Transform {

// A resource set as a "ResourceSet" element: its four attributes (always,
// even when empty), its resource, then every one of its resource lists in
// name order, empty ones included. The active flags are not consulted.
class VPD_ResourceSet_2_XML_Element {
public:
    explicit VPD_ResourceSet_2_XML_Element(XML::Element& target);

    XML::Element& operator()(Quorvex::VPD::ResourceSet const& set);

private:
    XML::Element& _Target;
};

} // namespace Transform
