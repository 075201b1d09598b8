#include "vpd/Resource_ContainerInterface_ListOf_PropertyGroups.h"

namespace Quorvex::VPD {

bool Resource_ContainerInterface_ListOf_PropertyGroups::has_PropertyGroup(
    std::string const& name) const {
    return _ListOf_PropertyGroups.contains(name);
}

std::size_t Resource_ContainerInterface_ListOf_PropertyGroups::get_NumberOf_PropertyGroups() const {
    return _ListOf_PropertyGroups.size();
}

ListOf_<PropertyGroup> const&
Resource_ContainerInterface_ListOf_PropertyGroups::get_ListOf_PropertyGroups() const {
    return _ListOf_PropertyGroups;
}

ListOf_<PropertyGroup>&
Resource_ContainerInterface_ListOf_PropertyGroups::get_ListOf_PropertyGroups() {
    return _ListOf_PropertyGroups;
}

void Resource_ContainerInterface_ListOf_PropertyGroups::insert_PropertyGroup(
    PropertyGroup const& group) {
    _ListOf_PropertyGroups.insert(group);
}

} // namespace Quorvex::VPD
