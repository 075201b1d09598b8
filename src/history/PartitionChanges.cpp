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

std::string carriedStates() {
    return "UPDATE partition_results AS c SET"
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
           " FROM partition_results AS p"
           " WHERE c.run_id = :run AND p.run_id = :previous"
           "   AND p.machine = c.machine AND p.partition = c.partition";
}

// A partition missing from the previous run (it disappeared, or its
// machine could not be listed) may have been surveyed before that.
std::string earlierSurveys() {
    return "UPDATE partition_results AS c SET last_surveyed_run ="
           " (SELECT max(x.last_surveyed_run) FROM partition_results AS x"
           "   JOIN runs AS r ON r.id = x.run_id"
           "   WHERE x.machine = c.machine AND x.partition = c.partition"
           "     AND x.run_id < :run AND r.console = :console)"
           " WHERE c.run_id = :run AND c.last_surveyed_run IS NULL"
           "   AND NOT EXISTS (SELECT 1 FROM partition_results AS p WHERE p.run_id = :previous"
           "     AND p.machine = c.machine AND p.partition = c.partition)";
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
        "INSERT INTO events (run_id, scope, kind, machine, reason)"
        " SELECT :run, 'machine', kind, machine, reason FROM ("
        "  SELECT c.machine, 'appeared' AS kind, 0 AS rank, NULL AS reason"
        "   FROM machine_results AS c"
        "   WHERE c.run_id = :run AND NOT EXISTS (SELECT 1 FROM machine_results AS p"
        "     WHERE p.run_id = :previous AND p.machine = c.machine)"
        "  UNION ALL SELECT p.machine, 'disappeared', 1, NULL FROM machine_results AS p"
        "   WHERE p.run_id = :previous AND NOT EXISTS (SELECT 1 FROM machine_results AS c"
        "     WHERE c.run_id = :run AND c.machine = p.machine)"
        "  UNION ALL SELECT c.machine, 'listing_failed', 2,"
        "   json_extract(c.listing_failure, '$.command') || ' exited with status ' ||"
        "   json_extract(c.listing_failure, '$.exit_status') || ': ' ||"
        "   json_extract(c.listing_failure, '$.message') FROM machine_results AS c"
        "   LEFT JOIN machine_results AS p ON p.run_id = :previous AND p.machine = c.machine"
        "   WHERE c.run_id = :run AND c.listing_failure IS NOT NULL AND p.listing_failure IS NULL"
        "  UNION ALL SELECT c.machine, 'listing_recovered', 3, NULL FROM machine_results AS c"
        "   JOIN machine_results AS p ON p.run_id = :previous AND p.machine = c.machine"
        "   WHERE c.run_id = :run AND c.listing_failure IS NULL"
        "     AND p.listing_failure IS NOT NULL"
        " ) ORDER BY machine, rank",
        runs);
}

namespace {

// Each partition of the run with its record in the previous run: whether it
// had one, whether it was failing there (an interrupted record carries the
// state before it), and its outcome there, or the last one before that run
// when it was interrupted; without one, the console's latest earlier run
// whose listing of its machine did not fail.
std::string partitionPairs() {
    return "WITH pairs AS (SELECT c.machine, c.partition, c.outcome, c.reason,"
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
           "  CASE WHEN p.partition IS NULL THEN (SELECT max(r.id) FROM runs AS r"
           "    WHERE r.console = :console AND r.id < :run AND NOT EXISTS (SELECT 1"
           "      FROM machine_results AS m WHERE m.run_id = r.id AND m.machine = c.machine"
           "        AND m.listing_failure IS NOT NULL)) END AS last_listing"
           " FROM partition_results AS c LEFT JOIN partition_results AS p"
           "  ON p.run_id = :previous AND p.machine = c.machine AND p.partition = c.partition"
           " WHERE c.run_id = :run) ";
}

// Partitions of a machine whose listing failed are neither gone nor new:
// the console did not say which partitions it has.
std::string listingFailedIn(char const* run) {
    return std::string("(SELECT machine FROM machine_results WHERE run_id = ") + run +
           " AND listing_failure IS NOT NULL)";
}

// A partition not in the previous run is new when the console's latest
// earlier run whose listing of its machine did not fail (one without the
// machine included) did not list it either: the partitions of a machine
// whose listing failed are unknown there, so the run before that one tells
// whether a partition is back or new. When every earlier run's listing of
// the machine failed, there is nothing to compare with, as in a console's
// first run.
std::string appearedPartitions() {
    return "pairs WHERE NOT known AND NOT EXISTS (SELECT 1 FROM partition_results AS x"
           "  WHERE x.machine = pairs.machine AND x.partition = pairs.partition"
           "    AND x.run_id = pairs.last_listing)"
           " AND last_listing IS NOT NULL";
}

std::string partitionEvents() {
    std::string const columns = "machine, partition, outcome, reason, ";
    return partitionPairs() +
           "SELECT :run, 'partition', kind, machine, partition, outcome, reason, since, count"
           " FROM (SELECT " +
           columns +
           "NULL AS since, NULL AS count, 'appeared' AS kind,"
           "  0 AS rank FROM " +
           appearedPartitions() + " UNION ALL SELECT " + columns +
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
           "  FROM partition_results AS p WHERE p.run_id = :previous"
           "   AND NOT EXISTS (SELECT 1 FROM partition_results AS c WHERE c.run_id = :run"
           "     AND c.machine = p.machine AND c.partition = p.partition)"
           "   AND p.machine NOT IN " +
           listingFailedIn(":run") + ") ORDER BY machine, partition, rank";
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
