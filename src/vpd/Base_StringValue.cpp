#include "vpd/Base_StringValue.h"

namespace Quorvex::VPD {

Base_StringValue::operator std::string() const {
    return __StringValue();
}

} // namespace Quorvex::VPD
