#include "vpd/ResourceList.h"

namespace Quorvex {
namespace VPD {

ResourceList::ResourceList() = default;

ResourceList::ResourceList(std::string const& name) : Base(name) {}

std::string const& ResourceList::__StringValue() const {
    return get_DisplayName();
}

} // namespace VPD
} // namespace Quorvex
