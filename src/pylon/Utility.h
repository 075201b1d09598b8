#pragma once

#include "pylon/ListOf_Partitions.h"

namespace Quorvex::PYLON::Utility {

// Replaces the content of partitions with every partition of every managed
// machine of object type 0, sorted; returns their number.
int get_AllManagedPartitions(::Quorvex::PYLON::ListOf_Partitions& partitions);

} // namespace Quorvex::PYLON::Utility
