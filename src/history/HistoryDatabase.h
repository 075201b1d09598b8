#pragma once

#include "report/RunSummary.h"

#include <SQLiteCpp/Database.h>

#include <nlohmann/json.hpp>

#include <string>

namespace history {

// Where quorvex-survey records its runs unless told otherwise (--history).
inline constexpr char gc_DefaultHistoryFile[] = "/var/lib/quorvex-survey/history.sqlite";

// The history database of quorvex-survey runs (docs/history.md), open for
// writing. Opening it makes its folder and the file when missing, puts it in
// WAL mode (readers never wait for a writer), sets the busy timeout every
// program of the history shares (report/HistoryBusyTimeout.h) and turns
// foreign keys on, proves that the file is a history database, and brings
// its schema to the newest version. A
// file that is not one (another program's database, random bytes) or whose
// schema is newer than this program knows is refused and left as it is.
//
// Failures are thrown as HistoryError, whose what() is the reason in plain
// words ("the database is locked: another process has held it for more
// than 5 s"), or util::SystemError for the folder or file that cannot be
// made or opened.
class HistoryDatabase {
public:
    explicit HistoryDatabase(std::string path);

    std::string const& path() const;
    // The open connection, for the readers and writers built on the tables.
    SQLite::Database& connection();

    // Records one run in one transaction: its run, machine and partition
    // rows (RunRecorder), then its changes against the console's previous
    // run (ChangeRecorder, which reads the run's VPD documents from
    // documentFolder). Returns the run's id. summaryDocument is the document
    // kept whole in runs.summary; its history member, when it is an object,
    // is given the run's id as run_id. A failure, or a process killed on the
    // way, leaves the database without any of it.
    long long recordRun(report::RunSummary const& summary,
                        nlohmann::ordered_json const& summaryDocument,
                        std::string const& documentFolder);

    // Replaces what a recorded run's row says of how the run ended (exit
    // status, interrupting signal, summary document), for a run whose last
    // files were written again because a signal came while they were
    // written. Its partitions and changes stay as recorded.
    void amendRun(long long runId, report::RunSummary const& summary,
                  nlohmann::ordered_json const& summaryDocument);

private:
    void _prepare();

    std::string _path;
    SQLite::Database _database;
};

} // namespace history
