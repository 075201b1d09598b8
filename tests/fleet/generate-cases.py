#!/usr/bin/env python3
"""Writes differential cases of the console-wide survey: one folder per case
holding a simulated console (console.scn, see sim/README.md), the run's mode
and the identities to survey.

  <case>/console.scn   the simulated console
  <case>/mode          "identities" (survey the listed identities) or "all"
  <case>/identities    one identity a line, in the order the survey is given
                       them (for "all": the console's type-0 machines in
                       sorted order, the order a run over --all surveys them)

Each case comes from one seed, so a failing case is made again from its name
alone: gen-<seed>.  The mix covers machines whose listing fails, is empty or
is malformed, inactive partitions, channel, client and fetch failures, odd
return-code lines, partitions listed twice and identities given twice.
"""

import argparse
import os
import random
import sys

OK_LINE = "Rc::0::RcCmd::0::RetStr1::done::RetStr2::"


def identity(rng):
    digits = "".join(rng.choice("0123456789") for _ in range(4))
    model = "".join(rng.choice("ABCDEFGHJKLMNPQRSTUVWXYZ0123456789") for _ in range(3))
    serial = "".join(rng.choice("ABCDEFGHJKLMNPQRSTUVWXYZ0123456789") for _ in range(7))
    return f"{digits}-{model}_{serial}"


def host_name(rng, partition_id):
    kind = rng.randrange(10)
    if kind == 0:
        return ""
    if kind == 1:
        return f"db<{partition_id}>&\"q\""
    return rng.choice(["aurora", "boreas", "cygnus", "dune", "eos", "fjord"]) + str(partition_id)


def active_status(rng):
    kind = rng.randrange(12)
    if kind < 7:
        return "3"
    if kind < 9:
        return rng.choice(["0", "1", "2"])
    return rng.choice(["x", "", " 3", "4", "-1"])


def partition_record(rng, partition_id):
    ip = f"10.{rng.randrange(256)}.{rng.randrange(256)}.{rng.randrange(1, 255)}"
    fields = [str(partition_id), ip, active_status(rng), host_name(rng, partition_id),
              rng.choice(["Zeph", "Linux", "Other"]), rng.choice(["7.1", "7.2", "5.14"])]
    kind = rng.randrange(20)
    if kind == 0:
        fields.append("extra")
    elif kind == 1:
        fields = fields[:3]
    return ",".join(fields)


def listing_section(rng, machine, partition_ids):
    """The machine's partition listing; several of its records may be odd."""
    kind = rng.randrange(14)
    lines = [f"[lspartition {machine}]"]
    if kind == 0:
        lines += ["stderr lspartition: managed system not reachable", "exit 1"]
        return lines, []
    if kind == 1:
        return lines, []
    count = rng.randrange(1, 4)
    ids = [rng.choice(partition_ids) for _ in range(count)]
    if rng.randrange(5) == 0:
        ids.insert(rng.randrange(len(ids) + 1), ids[0])
    records = [partition_record(rng, i) for i in ids]
    if kind == 2:
        records.insert(rng.randrange(len(records) + 1), "")
    text = ";".join(records) + ";"
    if kind == 3:
        lines.append("stdout-nolf " + text)
    else:
        lines.append("stdout " + text)
        if kind == 4:
            lines.append("stdout this second line is ignored")
    return lines, ids


def delay_line(rng):
    return [f"delay {rng.choice(['0.01', '0.02'])}"] if rng.randrange(8) == 0 else []


def client_section(rng, partition_id):
    kind = rng.randrange(10)
    lines = [f"[runCmdOnPartition {partition_id}]"] + delay_line(rng)
    if kind == 0:
        return lines + ["stdout Rc::1::RcCmd::0::RetStr1::timeout::RetStr2::", "exit 1"]
    if kind == 1:
        return lines + ["stdout Rc::0::RcCmd::3::RetStr1::client failed::RetStr2::disk full"]
    if kind == 2:
        return lines + ["stderr runact-api: lost the channel", "exit 255"]
    if kind == 3:
        return lines + ["stdout Rc::abc::RcCmd::::RetStr1", "stdout x::1::Rc::5::x::2"]
    return lines + ["stdout " + OK_LINE]


def fetch_section(rng, partition_id):
    kind = rng.randrange(10)
    lines = [f"[getFileFromPartition {partition_id}]"] + delay_line(rng)
    if kind == 0:
        return lines + ["stdout Rc::5::RcCmd::0::RetStr1::file not found::RetStr2::", "exit 1"]
    if kind == 1:
        return lines + ["stdout-nolf Rc::0::RcCmd::0::RetStr1::done"]
    lines += ["stdout " + OK_LINE,
              "document <<END",
              '<?xml version="1.0" encoding="UTF-8"?><com.zor.inventory version="1.0">',
              '   <ResourceSet class="com.zor.inventory.Hardware" timestamp="1699999990000"'
              ' type="Hardware" version="1.0">',
              f'      <Resource displayName="p{partition_id}" uniqueId="p{partition_id}">'
              f"p{partition_id}</Resource>",
              "   </ResourceSet>",
              "END",
              "document-nolf </com.zor.inventory>"]
    return lines


def machines_listing(machines, rng):
    entries = [f"0:{m}" for m in machines]
    entries.insert(rng.randrange(len(entries) + 1), "2:7063-CR2_06QRV01")
    return ["[lsvtc]", "stdout " + ";".join(entries) + ";"]


def make_case(seed):
    rng = random.Random(seed)
    machines = []
    machine_count = rng.randrange(2, 4)
    while len(machines) < machine_count:
        candidate = identity(rng)
        if candidate not in machines:
            machines.append(candidate)
    partition_ids = list(range(1, rng.randrange(3, 9)))
    lines = ["# generated from seed %d" % seed]
    lines += machines_listing(machines, rng)
    for machine in machines:
        section, _ = listing_section(rng, machine, partition_ids)
        lines += [""] + section
    lines += ["", "[lspartition *]", "stderr lspartition: managed system not found", "exit 1"]
    for partition_id in partition_ids:
        lines += [""] + client_section(rng, partition_id)
        lines += [""] + fetch_section(rng, partition_id)
    mode = "all" if rng.randrange(4) == 0 else "identities"
    if mode == "all":
        order = sorted(machines)
    else:
        order = list(machines)
        rng.shuffle(order)
        if rng.randrange(6) == 0:
            order.append(identity(rng))
        if rng.randrange(6) == 0:
            order.insert(rng.randrange(len(order) + 1), rng.choice(order))
    return "\n".join(lines) + "\n", mode, order


def write_case(folder, scenario, mode, order):
    os.makedirs(folder, exist_ok=True)
    with open(os.path.join(folder, "console.scn"), "w", encoding="utf-8") as out:
        out.write(scenario)
    with open(os.path.join(folder, "mode"), "w", encoding="utf-8") as out:
        out.write(mode + "\n")
    with open(os.path.join(folder, "identities"), "w", encoding="utf-8") as out:
        out.write("".join(i + "\n" for i in order))


def main():
    parser = argparse.ArgumentParser(description=__doc__.split("\n\n")[0])
    parser.add_argument("--first-seed", type=int, required=True)
    parser.add_argument("--count", type=int, required=True)
    parser.add_argument("folder", help="where the case folders gen-<seed> are made")
    arguments = parser.parse_args()
    for seed in range(arguments.first_seed, arguments.first_seed + arguments.count):
        scenario, mode, order = make_case(seed)
        write_case(os.path.join(arguments.folder, "gen-%03d" % seed), scenario, mode, order)
    return 0


if __name__ == "__main__":
    sys.exit(main())
