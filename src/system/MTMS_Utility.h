#pragma once

#include <string>

namespace Quorvex::System::MTMS_Utility {

// Cuts a machine name at its LAST "_": typeModel gets the text before it,
// serial the text after it. Without any "_" both get the whole name, because
// the position after "not found" wraps to 0 in 32 bits.
void u_split_TM_SE(std::string const& name, std::string& typeModel, std::string& serial);

} // namespace Quorvex::System::MTMS_Utility
