#pragma once

#include "vpd/Base.h"
#include "vpd/Base_StringValue.h"
#include "vpd/ListOf_.h"
#include "vpd/Resource.h"

#include <string>

namespace Quorvex::VPD {

// A named list of resources, keyed by unique ID. Keyed by its name.
class ResourceList : public Base, public Base_StringValue, public ListOf_<Resource> {
public:
    ResourceList();
    // cppcheck-suppress noExplicitConstructor ; converting, as declared: a name stands wherever a
    // list is expected
    ResourceList(std::string const& name);

    std::string const& __StringValue() const override;
};

} // namespace Quorvex::VPD
