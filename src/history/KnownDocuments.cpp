#include "history/KnownDocuments.h"

#include <SQLiteCpp/Statement.h>

#include <utility>

namespace history {

// A content held for other runs only is read again, and its row in the
// documents table is kept as it is.
KnownDocuments KnownDocuments::ofPreviousRecords(SQLite::Database& db, RunPair const& runs) {
    KnownDocuments known;
    SQLite::Statement select(db, "WITH " + previousRecords() +
                                     "SELECT DISTINCT p.document_hash, p.inventory,"
                                     " p.inventory_problem FROM previous AS m"
                                     " JOIN partition_results AS p"
                                     "  ON p.run_id = m.run_id AND p.machine = m.machine"
                                     " WHERE m.listed AND p.document_hash IS NOT NULL");
    bindRuns(select, runs);
    while (select.executeStep()) {
        Known entry{select.getColumn(1).getString(), std::nullopt};
        if (!select.getColumn(2).isNull()) {
            entry.problem = select.getColumn(2).getString();
        }
        known.add(select.getColumn(0).getString(), std::move(entry));
    }
    return known;
}

void KnownDocuments::add(std::string const& hash, Known known) {
    _byHash.emplace(hash, std::move(known));
}

KnownDocuments::Known const* KnownDocuments::find(std::string const& hash) const {
    auto const found = _byHash.find(hash);
    return found == _byHash.end() ? nullptr : &found->second;
}

} // namespace history
