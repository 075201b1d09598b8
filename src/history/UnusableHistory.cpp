#include "history/UnusableHistory.h"

namespace history {

UnusableHistory::UnusableHistory(std::string const& message, int exitStatus)
    : std::runtime_error(message), _exitStatus(exitStatus) {}

int UnusableHistory::exitStatus() const {
    return _exitStatus;
}

} // namespace history
