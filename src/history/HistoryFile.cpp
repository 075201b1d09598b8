#include "history/HistoryFile.h"

#include "history/UnusableHistory.h"
#include "report/HistoryBusyTimeout.h"

#include <fcntl.h>
#include <sqlite3.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>

namespace history {

namespace {

// What the person at the terminal can do about a file that cannot be
// opened: a file that is not there is most often the default one on a
// machine where no run has recorded its history yet.
std::string remedyFor(int error) {
    return error == ENOENT
               ? " (no run has been recorded there yet; choose another file with --history FILE)"
               : "";
}

// Whether the file can be opened at all, said with errno's text: SQLite
// would only say "unable to open database file".
void checkReadable(std::string const& path, int mode) {
    int const descriptor = ::open(path.c_str(), mode | O_CLOEXEC);
    if (descriptor < 0) {
        int const error = errno;
        throw UnusableHistory(std::string("cannot ") + (mode == O_RDONLY ? "read " : "write ") +
                                  path + ": " + std::strerror(error) + remedyFor(error),
                              gc_ExitNoInput);
    }
    ::close(descriptor);
}

int pragmaNumber(SQLite::Database& database, char const* pragma) {
    return database.execAndGet(std::string("PRAGMA ") + pragma).getInt();
}

// The marks the store leaves: its application id and a schema version
// this command knows.
void checkOurs(SQLite::Database& database, std::string const& path) {
    if (pragmaNumber(database, "application_id") != gc_ApplicationId) {
        throw UnusableHistory(path + " is not a quorvex-survey history database", gc_ExitDataError);
    }
    int const version = pragmaNumber(database, "user_version");
    if (version > newestSchemaVersion()) {
        throw UnusableHistory(path + " has schema version " + std::to_string(version) +
                                  ", newer than this program reads (" +
                                  std::to_string(newestSchemaVersion()) +
                                  "): use the quorvex-survey that wrote it",
                              gc_ExitDataError);
    }
    if (version < 1) {
        throw UnusableHistory(path + " holds no history yet (schema version 0)", gc_ExitDataError);
    }
}

SQLite::Database openChecked(std::string const& path, int descriptorMode, int sqliteFlags) {
    checkReadable(path, descriptorMode);
    try {
        SQLite::Database database(path, sqliteFlags, report::gc_HistoryBusyTimeoutMilliseconds);
        checkOurs(database, path);
        return database;
    } catch (SQLite::Exception const& failure) {
        throwUnusable(path, failure);
    }
}

} // namespace

SQLite::Database openHistoryForReading(std::string const& path) {
    return openChecked(path, O_RDONLY, SQLite::OPEN_READONLY);
}

SQLite::Database openHistoryForWriting(std::string const& path) {
    SQLite::Database database = openChecked(path, O_RDWR, SQLite::OPEN_READWRITE);
    try {
        database.exec("PRAGMA foreign_keys = ON");
    } catch (SQLite::Exception const& failure) {
        throwUnusable(path, failure);
    }
    return database;
}

void throwUnusable(std::string const& path, SQLite::Exception const& failure) {
    switch (failure.getErrorCode()) {
    case SQLITE_NOTADB:
    case SQLITE_CORRUPT:
        throw UnusableHistory(path + " is not a readable history database: " + failure.what(),
                              gc_ExitDataError);
    case SQLITE_BUSY:
    case SQLITE_LOCKED:
        throw UnusableHistory(path + " is locked: another process has held it for more than " +
                                  std::to_string(report::gc_HistoryBusyTimeoutMilliseconds / 1000) +
                                  " s",
                              gc_ExitTemporaryFailure);
    default:
        throw UnusableHistory(std::string("cannot use ") + path + ": " + failure.what(),
                              gc_ExitIoError);
    }
}

} // namespace history
