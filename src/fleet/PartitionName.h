#pragma once

#include "system/Partition.h"

#include <string>

namespace fleet {

// The name a person knows a partition by, as the progress line and the
// recap show it: its host name, or its identity ("9119-MHE_21ABCDE-7") when
// the console gives it none.
std::string shownName(Quorvex::System::Partition const& partition);

} // namespace fleet
