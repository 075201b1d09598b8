#pragma once

#include "vpd/Base.h"
#include "vpd/Base_StringValue.h"
#include "vpd/Resource_ContainerInterface_Attributes.h"
#include "vpd/Resource_ContainerInterface_ListOf_Properties.h"
#include "vpd/Resource_ContainerInterface_ListOf_PropertyGroups.h"
#include "vpd/Resource_ContainerInterface_ListOf_ResourceLists.h"

#include <string>

namespace Quorvex::VPD {

// One surveyed thing (machine, partition, card): display name, unique ID,
// references, properties, property groups and named lists of further
// resources, nested to any depth. Keyed by its unique ID. Copies are deep.
class Resource : public Base,
                 public Base_StringValue,
                 public Resource_ContainerInterface_ListOf_Properties,
                 public Resource_ContainerInterface_ListOf_PropertyGroups,
                 public Resource_ContainerInterface_ListOf_ResourceLists,
                 public Resource_ContainerInterface_Attributes {
public:
    Resource();
    Resource(std::string const& displayName, std::string const& uniqueID);
    Resource(Resource const& other);
    // Safe when other lives inside this resource's own lists.
    Resource& operator=(Resource const& other);
    ~Resource();

    // Joins other into this resource when both have the same unique ID, and
    // silently does nothing otherwise. Content already here wins per key;
    // display name and references never change.
    Resource& operator+=(Resource const& other);

    // Adds resource to the list named listName, making that list when it is
    // missing; false, and nothing added, for an empty list name.
    bool insert_Resource(std::string const& listName, Resource const& resource);

    std::string const& __StringValue() const override;
};

} // namespace Quorvex::VPD

// A resource is of little use without its lists: make ResourceList complete
// for every unit that includes this header. It comes after the class,
// because a resource list holds resources by value.
#include "vpd/ResourceList.h"
