#include "estate/ConsoleChanges.h"

namespace estate {

ConsoleChanges changesOf(report::SinceLastRun const& since) {
    ConsoleChanges changes;
    changes.unavailable = since.unavailable;
    if (!since.unavailable) {
        changes.runId = since.runId;
        changes.previousRunId = since.previousRunId;
    }
    changes.newFailures = since.newFailures.size();
    changes.recoveries = since.recoveries.size();
    changes.inventoryChanges = since.inventoryChanges.size();
    return changes;
}

} // namespace estate
