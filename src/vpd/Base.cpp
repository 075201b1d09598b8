#include "vpd/Base.h"

namespace Quorvex::VPD {

Base::Base() = default;

Base::Base(std::string const& displayName) : _DisplayName(displayName) {}

std::string const& Base::get_DisplayName() const {
    return _DisplayName;
}

void Base::set_DisplayName(std::string const& displayName) {
    _DisplayName = displayName;
}

} // namespace Quorvex::VPD
