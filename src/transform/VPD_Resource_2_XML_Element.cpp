#include "transform/VPD_Resource_2_XML_Element.h"

#include "transform/ListOf_VPD_Properties_2_XML_Elements.h"
#include "transform/VPD_PropertyGroup_2_XML_Element.h"
#include "transform/VPD_ResourceList_2_XML_Element.h"
#include "vpd/ResourceList.h"
#include "xml/ListOf_Elements.h"

#include <algorithm>
#include <iterator>
#include <string>

namespace Transform {

namespace {

// Lists that a resource always shows first, in this order, even when empty.
// Kept for the inventory importers: see docs/compatibility.md#leading-resource-lists
constexpr const char* gc_LeadingResourceLists[] = {"Partitions", "Enclosures"};

bool u_is_LeadingResourceList(std::string const& name) {
    return std::any_of(std::begin(gc_LeadingResourceLists), std::end(gc_LeadingResourceLists),
                       [&name](char const* leading) { return name == leading; });
}

} // namespace

VPD_Resource_2_XML_Element::VPD_Resource_2_XML_Element(XML::Element& target) : _Target(target) {}

XML::Element& VPD_Resource_2_XML_Element::operator()(Quorvex::VPD::Resource const& resource) {
    _Target.set_Tag(XML::Tag::Type_BeginTag);
    _Target.set_Name("Resource");
    _Target.get_Content().reserve(
        _Target.get_NumberOfContent() + 1 + resource.get_NumberOf_Properties() +
        resource.get_NumberOf_PropertyGroups() + resource.get_NumberOf_ResourceLists());
    // Even an empty name. Kept for the inventory importers: see
    // docs/compatibility.md#resource-text-line
    _Target.insert_Content(XML::Element(resource.get_DisplayName(), XML::Tag::Type_String));
    _insert_Attributes(resource);
    _insert_Properties(resource);
    _insert_PropertyGroups(resource);
    _insert_ResourceLists(resource);
    return _Target;
}

void VPD_Resource_2_XML_Element::_insert_Attributes(Quorvex::VPD::Resource const& resource) {
    _Target.insert_Attribute("displayName", resource.get_DisplayName());
    if (!resource.get_UniqueID().empty()) {
        _Target.insert_Attribute("uniqueId", resource.get_UniqueID());
    }
    if (!resource.get_References().empty()) {
        _Target.insert_Attribute("references", resource.get_References());
    }
}

void VPD_Resource_2_XML_Element::_insert_Properties(Quorvex::VPD::Resource const& resource) {
    if (resource.get_NumberOf_Properties() == 0) {
        return;
    }
    XML::ListOf_Elements properties;
    ListOf_VPD_Properties_2_XML_Elements{properties}(resource.get_ListOf_Properties());
    _Target.insert_Content(properties);
}

void VPD_Resource_2_XML_Element::_insert_PropertyGroups(Quorvex::VPD::Resource const& resource) {
    if (resource.get_NumberOf_PropertyGroups() == 0) {
        return;
    }
    for (auto const& entry : resource.get_ListOf_PropertyGroups()) {
        XML::Element group;
        _Target.insert_Content(VPD_PropertyGroup_2_XML_Element{group}(entry.second));
    }
}

void VPD_Resource_2_XML_Element::_insert_ResourceLists(Quorvex::VPD::Resource const& resource) {
    if (resource.get_NumberOf_ResourceLists() == 0) {
        return;
    }
    Quorvex::VPD::ListOf_<Quorvex::VPD::ResourceList> const& lists =
        resource.get_ListOf_ResourceLists();
    for (const char* leading : gc_LeadingResourceLists) {
        if (lists.contains(leading)) {
            _insert_ResourceList(lists.find(leading));
        }
    }
    for (auto const& entry : lists) {
        if (!entry.second.empty() && !u_is_LeadingResourceList(entry.first)) {
            _insert_ResourceList(entry.second);
        }
    }
}

void VPD_Resource_2_XML_Element::_insert_ResourceList(Quorvex::VPD::ResourceList const& list) {
    XML::Element element;
    _Target.insert_Content(VPD_ResourceList_2_XML_Element{element}(list));
}

} // namespace Transform
