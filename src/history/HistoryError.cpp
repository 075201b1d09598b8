#include "history/HistoryError.h"

namespace history {

HistoryError::HistoryError(std::string const& reason) : std::runtime_error(reason) {}

} // namespace history
