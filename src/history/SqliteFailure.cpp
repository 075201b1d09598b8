#include "history/SqliteFailure.h"

#include "report/HistoryBusyTimeout.h"

#include <sqlite3.h>

#include <string>
#include <system_error>

namespace history {

namespace {

// The failures that come from a system call, whose errno says more than
// SQLite's own words.
bool isFileSystemFailure(int code) {
    // A write that fails other than for want of room (SQLITE_IOERR, "disk
    // I/O error") keeps its errno in the file SQLite wrote, out of reach:
    // SQLite's own words are all there is then.
    return code == SQLITE_CANTOPEN || code == SQLITE_IOERR || code == SQLITE_READONLY ||
           code == SQLITE_FULL || code == SQLITE_PERM;
}

std::string lockedReason() {
    return "the database is locked: another process has held it for more than " +
           std::to_string(report::gc_HistoryBusyTimeoutMilliseconds / 1000) + " s";
}

} // namespace

HistoryError historyErrorOf(SQLite::Exception const& failure, SQLite::Database const& database) {
    int const code = failure.getErrorCode();
    if (code == SQLITE_BUSY || code == SQLITE_LOCKED) {
        return HistoryError(lockedReason());
    }
    int const systemError = sqlite3_system_errno(database.getHandle());
    if (isFileSystemFailure(code) && systemError != 0) {
        return HistoryError(std::string(failure.what()) + ": " +
                            std::generic_category().message(systemError));
    }
    return HistoryError(failure.what());
}

} // namespace history
