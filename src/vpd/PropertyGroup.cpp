#include "vpd/PropertyGroup.h"

namespace Quorvex::VPD {

PropertyGroup::PropertyGroup() = default;

PropertyGroup::PropertyGroup(std::string const& name) : Base(name) {}

std::string const& PropertyGroup::__StringValue() const {
    return get_DisplayName();
}

} // namespace Quorvex::VPD
