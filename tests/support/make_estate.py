#!/usr/bin/python3
"""Lays down a collect folder as the Ansible collection leaves it for
"quorvex-survey estate": records.json and one bundle per collected console
(bundle.json, summary.json, VPD/), generated rather than surveyed, so that
tests and benchmarks can have estates of any size.

Partition p of a machine: one in ten fails (channel, client, fetch in turn),
one in twenty is inactive, the rest are surveyed. With --not-collected the
first four consoles are unreachable, timed out, stale (with its bundle) and a
tool error, in that order; the rest are collected. With --hostile-names the
last console's name and the first partition's host of each of its machines
carry markup, quotes and non-ASCII letters, as a careless inventory or
console might give them.

With --documents each partition's VPD document is a one-line stand-in; with
--document-template FILE it is FILE's text with "{host}" replaced by the
partition's host name, for documents shaped as a console writes them.

Usage: make_estate.py --out DIR [--consoles 5] [--machines 3] [--partitions 4]
                      [--not-collected] [--documents] [--document-template FILE]
                      [--hostile-names]
"""
import argparse
import json
import os

PREFIX = "quorvexPYLON_VPD_Survey_ClientPartition_"
COLLECTED = "2026-11-24T18:00:00+00:00"
STARTED = "2026-11-24T17:55:00+00:00"
ENDED = "2026-11-24T17:58:20+00:00"
FAILURES = (
    ("channel_failure", "RELAY Failed, rc = 1", "Partition not surveyed, reason: \nRELAY Failed.\n"),
    ("client_failure", "Partition Failed, RcCmd = 5", "Partition not surveyed, reason: \nPartition Failed.\n"),
    ("fetch_failure", "4et result Failed, rc = ", "Unable to get File From Partition : \n"),
)
NOT_COLLECTED = (
    ("unreachable", "Failed to connect to the host via ssh: ssh: connect to host 127.0.0.9 port 22: Connection refused", None, None),
    ("timed_out", "the survey ran past the collection's limit of 600 s", None, None),
    ("stale", "the newest run is older than 86400 s", 0, 266400),
    ("tool_error", "quorvex-survey exited with status 69: cannot list the managed machines", 69, None),
)
HOSTILE_CONSOLE = "console-\"<b>Zürich</b>\" & 'ñ'"
HOSTILE_HOST = "<img src=x onerror=alert(1)>\"é\".example"
OUTCOMES = ("surveyed", "inactive", "channel_failure", "client_failure", "fetch_failure",
            "timed_out", "interrupted", "worker_died")


def document_text(host, template):
    if template is None:
        return f"<?xml version=\"1.0\"?><doc host=\"{host}\"/>\n"
    return template.replace("{host}", host)


def partition_entry(machine, p, documents_folder, template):
    host = f"part-{p:04d}.{machine.lower()}.example"
    document = f"VPD/{PREFIX}{machine}-{p}.VPD.xml"
    entry = {"id": str(p), "host": host, "ip": f"10.{p // 65536}.{p // 256 % 256}.{p % 256}",
             "active_status": "3", "outcome": "surveyed", "status_text": "Ok", "return_code": "0",
             "rc": 0, "rc_cmd": 0, "document": document, "reason": None, "seconds": 1.25 + p % 7}
    if p % 10 == 3:
        outcome, status, reason = FAILURES[(p // 10) % 3]
        entry.update(outcome=outcome, status_text=status, return_code="8", rc=1, reason=reason)
    elif p % 20 == 7:
        entry.update(outcome="inactive", status_text="Failed - Active Status < 3", return_code="8",
                     active_status="0", rc=None, rc_cmd=None, document=None, seconds=None)
    if documents_folder and entry["document"]:
        with open(os.path.join(documents_folder, os.path.basename(document)), "w",
                  encoding="utf-8") as file:
            file.write(document_text(host, template))
    return entry


def counts_of(partitions):
    counts = {"partitions": len(partitions)}
    counts.update({name: sum(1 for p in partitions if p["outcome"] == name) for name in OUTCOMES})
    return counts


def machine_entry(console, m, partitions, documents_folder, template):
    machine = f"9119-MHE_{console:02d}{m:03d}AB"
    entries = [partition_entry(machine, p, documents_folder, template)
               for p in range(1, partitions + 1)]
    surveyed = sum(1 for p in entries if p["outcome"] == "surveyed")
    code = "0" if surveyed == len(entries) else "4" if surveyed else "8"
    return {"identity": machine, "return_code": code,
            "status_file": f"/var/adm/quorvex/VPD/{PREFIX}{machine}.status",
            "trace_file": f"/var/adm/quorvex/Trace/{PREFIX}{machine}.Trace",
            "counts": counts_of(entries), "partitions": entries}


def summary_of(console, host, machines, partitions, documents_folder, template):
    entries = [machine_entry(console, m, partitions, documents_folder, template)
               for m in range(machines)]
    every = [p for machine in entries for p in machine["partitions"]]
    totals = {"machines": len(entries)}
    totals.update(counts_of(every))
    surveyed = totals["surveyed"]
    code = "0" if surveyed == len(every) else "4" if surveyed else "8"
    return {"schema_version": 1, "tool": "quorvex-survey", "version": "1.0.0", "console_host": host,
            "started": STARTED, "ended": ENDED, "elapsed_seconds": 200.0,
            "options": {"jobs": 8, "timeout_seconds": 1800, "all": True, "identities": []},
            "interrupted": None, "return_code": code, "exit_status": int(code), "totals": totals,
            "machines": entries}


def write_json(path, value):
    with open(path, "w", encoding="utf-8") as file:
        json.dump(value, file, indent=1, ensure_ascii=False)


def lay_down_bundle(out, index, name, arguments):
    folder = os.path.join(out, "consoles", name)
    vpd = os.path.join(folder, "VPD")
    os.makedirs(vpd)
    host = f"pylon-{index:02d}.example"
    summary = summary_of(index, host, arguments.machines, arguments.partitions,
                         vpd if arguments.documents else None, arguments.template)
    if arguments.hostile_names and name == HOSTILE_CONSOLE:
        for machine in summary["machines"]:
            machine["partitions"][0]["host"] = HOSTILE_HOST
    write_json(os.path.join(folder, "summary.json"), summary)
    write_json(os.path.join(folder, "bundle.json"), {
        "schema_version": 1, "console": name, "console_host": host, "mode": "run",
        "collected": COLLECTED, "run_started": STARTED, "exit_status": summary["exit_status"],
        "product_version": "1.0.0"})
    return summary["exit_status"]


def console_name(index, arguments):
    if arguments.hostile_names and index == arguments.consoles - 1:
        return HOSTILE_CONSOLE
    return f"console-{index:02d}"


def console_record(out, index, arguments):
    name = console_name(index, arguments)
    record = {"console": name, "record": "collected", "message": None, "exit_status": None,
              "age_seconds": None, "bundle": f"consoles/{name}"}
    if arguments.not_collected and index < len(NOT_COLLECTED):
        kind, message, status, age = NOT_COLLECTED[index]
        record.update(record=kind, message=message, exit_status=status, age_seconds=age)
        if kind != "stale":
            record["bundle"] = None
            return record
    status = lay_down_bundle(out, index, name, arguments)
    if record["exit_status"] is None:
        record["exit_status"] = status
    return record


def main():
    parser = argparse.ArgumentParser(description=__doc__.split("\n\n")[0])
    parser.add_argument("--out", required=True)
    parser.add_argument("--consoles", type=int, default=5)
    parser.add_argument("--machines", type=int, default=3)
    parser.add_argument("--partitions", type=int, default=4)
    parser.add_argument("--not-collected", action="store_true")
    parser.add_argument("--documents", action="store_true")
    parser.add_argument("--document-template")
    parser.add_argument("--hostile-names", action="store_true")
    arguments = parser.parse_args()
    arguments.template = None
    if arguments.document_template:
        arguments.documents = True
        with open(arguments.document_template, encoding="utf-8") as file:
            arguments.template = file.read()
    os.makedirs(arguments.out, exist_ok=True)
    records = [console_record(arguments.out, index, arguments)
               for index in range(arguments.consoles)]
    write_json(os.path.join(arguments.out, "records.json"),
               {"schema_version": 1, "collected": COLLECTED, "consoles": records})


if __name__ == "__main__":
    main()
