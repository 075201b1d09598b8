#pragma once

#include "system/Partition.h"

#include <ostream>

namespace DEBUG::Quorvex::System {

// Writes the record as one block of labelled lines, each indented by indent blanks.
void print_Partition(std::ostream& out, ::Quorvex::System::Partition const& partition,
                     unsigned int const& indent);

} // namespace DEBUG::Quorvex::System
