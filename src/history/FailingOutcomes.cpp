#include "history/FailingOutcomes.h"

namespace history {

bool isFailing(report::Outcome outcome) {
    return report::isFailure(outcome) && outcome != report::Outcome::Interrupted;
}

} // namespace history
