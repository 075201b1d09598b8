#include "vpd/Base_StringValue.h"

namespace Quorvex {
namespace VPD {

Base_StringValue::operator std::string() const {
    return __StringValue();
}

} // namespace VPD
} // namespace Quorvex
