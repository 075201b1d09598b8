#pragma once

#include "vpd/Base.h"
#include "vpd/Base_StringValue.h"
#include "vpd/ListOf_Properties.h"

#include <string>

namespace Quorvex::VPD {

// Properties under a common name. Keyed by that name; two groups of one name
// merge into one holding the union of their properties.
class PropertyGroup : public Base, public Base_StringValue, public ListOf_Properties {
public:
    PropertyGroup();
    // cppcheck-suppress noExplicitConstructor ; converting, as declared: a name stands wherever a
    // group is expected
    PropertyGroup(std::string const& name);

    std::string const& __StringValue() const override;
};

} // namespace Quorvex::VPD
