#pragma once

#include "vpd/Base.h"
#include "vpd/Base_StringValue.h"
#include "vpd/ResourceSet_ContainerInterface_Attributes.h"
#include "vpd/ResourceSet_ContainerInterface_Element_ListOf_ResourceLists.h"
#include "vpd/ResourceSet_ContainerInterface_Element_Resource.h"

#include <string>

namespace Quorvex::VPD {

// One survey result: class, type, version and time stamp, one top resource
// and named resource lists. Keyed by its class. Copies are deep.
// Both content parts have an isActive(); name the part when asking.
class ResourceSet : public Base,
                    public Base_StringValue,
                    public ResourceSet_ContainerInterface_Attributes,
                    public ResourceSet_ContainerInterface_Element_Resource,
                    public ResourceSet_ContainerInterface_Element_ListOf_ResourceLists {
public:
    ResourceSet();
    ResourceSet(std::string const& classText, std::string const& type, std::string const& version,
                std::string const& timeStamp);

    // Joins other into this set when both have the same class, and silently
    // does nothing otherwise. Attributes, display name and flags never change.
    ResourceSet& operator+=(ResourceSet const& other);

    std::string const& __StringValue() const override;
};

} // namespace Quorvex::VPD
