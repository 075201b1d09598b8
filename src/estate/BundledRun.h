#pragma once

#include "report/RunSummary.h"

#include <nlohmann/json.hpp>

namespace estate {

// A console's summary document (docs/summary.schema.json) read back into the
// run it tells, as the history records a run: its console, times, exit
// status, machines and partitions. What the history does not keep (options,
// elapsed time) is left as it is by default. Throws MalformedInput naming
// the member that is missing or of the wrong type, or an unknown outcome.
report::RunSummary bundledRun(nlohmann::ordered_json const& summary);

} // namespace estate
