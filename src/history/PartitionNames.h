#pragma once

#include "report/RunSummary.h"

#include <string>
#include <vector>

namespace history {

// The name each partition of one machine has in the history, in listing
// order: its host name as listed, and for a host listed again on the same
// machine "<host> #2", "<host> #3", ... With the console and the machine,
// it is what identifies a partition from one run to the next.
std::vector<std::string> partitionNames(std::vector<report::PartitionSummary> const& partitions);

} // namespace history
