#pragma once

#include "history/RunPair.h"

#include <SQLiteCpp/Database.h>

#include <string>

namespace history {

// Completes a run's record in the history with what its documents hold and
// what changed since each machine's previous record (docs/history.md,
// "Inventory" and "Changes"). The run's rows in runs, machine_results and
// partition_results are in place; record() runs inside the transaction that
// wrote them, so the run is recorded whole or not at all.
class ChangeRecorder {
public:
    // documentFolder: where the run's VPD documents are; a partition's
    // document is read there under the base name of the path the run wrote.
    explicit ChangeRecorder(std::string documentFolder);

    // Reads the documents of the run's partitions into the history (a
    // content it holds already is not read again), sets each partition
    // result's inventory, its failing streak and last survey, and inserts
    // the run's events.
    void record(SQLite::Database& db, long long runId) const;

private:
    std::string _documentFolder;

    void _readDocuments(SQLite::Database& db, RunPair const& runs) const;
};

} // namespace history
