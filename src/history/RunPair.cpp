#include "history/RunPair.h"

#include <cstdint>

namespace history {

void bindRuns(SQLite::Statement& statement, RunPair const& runs) {
    if (int const index = statement.getIndex(":run"); index != 0) {
        statement.bind(index, static_cast<std::int64_t>(runs.run));
    }
    if (int const index = statement.getIndex(":console"); index != 0) {
        statement.bind(index, runs.console);
    }
}

std::string const& previousRecords() {
    static std::string const sql =
        "previous (machine, run_id, listed) AS MATERIALIZED ("
        " SELECT c.machine, (SELECT x.run_id FROM machine_results AS x"
        "   JOIN runs AS r ON r.id = x.run_id"
        "   WHERE x.machine = c.machine AND x.run_id < :run AND r.console = :console"
        "   ORDER BY x.run_id DESC LIMIT 1), 1"
        "  FROM machine_results AS c WHERE c.run_id = :run"
        " UNION ALL SELECT x.machine, max(x.run_id), 0 FROM machine_results AS x"
        "  JOIN runs AS r ON r.id = x.run_id"
        "  WHERE r.console = :console AND x.run_id < :run"
        "   AND x.run_id >= coalesce((SELECT max(a.id) FROM runs AS a"
        "     WHERE a.console = :console AND a.id < :run AND a.all_machines), 0)"
        "   AND (SELECT all_machines FROM runs WHERE id = :run)"
        "   AND NOT EXISTS (SELECT 1 FROM machine_results AS c"
        "     WHERE c.run_id = :run AND c.machine = x.machine)"
        "  GROUP BY x.machine) ";
    return sql;
}

void executeForRuns(SQLite::Database& db, std::string const& sql, RunPair const& runs) {
    SQLite::Statement statement(db, sql);
    bindRuns(statement, runs);
    statement.exec();
}

} // namespace history
