#pragma once

#include "vpd/ListOf_.h"
#include "vpd/PropertyGroup.h"

#include <cstddef>
#include <string>

namespace Quorvex::VPD {

// Gives a resource its property groups, keyed by group name.
class Resource_ContainerInterface_ListOf_PropertyGroups {
public:
    bool has_PropertyGroup(std::string const& name) const;
    std::size_t get_NumberOf_PropertyGroups() const;
    ListOf_<PropertyGroup> const& get_ListOf_PropertyGroups() const;
    ListOf_<PropertyGroup>& get_ListOf_PropertyGroups();
    // A group of a name present already is merged into the one there.
    void insert_PropertyGroup(PropertyGroup const& group);

private:
    ListOf_<PropertyGroup> _ListOf_PropertyGroups;
};

} // namespace Quorvex::VPD
