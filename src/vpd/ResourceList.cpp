#include "vpd/ResourceList.h"

namespace Quorvex::VPD {

ResourceList::ResourceList() = default;

ResourceList::ResourceList(std::string const& name) : Base(name) {}

std::string const& ResourceList::__StringValue() const {
    return get_DisplayName();
}

} // namespace Quorvex::VPD
