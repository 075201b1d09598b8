#include "system/MTMS_Utility.h"

#include "system/MTMS.h"

#include <cstdint>

namespace Quorvex::System::MTMS_Utility {

void u_split_TM_SE(std::string const& name, std::string& typeModel, std::string& serial) {
    // Without "_" the position is 0xFFFFFFFF and the serial start wraps to 0:
    // both parts are the whole name. Kept for the console's tools: see
    // docs/compatibility.md#identity-without-underscore
    auto const position = static_cast<std::uint32_t>(name.rfind(gc_TM_SE_Delimiter));
    std::uint32_t const serialStart = position + 1U;
    typeModel = name.substr(0, position);
    serial = name.substr(serialStart);
}

} // namespace Quorvex::System::MTMS_Utility
