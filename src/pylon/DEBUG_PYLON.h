#pragma once

#include "pylon/ListOf_Partitions.h"
#include "system/Partition.h"

namespace Quorvex::PYLON::DEBUG {

// Writes the record to standard output: a dashed rule, then one labelled line per field.
void print_Partition(::Quorvex::System::Partition const& partition);
// Prints every record of the list in list order.
void print_ListOf_Partitions(::Quorvex::PYLON::ListOf_Partitions const& partitions);

} // namespace Quorvex::PYLON::DEBUG
