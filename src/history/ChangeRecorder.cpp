#include "history/ChangeRecorder.h"

#include "history/ComponentEvents.h"
#include "history/DocumentIngest.h"
#include "history/InventoryState.h"
#include "history/KnownDocuments.h"
#include "history/PartitionChanges.h"
#include "history/RunPair.h"

#include <SQLiteCpp/Statement.h>

#include <algorithm>
#include <cstdint>
#include <optional>
#include <stdexcept>
#include <thread>
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
          _setInventory(db, "UPDATE partition_results SET document_hash = ?5, inventory = ?6,"
                            " inventory_problem = ?7"
                            " WHERE run_id = ?2 AND machine = ?3 AND partition = ?4"),
          _setMissing(db, std::string("UPDATE partition_results SET inventory = '") +
                              gc_InventoryMissing +
                              "', inventory_problem = ?5"
                              " WHERE run_id = ?2 AND machine = ?3 AND partition = ?4"),
          _runId(runId) {}

    // A content read now gives the partition's inventory at once; one held
    // already gives what reading it gave before.
    void write(DocumentRow const& row, DocumentIngestResult&& result) {
        if (result.hash.empty()) {
            _bindRow(_setMissing, row);
            _setMissing.bind(5, result.readFailure);
            _execute(_setMissing);
            return;
        }
        if (result.known != nullptr) {
            _setInventoryOf(row, result.hash, result.known->inventory, result.known->problem);
            return;
        }
        _insert(result);
        _setInventoryOf(row, result.hash, result.reading->inventory, result.reading->problem);
    }

private:
    SQLite::Statement _insertDocument;
    SQLite::Statement _setInventory;
    SQLite::Statement _setMissing;
    long long _runId;

    void _setInventoryOf(DocumentRow const& row, std::string const& hash,
                         std::string const& inventory, std::optional<std::string> const& problem) {
        _bindRow(_setInventory, row);
        _setInventory.bind(5, hash);
        _setInventory.bind(6, inventory);
        _bindProblem(_setInventory, 7, problem);
        _execute(_setInventory);
    }

    void _insert(DocumentIngestResult const& result) {
        _insertDocument.bind(1, result.hash);
        _insertDocument.bind(2, result.reading->inventory);
        _bindProblem(_insertDocument, 3, result.reading->problem);
        _insertDocument.bindNoCopy(4, result.reading->components);
        _execute(_insertDocument);
    }

    void _bindRow(SQLite::Statement& update, DocumentRow const& row) {
        update.bind(2, static_cast<std::int64_t>(_runId));
        update.bind(3, row.machine);
        update.bind(4, row.partition);
    }

    static void _bindProblem(SQLite::Statement& statement, int index,
                             std::optional<std::string> const& problem) {
        if (problem) {
            statement.bind(index, *problem);
        } else {
            statement.bind(index);
        }
    }

    static void _execute(SQLite::Statement& statement) {
        statement.exec();
        statement.reset();
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
    KnownDocuments const known = KnownDocuments::ofPreviousRecords(db, runs);
    DocumentWriter writer(db, runId);
    DocumentIngest(known, readingThreads())
        .run(paths, [&](std::size_t index, DocumentIngestResult&& result) {
            writer.write(rows[index], std::move(result));
        });
}

} // namespace history
