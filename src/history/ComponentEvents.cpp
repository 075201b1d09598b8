#include "history/ComponentEvents.h"

#include "history/ComponentChange.h"
#include "history/InventoryState.h"
#include "history/StoredComponent.h"

#include <SQLiteCpp/Statement.h>

#include <optional>
#include <string>

namespace history {

namespace {

// The inventory read whole before: in the machine's previous record when it
// was read there, else the latest earlier one (a partition whose survey
// failed in between compares with its last inventory).
std::string changedDocuments() {
    return "WITH " + previousRecords() +
           "SELECT machine, partition, before, after FROM (SELECT c.machine, c.partition,"
           "  c.document_hash AS after,"
           "  CASE WHEN p.inventory = '" +
           gc_InventoryRead +
           "' THEN p.document_hash ELSE (SELECT x.document_hash"
           "    FROM partition_results AS x JOIN runs AS r ON r.id = x.run_id"
           "    WHERE x.machine = c.machine AND x.partition = c.partition AND x.run_id < :run"
           "      AND x.inventory = '" +
           gc_InventoryRead +
           "' AND r.console = :console"
           "    ORDER BY x.run_id DESC LIMIT 1) END AS before"
           " FROM partition_results AS c JOIN previous AS m ON m.machine = c.machine AND m.listed"
           " LEFT JOIN partition_results AS p"
           "  ON p.run_id = m.run_id AND p.machine = c.machine AND p.partition = c.partition"
           " WHERE c.run_id = :run AND c.inventory = '" +
           gc_InventoryRead +
           "')"
           " WHERE before IS NOT NULL AND before <> after ORDER BY machine, partition";
}

constexpr char gc_InsertEvent[] =
    "INSERT INTO events (run_id, scope, kind, machine, partition, component, component_name,"
    " property, old_value, new_value) VALUES (?, 'component', ?, ?, ?, ?, ?, ?, ?, ?)";

void bindOptional(SQLite::Statement& statement, int index, std::optional<std::string> const& text) {
    if (text) {
        statement.bind(index, *text);
    } else {
        statement.bind(index);
    }
}

// Writes one partition's changes with the prepared insert.
class EventWriter {
public:
    EventWriter(SQLite::Database& db, long long run) : _insert(db, gc_InsertEvent), _run(run) {}

    void write(std::string const& machine, std::string const& partition,
               ComponentChange const& change) {
        _insert.bind(1, static_cast<std::int64_t>(_run));
        _insert.bind(2, change.kind);
        _insert.bind(3, machine);
        _insert.bind(4, partition);
        _insert.bind(5, change.key);
        _insert.bind(6, change.displayName);
        bindOptional(_insert, 7, change.property);
        bindOptional(_insert, 8, change.oldValue);
        bindOptional(_insert, 9, change.newValue);
        _insert.exec();
        _insert.reset();
    }

private:
    SQLite::Statement _insert;
    long long _run;
};

std::vector<StoredComponent> componentsOf(SQLite::Statement& select, std::string const& hash) {
    select.reset();
    select.bind(1, hash);
    if (!select.executeStep()) {
        return {};
    }
    return decodeComponents(select.getColumn(0).getString());
}

} // namespace

void insertComponentEvents(SQLite::Database& db, RunPair const& runs) {
    if (!runs.previous) {
        return;
    }
    SQLite::Statement changed(db, changedDocuments());
    bindRuns(changed, runs);
    SQLite::Statement components(db, "SELECT components FROM documents WHERE hash = ?");
    EventWriter writer(db, runs.run);
    while (changed.executeStep()) {
        std::string const machine = changed.getColumn(0).getString();
        std::string const partition = changed.getColumn(1).getString();
        std::vector<StoredComponent> const before =
            componentsOf(components, changed.getColumn(2).getString());
        std::vector<StoredComponent> const after =
            componentsOf(components, changed.getColumn(3).getString());
        for (ComponentChange const& change : compareComponents(before, after)) {
            writer.write(machine, partition, change);
        }
    }
}

} // namespace history
