#pragma once

#include <nlohmann/json.hpp>

#include <string>
#include <vector>

namespace report {

// The names the history database gives a machine's partitions, in the
// summary's listing order: the host name as listed, and for a host listed
// again on the same machine "<host> #2", "<host> #3"... (docs/history.md).
// The report finds each row's history under (machine, this name).
std::vector<std::string> historyPartitionNames(nlohmann::ordered_json const& partitions);

// The name the history gives a machine of the summary: its identity; "" for
// a machine without one.
std::string historyMachineName(nlohmann::ordered_json const& machine);

} // namespace report
