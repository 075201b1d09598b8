#include "history/HistoryDatabase.h"

#include "history/ChangeRecorder.h"
#include "history/HistoryError.h"
#include "history/Migrations.h"
#include "history/RunRecorder.h"
#include "history/SqliteFailure.h"
#include "report/HistoryBusyTimeout.h"
#include "utility/SystemError.h"

#include <SQLiteCpp/Statement.h>
#include <SQLiteCpp/Transaction.h>
#include <sqlite3.h>

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstdint>
#include <ctime>
#include <filesystem>
#include <sstream>
#include <utility>

namespace history {

namespace {

namespace fs = std::filesystem;

// The page cache of the connection that records a run, in KiB (SQLite takes
// a negative size as KiB). A run of a whole estate inserts its documents'
// hashes at random places in two indexes: with SQLite's 2 MB default the
// same pages are spilled to the WAL and read back again and again inside the
// one transaction. The cache grows only as far as a run needs it.
constexpr int gc_RecordingCacheKiB = 16384;

// The folder and the file are made here, so that a failure carries errno's
// text; SQLite says only "unable to open database file". The file is
// opened for writing without being truncated: an existing one is left as
// it is until it is proven a history database.
void makeFile(std::string const& path) {
    std::string const folder = fs::path(path).parent_path().string();
    std::error_code error;
    if (!folder.empty()) {
        fs::create_directories(folder, error);
    }
    if (error) {
        throw util::SystemError("create", folder, error.value());
    }
    bool const exists = fs::exists(path, error);
    int const descriptor = ::open(path.c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0644);
    if (descriptor < 0) {
        throw util::SystemError(exists ? "open" : "create", path, errno);
    }
    ::close(descriptor);
}

SQLite::Database openFile(std::string const& path) {
    makeFile(path);
    try {
        return SQLite::Database(path, SQLite::OPEN_READWRITE,
                                report::gc_HistoryBusyTimeoutMilliseconds);
    } catch (SQLite::Exception const& failure) {
        throw HistoryError(failure.what());
    }
}

std::string leftAsItIs(std::string const& why) {
    return "it is not a quorvex-survey history database (" + why + "); it was left as it is";
}

std::string applicationIdText(int applicationId) {
    std::ostringstream text;
    text << "its application id is 0x" << std::hex << static_cast<std::uint32_t>(applicationId);
    return text.str();
}

bool isEmptyFile(SQLite::Database& database) {
    return database.execAndGet("SELECT count(*) FROM sqlite_master").getInt() == 0;
}

// A file of random bytes or cut short fails the first read: SQLite says
// "file is not a database".
int applicationIdOf(SQLite::Database& database) {
    try {
        return database.execAndGet("PRAGMA application_id").getInt();
    } catch (SQLite::Exception const& failure) {
        int const code = failure.getErrorCode();
        if (code == SQLITE_NOTADB || code == SQLITE_CORRUPT) {
            throw HistoryError(leftAsItIs(failure.what()));
        }
        throw;
    }
}

void checkSchemaVersion(SQLite::Database& database) {
    int const version = schemaVersion(database);
    if (version > newestSchemaVersion()) {
        throw HistoryError("its schema is version " + std::to_string(version) +
                           ", newer than this quorvex-survey knows (versions up to " +
                           std::to_string(newestSchemaVersion()) +
                           "); it was left as it is: use a newer quorvex-survey, or another file");
    }
}

// Nothing is written before the file is known to be ours or empty.
void checkOwnership(SQLite::Database& database) {
    int const applicationId = applicationIdOf(database);
    if (applicationId == gc_ApplicationId) {
        checkSchemaVersion(database);
        return;
    }
    if (applicationId != 0) {
        throw HistoryError(leftAsItIs(applicationIdText(applicationId)));
    }
    if (schemaVersion(database) != 0 || !isEmptyFile(database)) {
        throw HistoryError(leftAsItIs("it holds another program's tables"));
    }
}

} // namespace

HistoryDatabase::HistoryDatabase(std::string path)
    : _path(std::move(path)), _database(openFile(_path)) {
    try {
        _prepare();
    } catch (SQLite::Exception const& failure) {
        throw historyErrorOf(failure, _database);
    }
}

void HistoryDatabase::_prepare() {
    checkOwnership(_database);
    _database.exec("PRAGMA journal_mode = WAL");
    _database.exec("PRAGMA foreign_keys = ON");
    _database.exec("PRAGMA cache_size = -" + std::to_string(gc_RecordingCacheKiB));
    migrate(_database);
}

std::string const& HistoryDatabase::path() const {
    return _path;
}

SQLite::Database& HistoryDatabase::connection() {
    return _database;
}

long long HistoryDatabase::recordRun(report::RunSummary const& summary,
                                     nlohmann::ordered_json const& summaryDocument,
                                     std::string const& documentFolder) {
    try {
        SQLite::Transaction transaction(_database, SQLite::TransactionBehavior::IMMEDIATE);
        long long const runId =
            RunRecorder(_database).record(summary, summaryDocument, std::time(nullptr));
        ChangeRecorder(documentFolder).record(_database, runId);
        transaction.commit();
        return runId;
    } catch (SQLite::Exception const& failure) {
        throw historyErrorOf(failure, _database);
    }
}

void HistoryDatabase::amendRun(long long runId, report::RunSummary const& summary,
                               nlohmann::ordered_json const& summaryDocument) {
    try {
        SQLite::Transaction transaction(_database, SQLite::TransactionBehavior::IMMEDIATE);
        RunRecorder(_database).amend(runId, summary, summaryDocument);
        transaction.commit();
    } catch (SQLite::Exception const& failure) {
        throw historyErrorOf(failure, _database);
    }
}

} // namespace history
