#include "vpd/ResourceSet_ContainerInterface_Element_ListOf_ResourceLists.h"

namespace Quorvex::VPD {

ResourceSet_ContainerInterface_Element_ListOf_ResourceLists::
    ResourceSet_ContainerInterface_Element_ListOf_ResourceLists() = default;

bool ResourceSet_ContainerInterface_Element_ListOf_ResourceLists::isActive() const {
    return _IsActive;
}

std::size_t
ResourceSet_ContainerInterface_Element_ListOf_ResourceLists::get_NumberOf_ResourceLists() const {
    return _ListOf_ResourceLists.size();
}

ListOf_<ResourceList> const&
ResourceSet_ContainerInterface_Element_ListOf_ResourceLists::get_ListOf_ResourceLists() const {
    return _ListOf_ResourceLists;
}

ListOf_<ResourceList>&
ResourceSet_ContainerInterface_Element_ListOf_ResourceLists::get_ListOf_ResourceLists() {
    return _ListOf_ResourceLists;
}

void ResourceSet_ContainerInterface_Element_ListOf_ResourceLists::insert_ResourceList(
    ResourceList const& list) {
    _IsActive = true;
    _ListOf_ResourceLists.insert(list);
}

} // namespace Quorvex::VPD
