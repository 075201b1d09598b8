#pragma once

#include "vpd/Resource.h"

namespace Quorvex::VPD {

// Gives a resource set its one top resource, with a flag that records
// whether a resource was ever set. The writers do not consult the flag.
class ResourceSet_ContainerInterface_Element_Resource {
public:
    ResourceSet_ContainerInterface_Element_Resource();

    bool isActive() const;
    Resource const& get_Resource() const;
    Resource& get_Resource();
    // Marks the resource as set.
    void set_Resource(Resource const& resource);

private:
    bool _IsActive{false};
    Resource _Resource;
};

} // namespace Quorvex::VPD
