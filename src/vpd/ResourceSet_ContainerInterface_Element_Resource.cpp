#include "vpd/ResourceSet_ContainerInterface_Element_Resource.h"

namespace Quorvex::VPD {

ResourceSet_ContainerInterface_Element_Resource::ResourceSet_ContainerInterface_Element_Resource() =
    default;

bool ResourceSet_ContainerInterface_Element_Resource::isActive() const {
    return _IsActive;
}

Resource const& ResourceSet_ContainerInterface_Element_Resource::get_Resource() const {
    return _Resource;
}

Resource& ResourceSet_ContainerInterface_Element_Resource::get_Resource() {
    return _Resource;
}

void ResourceSet_ContainerInterface_Element_Resource::set_Resource(Resource const& resource) {
    _IsActive = true;
    _Resource = resource;
}

} // namespace Quorvex::VPD
