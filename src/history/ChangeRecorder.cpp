#include "history/ChangeRecorder.h"

#include "history/ComponentEvents.h"
#include "history/DocumentIngest.h"
#include "history/InventoryState.h"
#include "history/PartitionChanges.h"
#include "history/RunPair.h"

#include <SQLiteCpp/Statement.h>

#include <algorithm>
#include <cstdint>
#include <stdexcept>
#include <thread>
#include <unordered_set>
#include <utility>
#include <vector>

namespace history {

namespace {

// A partition result of the run that names a document.
struct DocumentRow {
    std::string machine;
    std::string partition;
};

RunPair runPairOf(SQLite::Database& db, long long runId) {
    SQLite::Statement select(db, "SELECT console, (SELECT max(p.id) FROM runs AS p"
                                 " WHERE p.console = r.console AND p.id < r.id)"
                                 " FROM runs AS r WHERE r.id = ?");
    select.bind(1, static_cast<std::int64_t>(runId));
    if (!select.executeStep()) {
        throw std::invalid_argument("no run " + std::to_string(runId) + " in the history");
    }
    RunPair runs{runId, std::nullopt, select.getColumn(0).getString()};
    if (!select.getColumn(1).isNull()) {
        runs.previous = select.getColumn(1).getInt64();
    }
    return runs;
}

std::string baseName(std::string const& path) {
    std::size_t const slash = path.rfind('/');
    return slash == std::string::npos ? path : path.substr(slash + 1);
}

// The contents of the console's previous run: the documents that may not
// have changed. A content held for other runs only is read again, and its
// row is kept as it is.
std::unordered_set<std::string> knownHashes(SQLite::Database& db, RunPair const& runs) {
    std::unordered_set<std::string> hashes;
    SQLite::Statement select(db, "SELECT DISTINCT document_hash FROM partition_results"
                                 " WHERE run_id = :previous AND document_hash IS NOT NULL");
    bindRuns(select, runs);
    while (select.executeStep()) {
        hashes.insert(select.getColumn(0).getString());
    }
    return hashes;
}

unsigned readingThreads() {
    return std::max(1U, std::thread::hardware_concurrency());
}

// Writes each document's result as it comes: the content it has not seen,
// and the partition result's hash or why its document could not be read.
class DocumentWriter {
public:
    DocumentWriter(SQLite::Database& db, long long runId)
        : _insertDocument(db, "INSERT OR IGNORE INTO documents (hash, inventory, problem,"
                              " components) VALUES (?, ?, ?, ?)"),
          _setHash(db, "UPDATE partition_results SET document_hash = ?"
                       " WHERE run_id = ? AND machine = ? AND partition = ?"),
          _setMissing(db, std::string("UPDATE partition_results SET inventory = '") +
                              gc_InventoryMissing +
                              "', inventory_problem = ?"
                              " WHERE run_id = ? AND machine = ? AND partition = ?"),
          _runId(runId) {}

    void write(DocumentRow const& row, DocumentIngestResult&& result) {
        if (result.hash.empty()) {
            _update(_setMissing, row, result.readFailure);
            return;
        }
        if (result.reading) {
            _insert(result);
        }
        _update(_setHash, row, result.hash);
    }

private:
    SQLite::Statement _insertDocument;
    SQLite::Statement _setHash;
    SQLite::Statement _setMissing;
    long long _runId;

    void _insert(DocumentIngestResult const& result) {
        _insertDocument.bind(1, result.hash);
        _insertDocument.bind(2, result.reading->inventory);
        if (result.reading->problem) {
            _insertDocument.bind(3, *result.reading->problem);
        } else {
            _insertDocument.bind(3);
        }
        _insertDocument.bindNoCopy(4, result.reading->components);
        _insertDocument.exec();
        _insertDocument.reset();
    }

    void _update(SQLite::Statement& update, DocumentRow const& row, std::string const& value) {
        update.bind(1, value);
        update.bind(2, static_cast<std::int64_t>(_runId));
        update.bind(3, row.machine);
        update.bind(4, row.partition);
        update.exec();
        update.reset();
    }
};

} // namespace

ChangeRecorder::ChangeRecorder(std::string documentFolder)
    : _documentFolder(std::move(documentFolder)) {}

void ChangeRecorder::record(SQLite::Database& db, long long runId) const {
    RunPair const runs = runPairOf(db, runId);
    _readDocuments(db, runs);
    recordPartitionStates(db, runs);
    insertMachineEvents(db, runs);
    insertPartitionEvents(db, runs);
    insertComponentEvents(db, runs);
}

void ChangeRecorder::_readDocuments(SQLite::Database& db, RunPair const& runs) const {
    long long const runId = runs.run;
    std::vector<DocumentRow> rows;
    std::vector<std::string> paths;
    SQLite::Statement select(db, "SELECT machine, partition, document FROM partition_results"
                                 " WHERE run_id = ? AND document IS NOT NULL");
    select.bind(1, static_cast<std::int64_t>(runId));
    while (select.executeStep()) {
        rows.push_back({select.getColumn(0).getString(), select.getColumn(1).getString()});
        paths.push_back(_documentFolder + "/" + baseName(select.getColumn(2).getString()));
    }
    std::unordered_set<std::string> const known = knownHashes(db, runs);
    DocumentWriter writer(db, runId);
    DocumentIngest(known, readingThreads())
        .run(paths, [&](std::size_t index, DocumentIngestResult&& result) {
            writer.write(rows[index], std::move(result));
        });
    SQLite::Statement settle(db, "UPDATE partition_results SET (inventory, inventory_problem) ="
                                 " (SELECT inventory, problem FROM documents AS d"
                                 "  WHERE d.hash = partition_results.document_hash)"
                                 " WHERE run_id = ? AND document_hash IS NOT NULL");
    settle.bind(1, static_cast<std::int64_t>(runId));
    settle.exec();
}

} // namespace history
