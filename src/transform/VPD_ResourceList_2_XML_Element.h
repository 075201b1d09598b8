#pragma once

#include "vpd/ResourceList.h"
#include "xml/Element.h"

namespace Transform {

// A resource list as a "ResourceList" element holding one "Resource"
// element per resource, in unique-ID order. It has no text child.
class VPD_ResourceList_2_XML_Element {
public:
    explicit VPD_ResourceList_2_XML_Element(XML::Element& target);

    XML::Element& operator()(Quorvex::VPD::ResourceList const& list);

private:
    XML::Element& _Target;
};

} // namespace Transform
