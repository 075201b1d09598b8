#!/usr/bin/python3
"""The report of each run of a console followed over six runs whose
answers change between them (tests/fleet/series/run-1.scn to run-6.scn),
read in headless Chromium: "Since the last run" lists exactly the changes
of its run, and the partitions' "Last surveyed" and "Failing since" follow
the series. tests/fleet/FleetRunSeries_test.cpp compares the same runs'
other outputs byte for byte.

Usage: report_series_test.py make --fleet Q --sandbox S --sim P --source-root R --out OUT
       report_series_test.py OUT TEST_NAME
The first surveys the six runs inside tools/sandbox with a state folder of
their own, OUT/run-N/report being run N's report; the second runs one test
on them. Exit status 0 passed, 1 failed, 77 skipped (the reason is printed).
"""
import argparse
import json
import os
import shutil
import subprocess
import sys
import tempfile
import time
import unittest

import report_page_test
import report_test_runner

IDENTITY = "9119-MHE_21ABCDE"
RUNS = 6
OUT = ""
EXIT_STATUSES = [0, 4, 4, 0, 8, 0]
REASON = ("Partition not surveyed, reason: Partition Failed. [ Rc] = 0 [ RcCmd] = 5 "
          "[RetStr1] = client survey failed: /var full [RetStr2] =")


def wait_for_the_next_second():
    """Each run starts in a second of its own, so that the page's times tell
    the runs apart."""
    second = int(time.time())
    while int(time.time()) == second:
        time.sleep(0.05)


def make(arguments):
    parser = argparse.ArgumentParser()
    for option in ("--fleet", "--sandbox", "--sim", "--source-root", "--out"):
        parser.add_argument(option, required=True)
    args = parser.parse_args(arguments)
    out = os.path.abspath(args.out)
    shutil.rmtree(out, ignore_errors=True)
    for folder in ("state", "VPD", "Trace"):
        os.makedirs(os.path.join(out, folder))
    sandbox = [args.sandbox, "--sim", args.sim, "--state", os.path.join(out, "state"),
               "--vpd", os.path.join(out, "VPD"), "--trace", os.path.join(out, "Trace"),
               "--bind", f"{out}:{out}", "--"]
    for run, expected in zip(range(1, RUNS + 1), EXIT_STATUSES):
        wait_for_the_next_second()
        folder = os.path.join(out, f"run-{run}")
        scenario = os.path.join(args.source_root, "tests/fleet/series", f"run-{run}.scn")
        survey = subprocess.run(
            sandbox + [args.fleet, "-q", "--summary", os.path.join(folder, "summary.json"),
                       "--report", os.path.join(folder, "report"), IDENTITY],
            env=dict(os.environ, PYLON_SIM_SCENARIO=scenario), capture_output=True, check=False)
        if survey.returncode == report_test_runner.SKIP:
            sys.stderr.write(survey.stderr.decode(errors="replace"))
            return report_test_runner.SKIP
        if survey.returncode != expected:
            sys.stderr.write(f"run {run} ended with {survey.returncode}, not {expected}:\n"
                             f"{survey.stderr.decode(errors='replace')}")
            return 1
    return 0


def started(run):
    with open(os.path.join(OUT, f"run-{run}", "summary.json"), encoding="utf-8") as file:
        return json.load(file)["started"]


# The counts of "Since the last run" as label: count, the links' targets,
# and each list's items as the reader sees them.
CHANGES = """
const section = document.getElementById('since-last-run');
const counts = {};
for (const li of section.querySelectorAll('.change-counts li')) {
    counts[li.lastChild.textContent] = Number(li.querySelector('b').textContent);
}
const lists = {};
for (const link of section.querySelectorAll('.change-counts a')) {
    const heading = document.querySelector(link.hash);
    lists[heading.textContent] = Array.from(heading.nextElementSibling.querySelectorAll('li'))
        .map(li => li.textContent);
}
return [section.querySelector('.history-state').textContent, counts, lists];
"""

NO_CHANGE = {"New failures": 0, "Recovered": 0, "Still failing": 0, "Newly inactive": 0,
             "Inventory changes": 0, "Partitions appeared": 0, "Partitions disappeared": 0,
             "Machines appeared": 0, "Machines disappeared": 0}


class SeriesReportTest(unittest.TestCase):
    driver = None
    maxDiff = None

    @classmethod
    def setUpClass(cls):
        reason = report_page_test.browser_missing()
        if reason:
            raise unittest.SkipTest(reason)
        cls.profile = tempfile.mkdtemp(prefix="report-chromium-")
        cls.driver = report_page_test.start_chromium(cls.profile)

    @classmethod
    def tearDownClass(cls):
        if cls.driver is not None:
            cls.driver.quit()
            shutil.rmtree(cls.profile, ignore_errors=True)

    def open_run(self, run):
        self.driver.get("file://" + os.path.join(OUT, f"run-{run}", "report", "index.html"))

    def changes_of(self, run):
        self.open_run(run)
        return self.driver.execute_script(CHANGES)

    def compared_with(self, run):
        return f"Compared with the run started {report_page_test.readable_time(started(run))}."

    def history_cells(self, run):
        """Each partition's host: (outcome, "Last surveyed", its time,
        "Failing since", its time), the times as their datetime."""
        self.open_run(run)
        return {row[0]: tuple(row[1:]) for row in self.driver.execute_script(
            "const column = name => document.querySelector("
            " `#parts thead th[data-column=${name}]`).cellIndex;"
            "return Array.from(document.querySelectorAll('#parts tbody tr')).map(r => {"
            " const cell = name => r.cells[column(name)];"
            " const when = name => (cell(name).querySelector('time') || {}).dateTime || null;"
            " return [cell('host').textContent, cell('outcome').textContent,"
            "  cell('last-surveyed').textContent, when('last-surveyed'),"
            "  cell('failing-since').textContent, when('failing-since')]; });")}

    def test_first_run_says_there_is_nothing_to_compare(self):
        self.open_run(1)
        self.assertEqual("First recorded run of this console: nothing to compare.",
                         self.driver.execute_script(
                             "return document.querySelector('#since-last-run .history-state')"
                             ".textContent;"))

    def test_new_failure_and_replaced_serial_number_are_the_second_runs_changes(self):
        self.assertEqual(
            [self.compared_with(1), dict(NO_CHANGE, **{"New failures": 1, "Inventory changes": 1}),
             {"New failures": [f"boreas on {IDENTITY}: client failure · {REASON}"],
              "Inventory changes": [f"aurora on {IDENTITY}: ent0 (U78D5.ND1.CSS5G2T-P1-C6-T1) "
                                    "replaced, serial number Y050BG52D018 → Y050BG52D999"]}],
            self.changes_of(2))

    def test_failure_going_on_and_new_code_level_are_the_third_runs_changes(self):
        since = report_page_test.readable_time(started(2))
        self.assertEqual(
            [self.compared_with(2), dict(NO_CHANGE, **{"Still failing": 1, "Inventory changes": 1}),
             {"Still failing": [f"boreas on {IDENTITY}: client failure, failing since {since} "
                                f"(2 runs) · {REASON}"],
              "Inventory changes": [f"aurora on {IDENTITY}: aurora (9119-MHE-21ABCDE-1) CL "
                                    "FW950.80 → FW950.90"]}],
            self.changes_of(3))

    def test_recovery_and_partition_no_longer_listed_are_the_fourth_runs_changes(self):
        self.assertEqual(
            [self.compared_with(3),
             dict(NO_CHANGE, **{"Recovered": 1, "Partitions disappeared": 1}),
             {"Recovered": [f"boreas on {IDENTITY}: surveyed"],
              "Partitions disappeared": [f"cirrus on {IDENTITY}"]}],
            self.changes_of(4))

    def test_partition_listed_again_after_a_listing_failure_appears(self):
        self.assertEqual([self.compared_with(4), NO_CHANGE, {}], self.changes_of(5))
        self.assertEqual(
            [self.compared_with(5), dict(NO_CHANGE, **{"Partitions appeared": 1}),
             {"Partitions appeared": [f"cirrus on {IDENTITY}: surveyed"]}],
            self.changes_of(6))

    def test_last_surveyed_and_failing_since_follow_the_failing_partition_through_the_series(self):
        def shown(run):
            iso = started(run)
            return f"{iso[:10]} {iso[11:16]}", iso

        def surveyed(run):
            return ("surveyed", *shown(run), "", None)
        first, second = shown(1), shown(2)
        failing = ("client failure", *first, *second)
        self.assertEqual({"aurora": surveyed(3), "boreas": failing, "cirrus": surveyed(3)},
                         self.history_cells(3))
        self.assertEqual({"aurora": surveyed(4), "boreas": surveyed(4)}, self.history_cells(4))
        self.assertEqual({"aurora": surveyed(6), "boreas": surveyed(6), "cirrus": surveyed(6)},
                         self.history_cells(6))
        self.assertEqual({"aurora": surveyed(2), "boreas": failing, "cirrus": surveyed(2)},
                         self.history_cells(2))


class SeriesCsvTest(unittest.TestCase):
    """partitions.csv of each run, read with Python's csv reader."""

    def test_csv_history_columns_follow_the_failing_partition_through_the_series(self):
        def columns(run):
            rows = report_page_test.csv_rows(os.path.join(OUT, f"run-{run}", "report"))
            return {row[3]: (row[6], row[14], row[15]) for row in rows[1:]}
        self.assertEqual({"aurora": ("surveyed", "", started(2)),
                          "boreas": ("client_failure", started(2), started(1)),
                          "cirrus": ("surveyed", "", started(2))}, columns(2))
        self.assertEqual({"aurora": ("surveyed", "", started(3)),
                          "boreas": ("client_failure", started(2), started(1)),
                          "cirrus": ("surveyed", "", started(3))}, columns(3))
        self.assertEqual({"aurora": ("surveyed", "", started(4)),
                          "boreas": ("surveyed", "", started(4))}, columns(4))
        self.assertEqual({"aurora": ("surveyed", "", started(6)),
                          "boreas": ("surveyed", "", started(6)),
                          "cirrus": ("surveyed", "", started(6))}, columns(6))


def main():
    if sys.argv[1] == "make":
        return make(sys.argv[2:])
    global OUT  # pylint: disable=global-statement
    OUT = os.path.abspath(sys.argv[1])
    if not os.path.isfile(os.path.join(OUT, f"run-{RUNS}", "summary.json")):
        print(f"skipped: no series in {OUT}: it could not be surveyed here "
              "(see the test report.MakeSeries)")
        return report_test_runner.SKIP
    return report_test_runner.run(sys.argv[2], sys.modules[__name__])


if __name__ == "__main__":
    sys.exit(main())
