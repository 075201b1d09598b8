#pragma once

#include "report/Outcome.h"

namespace history {

// Whether a partition that ended so counts as failing in the history
// (docs/history.md): channel_failure, client_failure, fetch_failure,
// timed_out and worker_died. Unlike report::isFailure, an interrupted
// partition is not failing: the run stopped before it, so it carries its
// previous state on; an inactive one is not failing either.
bool isFailing(report::Outcome outcome);

} // namespace history
