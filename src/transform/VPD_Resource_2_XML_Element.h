#pragma once

#include "vpd/Resource.h"
#include "xml/Element.h"

namespace Transform {

// A resource as a "Resource" element: its display name as text (even when
// empty), then its properties, its property groups and its resource lists.
// Among the lists "Partitions" comes first and "Enclosures" second, both
// written even when empty; the other lists follow in name order, and only
// when they hold resources.
class VPD_Resource_2_XML_Element {
public:
    explicit VPD_Resource_2_XML_Element(XML::Element& target);

    XML::Element& operator()(Quorvex::VPD::Resource const& resource);

private:
    void _insert_Attributes(Quorvex::VPD::Resource const& resource);
    void _insert_Properties(Quorvex::VPD::Resource const& resource);
    void _insert_PropertyGroups(Quorvex::VPD::Resource const& resource);
    void _insert_ResourceLists(Quorvex::VPD::Resource const& resource);
    void _insert_ResourceList(Quorvex::VPD::ResourceList const& list);

    XML::Element& _Target;
};

} // namespace Transform
