#include "history/PartitionChanges.h"

#include "report/Outcome.h"

#include <SQLiteCpp/Statement.h>

#include <cstdint>
#include <string>

namespace history {

namespace {

// The outcomes that fail a partition, as an SQL list: every failure but
// "interrupted", which carries the partition's previous state on.
std::string const& failingOutcomes() {
    static std::string const list = [] {
        std::string text;
        for (report::OutcomeText const& row : report::outcomeTable()) {
            if (report::isFailure(row.outcome) && row.outcome != report::Outcome::Interrupted) {
                text += (text.empty() ? "(" : ", ") + std::string("'") + row.name + "'";
            }
        }
        return text + ")";
    }();
    return list;
}

std::string const& surveyed() {
    static std::string const name =
        std::string("'") + report::outcomeName(report::Outcome::Surveyed) + "'";
    return name;
}

std::string const& interrupted() {
    static std::string const name =
        std::string("'") + report::outcomeName(report::Outcome::Interrupted) + "'";
    return name;
}

std::string const& inactive() {
    static std::string const name =
        std::string("'") + report::outcomeName(report::Outcome::Inactive) + "'";
    return name;
}

std::string freshStates() {
    return "UPDATE partition_results SET"
           " failing_since_run = CASE WHEN outcome IN " +
           failingOutcomes() +
           " THEN :run END,"
           " runs_failing = CASE WHEN outcome IN " +
           failingOutcomes() +
           " THEN 1 END,"
           " last_surveyed_run = CASE WHEN outcome = " +
           surveyed() +
           " THEN :run END"
           " WHERE run_id = :run";
}

// The partition's row in its machine's previous record.
std::string carriedStates() {
    return "WITH " + previousRecords() +
           "UPDATE partition_results AS c SET"
           " failing_since_run = CASE WHEN c.outcome IN " +
           failingOutcomes() +
           "   THEN coalesce(p.failing_since_run, :run)"
           "   WHEN c.outcome = " +
           interrupted() +
           " THEN p.failing_since_run END,"
           " runs_failing = CASE WHEN c.outcome IN " +
           failingOutcomes() +
           "   THEN coalesce(p.runs_failing, 0) + 1"
           "   WHEN c.outcome = " +
           interrupted() +
           " THEN p.runs_failing END,"
           " last_surveyed_run = CASE WHEN c.outcome = " +
           surveyed() +
           "   THEN :run ELSE p.last_surveyed_run END"
           " FROM previous AS m JOIN partition_results AS p"
           "  ON p.run_id = m.run_id AND p.machine = m.machine"
           " WHERE c.run_id = :run AND m.listed AND c.machine = m.machine"
           "   AND p.partition = c.partition";
}

// A partition missing from its machine's previous record (it disappeared,
// or its machine could not be listed) may have been surveyed before that.
std::string earlierSurveys() {
    return "WITH " + previousRecords() +
           "UPDATE partition_results AS c SET last_surveyed_run ="
           " (SELECT max(x.last_surveyed_run) FROM partition_results AS x"
           "   JOIN runs AS r ON r.id = x.run_id"
           "   WHERE x.machine = c.machine AND x.partition = c.partition"
           "     AND x.run_id < :run AND r.console = :console)"
           " WHERE c.run_id = :run AND c.last_surveyed_run IS NULL"
           "   AND NOT EXISTS (SELECT 1 FROM previous AS m JOIN partition_results AS p"
           "     ON p.run_id = m.run_id AND p.machine = m.machine"
           "     WHERE m.machine = c.machine AND p.partition = c.partition)";
}

} // namespace

void recordPartitionStates(SQLite::Database& db, RunPair const& runs) {
    executeForRuns(db, freshStates(), runs);
    executeForRuns(db, carriedStates(), runs);
    executeForRuns(db, earlierSurveys(), runs);
}

void insertMachineEvents(SQLite::Database& db, RunPair const& runs) {
    if (!runs.previous) {
        return;
    }
    // A failed listing's reason reads as the run's other outputs (the JUnit
    // file, the report) tell it: "<command> exited with status N: <message>".
    executeForRuns(
        db,
        "WITH " + previousRecords() +
            "INSERT INTO events (run_id, scope, kind, machine, reason)"
            " SELECT :run, 'machine', kind, machine, reason FROM ("
            "  SELECT machine, 'appeared' AS kind, 0 AS rank, NULL AS reason FROM previous"
            "   WHERE listed AND run_id IS NULL"
            "  UNION ALL SELECT machine, 'disappeared', 1, NULL FROM previous WHERE NOT listed"
            "  UNION ALL SELECT c.machine, 'listing_failed', 2,"
            "   json_extract(c.listing_failure, '$.command') || ' exited with status ' ||"
            "   json_extract(c.listing_failure, '$.exit_status') || ': ' ||"
            "   json_extract(c.listing_failure, '$.message') FROM machine_results AS c"
            "   JOIN previous AS m ON m.machine = c.machine AND m.listed"
            "   LEFT JOIN machine_results AS p ON p.run_id = m.run_id AND p.machine = c.machine"
            "   WHERE c.run_id = :run AND c.listing_failure IS NOT NULL"
            "     AND p.listing_failure IS NULL"
            "  UNION ALL SELECT c.machine, 'listing_recovered', 3, NULL FROM machine_results AS c"
            "   JOIN previous AS m ON m.machine = c.machine AND m.listed"
            "   JOIN machine_results AS p ON p.run_id = m.run_id AND p.machine = c.machine"
            "   WHERE c.run_id = :run AND c.listing_failure IS NULL"
            "     AND p.listing_failure IS NOT NULL"
            " ) ORDER BY machine, rank",
        runs);
}

namespace {

// Each partition of the run with its record in its machine's previous
// record: whether it had one, whether the machine's listing failed there
// and, if so, whether the partition was listed by the machine's latest
// earlier listing that did not fail (a machine whose every listing failed
// counts as listed when it was there from the console's first run), whether
// it was failing there (an interrupted record carries the state before it),
// and its outcome there, or the last one before that run when it was
// interrupted.
std::string partitionPairs() {
    return "WITH " + previousRecords() +
           ", pairs AS (SELECT c.machine, c.partition, c.outcome, c.reason,"
           "  c.failing_since_run, c.runs_failing, p.partition IS NOT NULL AS known,"
           "  p.failing_since_run AS was_failing_since,"
           "  CASE WHEN p.outcome = " +
           interrupted() +
           " THEN (SELECT x.outcome"
           "    FROM partition_results AS x JOIN runs AS r ON r.id = x.run_id"
           "    WHERE x.machine = c.machine AND x.partition = c.partition AND x.run_id < :run"
           "      AND r.console = :console AND x.outcome <> " +
           interrupted() +
           "    ORDER BY x.run_id DESC LIMIT 1) ELSE p.outcome END AS was_outcome,"
           "  pm.listing_failure IS NOT NULL AND coalesce((SELECT EXISTS (SELECT 1"
           "    FROM partition_results AS y WHERE y.run_id = s.id AND y.machine = c.machine"
           "      AND y.partition = c.partition)"
           "    FROM (SELECT max(x.run_id) AS id FROM machine_results AS x"
           "      JOIN runs AS r ON r.id = x.run_id WHERE x.machine = c.machine"
           "        AND x.run_id < :run AND r.console = :console AND x.listing_failure IS NULL)"
           "      AS s WHERE s.id IS NOT NULL),"
           "   (SELECT min(x.run_id) FROM machine_results AS x JOIN runs AS r ON r.id = x.run_id"
           "     WHERE x.machine = c.machine AND r.console = :console) ="
           "   (SELECT min(id) FROM runs WHERE console = :console)) AS listed_before_failure"
           " FROM partition_results AS c JOIN previous AS m ON m.machine = c.machine AND m.listed"
           " LEFT JOIN machine_results AS pm ON pm.run_id = m.run_id AND pm.machine = c.machine"
           " LEFT JOIN partition_results AS p"
           "  ON p.run_id = m.run_id AND p.machine = c.machine AND p.partition = c.partition"
           " WHERE c.run_id = :run) ";
}

// Partitions of a machine whose listing failed in this run are not gone:
// the console did not say which partitions it has.
std::string listingFailedInThisRun() {
    return "(SELECT machine FROM machine_results WHERE run_id = :run"
           " AND listing_failure IS NOT NULL)";
}

std::string partitionEvents() {
    std::string const columns = "machine, partition, outcome, reason, ";
    return partitionPairs() +
           "SELECT :run, 'partition', kind, machine, partition, outcome, reason, since, count"
           " FROM (SELECT " +
           columns +
           "NULL AS since, NULL AS count, 'appeared' AS kind,"
           "  0 AS rank FROM pairs WHERE NOT known AND NOT listed_before_failure"
           " UNION ALL SELECT " +
           columns +
           "failing_since_run, runs_failing, 'newly_failing', 1"
           "  FROM pairs WHERE outcome IN " +
           failingOutcomes() +
           " AND runs_failing = 1"
           " UNION ALL SELECT " +
           columns +
           "failing_since_run, runs_failing, 'still_failing', 2"
           "  FROM pairs WHERE outcome IN " +
           failingOutcomes() +
           " AND runs_failing > 1"
           " UNION ALL SELECT " +
           columns +
           "NULL, NULL, 'recovered', 3"
           "  FROM pairs WHERE outcome = " +
           surveyed() +
           " AND was_failing_since IS NOT NULL"
           " UNION ALL SELECT " +
           columns +
           "NULL, NULL, 'newly_inactive', 4"
           "  FROM pairs WHERE outcome = " +
           inactive() + " AND was_outcome IS NOT " + inactive() +
           " UNION ALL SELECT p.machine, p.partition, NULL, NULL, NULL, NULL, 'disappeared', 5"
           "  FROM previous AS m JOIN partition_results AS p"
           "   ON p.run_id = m.run_id AND p.machine = m.machine"
           "  WHERE NOT EXISTS (SELECT 1 FROM partition_results AS c WHERE c.run_id = :run"
           "     AND c.machine = p.machine AND c.partition = p.partition)"
           "   AND p.machine NOT IN " +
           listingFailedInThisRun() + ") ORDER BY machine, partition, rank";
}

} // namespace

void insertPartitionEvents(SQLite::Database& db, RunPair const& runs) {
    if (!runs.previous) {
        return;
    }
    executeForRuns(db,
                   "INSERT INTO events (run_id, scope, kind, machine, partition, outcome, reason,"
                   " failing_since_run, runs_failing) " +
                       partitionEvents(),
                   runs);
}

} // namespace history
