#!/usr/bin/python3
"""Lays down a collect folder with make_estate.py (consoles not collected,
hostile names) and merges it with "quorvex-survey estate" into OUT/report,
for the estate's tests to read.

Usage: make_estate_report.py --fleet QUORVEX_SURVEY --out DIR
Exit status 0 when the estate report was written, 1 otherwise.
"""
import argparse
import os
import shutil
import subprocess
import sys

MAKE_ESTATE = os.path.join(os.path.dirname(os.path.abspath(__file__)), "..", "support",
                           "make_estate.py")


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("--fleet", required=True)
    parser.add_argument("--out", required=True)
    arguments = parser.parse_args()
    shutil.rmtree(arguments.out, ignore_errors=True)
    collect = os.path.join(arguments.out, "collect")
    subprocess.run([sys.executable, MAKE_ESTATE, "--out", collect, "--consoles", "8",
                    "--machines", "3", "--partitions", "40", "--not-collected", "--documents",
                    "--hostile-names"], check=True)
    # The history in the build tree: the default is the host's own.
    run = subprocess.run([arguments.fleet, "estate", "--from", collect, "--report",
                          os.path.join(arguments.out, "report"), "--history",
                          os.path.join(arguments.out, "history.sqlite")],
                         capture_output=True, text=True, check=False)
    sys.stderr.write(run.stderr)
    if run.returncode != 0:
        print(f"quorvex-survey estate exited with {run.returncode}")
        return 1
    return 0


if __name__ == "__main__":
    sys.exit(main())
