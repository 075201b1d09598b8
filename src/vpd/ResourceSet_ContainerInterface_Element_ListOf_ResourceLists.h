#pragma once

#include "vpd/ListOf_.h"
#include "vpd/ResourceList.h"

#include <cstddef>

namespace Quorvex::VPD {

// Gives a resource set its named resource lists, with a flag that records
// whether a list was ever inserted. The writers do not consult the flag.
class ResourceSet_ContainerInterface_Element_ListOf_ResourceLists {
public:
    ResourceSet_ContainerInterface_Element_ListOf_ResourceLists();

    bool isActive() const;
    std::size_t get_NumberOf_ResourceLists() const;
    ListOf_<ResourceList> const& get_ListOf_ResourceLists() const;
    ListOf_<ResourceList>& get_ListOf_ResourceLists();
    // Marks the lists as set; a list of a name present already is merged
    // into the one there.
    void insert_ResourceList(ResourceList const& list);

private:
    bool _IsActive{false};
    ListOf_<ResourceList> _ListOf_ResourceLists;
};

} // namespace Quorvex::VPD
