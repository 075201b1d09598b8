#!/usr/bin/python3
"""Leaves the files of surveys of a simulated console with four managed
machines in OUT/VPD and OUT/Trace, then writes their report into OUT/report
with "quorvex-survey report --from OUT/VPD". Three machines are surveyed by
the single-machine tool, once per machine; the fourth, whose one partition
hangs, by "quorvex-survey -t 1 --summary OUT/run-summary.json --report
OUT/run-report". Everything runs inside tools/sandbox. Last, a history
database of four runs of the files' console (history_seed.py) in
OUT/history.sqlite, and the report that compares them in OUT/history-report
("quorvex-survey report --history").

The console's answers hold what operators meet: surveyed, inactive and every
kind of failed partition, one stopped by the time limit, a host name made of
markup, texts with & < " and a host name whose bytes are not UTF-8.

Usage: make_survey.py --tool T --fleet Q --sandbox S --sim P --source-root R --out OUT
Exit status 77 when no sandbox can be made here (the reason on stderr).
"""
import argparse
import json
import os
import shutil
import subprocess
import sys

import history_seed

MACHINES = ["9119-MHE_21ABCDE", "8286-42A_10XYZ99", "1234-ABC_10ABCDE"]
HANGING_MACHINE = "7063-CR2_06SLOW1"
MARKUP_HOST = "<img src=x onerror=alert(1)>"
# UTC+05:30.
RUN_ZONE = "<+0530>-05:30"


def fetched_document(machine, partition_id, host):
    model, serial = machine.split("_")
    unique = model + "-" + serial
    return f"""document <<END
<?xml version="1.0" encoding="UTF-8"?><com.zor.inventory version="1.0">
   <ResourceSet class="com.zor.inventory.Hardware" timestamp="1700000000000" type="Hardware" version="1.0">
      <Resource displayName="{unique}" uniqueId="{unique}">
         {unique}
         <ResourceList displayName="Partitions">
            <Resource displayName="{host}" uniqueId="{unique}-{partition_id}">
               {host}
               <Property displayName="HostName" name="HN">
                  HN
                  <Value type="string">{host}</Value>
               </Property>
            </Resource>
         </ResourceList>
      </Resource>
   </ResourceSet>
END
document-nolf </com.zor.inventory>
"""


def scenario_text():
    ok = "stdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
    return (
        "[lsvtc]\nstdout 0:9119-MHE_21ABCDE;0:8286-42A_10XYZ99;0:1234-ABC_10ABCDE;\n\n"
        "[lspartition 9119-MHE_21ABCDE]\n"
        "stdout 1,10.20.30.41,3,aurora,Zeph,7.2;2,10.20.30.42,3,boreas,Zeph,7.3;"
        "3,10.20.30.43,1,cirrus,Zeph,7.1;4,10.20.30.44,3,delta,Zeph,7.2;"
        "5,10.20.30.45,3,eos,Linux,5.14;6,10.20.30.46,3,fjord,Zeph,7.3;"
        f"7,10.20.30.47,3,{MARKUP_HOST},Zeph,7.2;8,10.20.30.48,3,h\xf6st,Zeph,7.2;\n\n"
        "[lspartition 8286-42A_10XYZ99]\n"
        "stdout 1,10.40.50.61,3,gemini,Linux,5.14;2,10.40.50.62,3,a&b<c\"d,Zeph & <Co>,7.2;"
        "3,10.40.50.63,2,hydra,Zeph,7.1;\n\n"
        f"[lspartition {HANGING_MACHINE}]\nstdout 9,10.60.70.89,3,slowpoke,Zeph,7.2;\n\n"
        "[runCmdOnPartition 9]\ndelay 20\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n\n"
        "[lspartition *]\nstderr lspartition: managed system not found\nexit 1\n\n"
        f"[runCmdOnPartition *]\n{ok}\n"
        "[runCmdOnPartition 4]\nstdout Rc::1::RcCmd::0::RetStr1::timeout::RetStr2::\nexit 1\n\n"
        "[runCmdOnPartition 5]\nstdout Rc::0::RcCmd::5::RetStr1::client survey failed::RetStr2::\n\n"
        "[runCmdOnPartition 7]\n"
        "stdout Rc::1::RcCmd::0::RetStr1::cannot <reach> \"a&b\"::RetStr2::\nexit 1\n\n"
        f"[getFileFromPartition 1]\n{ok}{fetched_document(MACHINES[0], 1, 'aurora')}\n"
        f"[getFileFromPartition 2]\n"
        "stdout Rc::5::RcCmd::0::RetStr1::<none> & \"nothing\"::RetStr2::\nexit 1\n\n"
        "[getFileFromPartition 6]\n"
        "stdout Rc::4::RcCmd::0::RetStr1::file not found::RetStr2::\nexit 1\n\n"
        f"[getFileFromPartition *]\n{ok}document <<END\n<x/>\nEND\n"
    )


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("--tool", required=True)
    parser.add_argument("--fleet", required=True)
    parser.add_argument("--sandbox", required=True)
    parser.add_argument("--sim", required=True)
    parser.add_argument("--source-root", required=True)
    parser.add_argument("--out", required=True)
    args = parser.parse_args()

    out = os.path.abspath(args.out)
    shutil.rmtree(out, ignore_errors=True)
    for folder in ("VPD", "Trace"):
        os.makedirs(os.path.join(out, folder))
    scenario = os.path.join(out, "console.scn")
    with open(scenario, "wb") as file:
        file.write(scenario_text().encode("latin-1"))
    environment = dict(os.environ, PYLON_SIM_SCENARIO=scenario,
                       PYLON_SIM_LOG=os.path.join(out, "calls.log"))
    sandbox = [args.sandbox, "--sim", args.sim, "--bind", f"{out}:{out}",
               "--vpd", os.path.join(out, "VPD"), "--trace", os.path.join(out, "Trace"), "--"]
    surveys = [([args.tool, "-c", machine], 2) for machine in MACHINES]
    surveys.append(([args.fleet, "-q", "-t", "1", "--summary", os.path.join(out, "run-summary.json"),
                     "--report", os.path.join(out, "run-report"), HANGING_MACHINE], 8))
    for command, expected in surveys:
        run = subprocess.run(sandbox + command, env=environment, capture_output=True, check=False)
        if run.returncode == 77:
            sys.stderr.write(run.stderr.decode(errors="replace"))
            return 77
        if run.returncode != expected:
            sys.stderr.write(f"{' '.join(command)} ended with {run.returncode}:\n"
                             f"{run.stderr.decode(errors='replace')}")
            return 1
    # The report's times in a zone of their own, half an hour off any whole
    # hour (POSIX form: no time zone files needed), so that a test can tell
    # them from UTC and from a reader's zone.
    if not write_report(args.fleet, out, "report"):
        return 1
    with open(os.path.join(out, "report", "summary.json"), encoding="utf-8") as file:
        history_seed.seed(os.path.join(out, "history.sqlite"), args.source_root, json.load(file))
    return 0 if write_report(args.fleet, out, "history-report",
                             ["--history", os.path.join(out, "history.sqlite")]) else 1


def write_report(fleet, out, folder, options=()):
    """The report of OUT/VPD in OUT/folder; False, with what it said, when it
    fails or says anything on standard error."""
    report = subprocess.run(
        [fleet, "report", *options, "--from", os.path.join(out, "VPD"), os.path.join(out, folder)],
        env=dict(os.environ, TZ=RUN_ZONE), capture_output=True, check=False)
    if report.returncode != 0 or report.stderr:
        sys.stderr.write(report.stderr.decode(errors="replace"))
        return False
    return True


if __name__ == "__main__":
    sys.exit(main())
