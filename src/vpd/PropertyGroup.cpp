#include "vpd/PropertyGroup.h"

namespace Quorvex {
namespace VPD {

PropertyGroup::PropertyGroup() = default;

PropertyGroup::PropertyGroup(std::string const& name) : Base(name) {}

std::string const& PropertyGroup::__StringValue() const {
    return get_DisplayName();
}

} // namespace VPD
} // namespace Quorvex
