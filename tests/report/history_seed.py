"""A history database with four runs of a report's console, made from the
schema in src/history/migrations and filled so that the report of the files
(quorvex-survey report --history) shows every kind of change: new failures,
failures still going on for three runs, a recovery, inventory changes,
appeared and disappeared partitions and machines, and stale partitions.

The newest run is the report's own; its partitions are those of the
report's summary.json, named as the history names them.
"""
import glob
import os
import sqlite3

FAILING = {"channel_failure", "client_failure", "fetch_failure", "timed_out", "worker_died"}
# The runs before the report's own, which started when its summary says.
EARLIER_STARTS = ["2026-11-21T08:00:00+01:00", "2026-11-22T08:00:00+01:00",
                  "2026-11-23T08:00:00+01:00"]


def partition_names(machine):
    """(name, partition) of a summary's machine, "<host> #2" for a host
    listed again."""
    listed = {}
    for partition in machine["partitions"]:
        host = partition["host"] or ""
        listed[host] = listed.get(host, 0) + 1
        yield (host if listed[host] == 1 else f"{host} #{listed[host]}"), partition


def create(path, source_root):
    if os.path.exists(path):
        os.remove(path)
    database = sqlite3.connect(path)
    migrations = sorted(glob.glob(os.path.join(source_root, "src/history/migrations/*.sql")))
    for migration in migrations:
        with open(migration, encoding="utf-8") as file:
            database.executescript(file.read())
    database.execute(f"PRAGMA user_version = {len(migrations)}")
    return database


def add_runs(database, console, newest_start):
    runs = []
    for started in EARLIER_STARTS + [newest_start]:
        cursor = database.execute(
            "INSERT INTO runs (console, tool, started, ended, started_unix, recorded_unix,"
            " exit_status, return_code, partitions, surveyed, failed, summary)"
            " VALUES (?, 'quorvex-survey', ?, ?, 0, 0, 4, '4', 0, 0, 0, '{}')",
            (console, started, started))
        runs.append(cursor.lastrowid)
    return runs


def add_machines(database, runs, machines):
    """Every run listed every machine of the summary."""
    for run in runs:
        for machine in machines:
            database.execute("INSERT INTO machine_results (run_id, machine, return_code)"
                             " VALUES (?, ?, '0')", (run, machine["identity"]))


def add_partition(database, run, machine, name, outcome, streak, last_surveyed):
    database.execute(
        "INSERT INTO partition_results (run_id, machine, partition, ip, outcome, status_text,"
        " inventory, failing_since_run, runs_failing, last_surveyed_run)"
        " VALUES (?, ?, ?, '', ?, '', 'none', ?, ?, ?)",
        (run, machine, name, outcome, streak[0], streak[1], last_surveyed))


def add_event(database, run, scope, kind, machine, partition=None, **values):
    database.execute(
        "INSERT INTO events (run_id, scope, kind, machine, partition, component, component_name,"
        " property, old_value, new_value, outcome, reason, failing_since_run, runs_failing)"
        " VALUES (?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?)",
        (run, scope, kind, machine, partition, values.get("component"),
         values.get("component_name"), values.get("property"), values.get("old"),
         values.get("new"), values.get("outcome"), values.get("reason"),
         values.get("since"), values.get("runs")))


def add_partition_history(database, runs, machine, name, partition, first_failure):
    """The partition's rows and events: the first failing partition newly
    failing, every other failing one failing since the second run and last
    surveyed in the first (stale), inactive ones never surveyed."""
    outcome, newest = partition["outcome"], runs[-1]
    if outcome in FAILING:
        since, count, last = (newest, 1, runs[-2]) if first_failure else (runs[1], 3, runs[0])
        add_partition(database, newest, machine, name, outcome, (since, count), last)
        add_event(database, newest, "partition", "newly_failing" if first_failure else
                  "still_failing", machine, name, outcome=outcome, reason=partition["reason"],
                  since=since, runs=count)
    elif outcome == "inactive":
        for run in runs:
            add_partition(database, run, machine, name, outcome, (None, None), None)
    else:
        add_partition(database, newest, machine, name, outcome, (None, None), newest)


def add_other_changes(database, newest, machine, surveyed):
    add_event(database, newest, "partition", "recovered", machine, surveyed, outcome="surveyed")
    add_event(database, newest, "partition", "disappeared", machine, "retired-lpar")
    add_event(database, newest, "machine", "disappeared", "8233-E8B_06OLD01")
    component = {"component": "U78C9.001.WZS0001-P1-C3", "component_name": "PCIe2 4-port adapter"}
    add_event(database, newest, "component", "replaced", machine, surveyed, property="SN",
              old="YL10HA7B1234", new="YL10HA7B9876", **component)
    add_event(database, newest, "component", "property_changed", machine, surveyed,
              property="FW", old="0400.10", new="0400.12", **component)
    add_event(database, newest, "component", "added", machine, surveyed,
              component="U78C9.001.WZS0001-P1-C7", component_name="Fibre channel adapter")


def seed(path, source_root, summary):
    """Writes the database at path for the summary's console and partitions."""
    database = create(path, source_root)
    runs = add_runs(database, summary["console_host"], summary["started"])
    add_machines(database, runs, summary["machines"])
    first_failure, surveyed = True, None
    for machine in summary["machines"]:
        for name, partition in partition_names(machine):
            add_partition_history(database, runs, machine["identity"], name, partition,
                                  first_failure and partition["outcome"] in FAILING)
            first_failure = first_failure and partition["outcome"] not in FAILING
            if partition["outcome"] == "surveyed" and surveyed is None:
                surveyed = (machine["identity"], name)
    if surveyed:
        add_other_changes(database, runs[-1], *surveyed)
    database.commit()
    database.close()
