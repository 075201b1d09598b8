#pragma once

#include "vpd/ListOf_.h"

#include <cstddef>
#include <string>

namespace Quorvex::VPD {

// Complete only once vpd/ResourceList.h is included, because a resource list
// holds resources by value.
class ResourceList;

// Gives a resource its named lists of further resources. A resource holds
// lists that hold resources, so the lists live on the heap behind an owned
// pointer: every copy is deep, and no copy shares anything with its source.
class Resource_ContainerInterface_ListOf_ResourceLists {
public:
    class Error_ContentPtrIs_NULL {};

    Resource_ContainerInterface_ListOf_ResourceLists();
    Resource_ContainerInterface_ListOf_ResourceLists(
        Resource_ContainerInterface_ListOf_ResourceLists const& other);
    Resource_ContainerInterface_ListOf_ResourceLists&
    operator=(Resource_ContainerInterface_ListOf_ResourceLists const& other);
    ~Resource_ContainerInterface_ListOf_ResourceLists();

    // False, rather than a throw, when there is no content.
    bool has_ResourceList(std::string const& name) const;
    // These throw Error_ContentPtrIs_NULL when there is no content.
    std::size_t get_NumberOf_ResourceLists() const;
    ListOf_<ResourceList> const& get_ListOf_ResourceLists() const;
    ListOf_<ResourceList>& get_ListOf_ResourceLists();
    // A list of a name present already is merged into the one there.
    void insert_ResourceList(ResourceList const& list);

private:
    void _verify_ContentPtr() const;

    ListOf_<ResourceList>* _ContentPtr;
};

} // namespace Quorvex::VPD
