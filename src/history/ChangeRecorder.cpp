#include "history/ChangeRecorder.h"

#include <utility>

namespace history {

ChangeRecorder::ChangeRecorder(std::string documentFolder)
    : _documentFolder(std::move(documentFolder)) {}

void ChangeRecorder::record(SQLite::Database& /*db*/, long long /*runId*/) const {}

} // namespace history
