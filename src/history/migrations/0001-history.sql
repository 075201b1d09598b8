-- The history of quorvex-survey runs, schema version 1 (docs/history.md).
-- Each migration file takes the database from the version before it to its
-- own number; the programs set PRAGMA user_version after running it, in the
-- same transaction.

-- One row per recorded run, of one console. Ids grow in recording order,
-- which is the order runs follow one another whatever the clocks said.
CREATE TABLE runs (
    id             INTEGER PRIMARY KEY AUTOINCREMENT,
    console        TEXT    NOT NULL,  -- the summary's console_host
    tool           TEXT    NOT NULL,  -- "quorvex-survey", "quorvex-survey report", ...
    started        TEXT    NOT NULL,  -- as in the summary: ISO 8601 with offset
    ended          TEXT    NOT NULL,
    started_unix   INTEGER NOT NULL,  -- the same instant in seconds, for --since
    recorded_unix  INTEGER NOT NULL,  -- when the run was recorded
    exit_status    INTEGER,           -- null when the summary has none
    return_code    TEXT    NOT NULL,  -- "0", "4" or "8"
    interrupted    TEXT,              -- SIGINT, SIGTERM, SIGHUP, SIGPIPE or null
    partitions     INTEGER NOT NULL,  -- listed partitions
    surveyed       INTEGER NOT NULL,
    failed         INTEGER NOT NULL,  -- failing partitions (see docs/history.md)
    summary        TEXT    NOT NULL,  -- the run's whole summary document (JSON)
    all_machines   INTEGER NOT NULL DEFAULT 1  -- 1: every machine the console listed
                                               -- (--all); 0: machines named by hand, or
                                               -- the console's machine listing failed
);
CREATE INDEX runs_by_console ON runs (console, id);
CREATE INDEX runs_by_start ON runs (started_unix);

-- One row per machine of a run.
CREATE TABLE machine_results (
    run_id          INTEGER NOT NULL REFERENCES runs (id) ON DELETE CASCADE,
    machine         TEXT    NOT NULL,  -- the identity, type-model_serial
    return_code     TEXT    NOT NULL,
    listing_failure TEXT,              -- JSON {command, exit_status, message} or null
    PRIMARY KEY (run_id, machine)
) WITHOUT ROWID;
-- A machine's previous record: the latest earlier run that listed it.
CREATE INDEX machine_results_by_machine ON machine_results (machine, run_id);

-- One row per listed partition of a run. "partition" is the host name as
-- listed; a host listed again on the same machine is "<host> #2", "#3", ...
CREATE TABLE partition_results (
    run_id            INTEGER NOT NULL REFERENCES runs (id) ON DELETE CASCADE,
    machine           TEXT    NOT NULL,
    partition         TEXT    NOT NULL,
    partition_id      TEXT,
    ip                TEXT    NOT NULL,
    outcome           TEXT    NOT NULL,  -- the summary's outcome
    status_text       TEXT    NOT NULL,
    reason            TEXT,
    seconds           REAL,
    document          TEXT,              -- the document's path as the run wrote it
    inventory         TEXT    NOT NULL,  -- read, unreadable, default, missing or none
    inventory_problem TEXT,              -- "document unreadable at line L: reason", ...
    document_hash     TEXT,              -- of the document's bytes, when read
    failing_since_run INTEGER,           -- first run of the failing streak, null unless failing
    runs_failing      INTEGER,           -- runs in a row failing, this one included
    last_surveyed_run INTEGER,           -- latest run (this or earlier) that surveyed it
    PRIMARY KEY (run_id, machine, partition)
) WITHOUT ROWID;
CREATE INDEX partition_results_by_partition ON partition_results (machine, partition, run_id);

-- The changes a run brought, each machine's computed against its previous
-- record: the console's latest earlier run that listed the machine.
--   scope "machine":   appeared, disappeared, listing_failed, listing_recovered
--   scope "partition": newly_failing, still_failing, recovered, newly_inactive,
--                      appeared, disappeared
--   scope "component": added, removed, replaced, property_changed
CREATE TABLE events (
    id                INTEGER PRIMARY KEY AUTOINCREMENT,
    run_id            INTEGER NOT NULL REFERENCES runs (id) ON DELETE CASCADE,
    scope             TEXT    NOT NULL,
    kind              TEXT    NOT NULL,
    machine           TEXT    NOT NULL,
    partition         TEXT,               -- null for scope "machine"
    component         TEXT,               -- the component's key (docs/inventory.md)
    component_name    TEXT,               -- its display name
    property          TEXT,               -- the keyword, for property_changed
    old_value         TEXT,               -- replaced: old serial number; property_changed: old value
    new_value         TEXT,
    outcome           TEXT,               -- partition scope: the outcome in this run
    reason            TEXT,               -- partition scope: the reason in this run
    failing_since_run INTEGER,            -- newly_failing, still_failing
    runs_failing      INTEGER
);
CREATE INDEX events_by_run ON events (run_id, scope, kind);
CREATE INDEX events_by_partition ON events (machine, partition, run_id);

-- The VPD documents the runs read (docs/history.md, "Inventory"), one row per
-- distinct content: partitions whose document did not change share the row,
-- and a document already stored is neither read into components nor stored
-- again. "hash" is the document's content hash, as in
-- partition_results.document_hash.
CREATE TABLE documents (
    id         INTEGER PRIMARY KEY,
    hash       TEXT    NOT NULL UNIQUE,
    inventory  TEXT    NOT NULL,  -- read, unreadable or default
    problem    TEXT,              -- "document unreadable at line L: reason"
    components TEXT    NOT NULL   -- every component read, encoded as docs/history.md says
);
CREATE INDEX partition_results_by_document ON partition_results (document_hash);

-- A document no partition result refers to any more goes with the last one
-- (runs deleted by "history prune" take their partition results with them).
CREATE TRIGGER documents_unreferenced AFTER DELETE ON partition_results
WHEN OLD.document_hash IS NOT NULL
BEGIN
    DELETE FROM documents
     WHERE hash = OLD.document_hash
       AND NOT EXISTS (SELECT 1 FROM partition_results WHERE document_hash = OLD.document_hash);
END;
CREATE TRIGGER documents_unreferenced_by_update AFTER UPDATE OF document_hash ON partition_results
WHEN OLD.document_hash IS NOT NULL AND OLD.document_hash IS NOT NEW.document_hash
BEGIN
    DELETE FROM documents
     WHERE hash = OLD.document_hash
       AND NOT EXISTS (SELECT 1 FROM partition_results WHERE document_hash = OLD.document_hash);
END;
