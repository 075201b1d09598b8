#!/usr/bin/python3
"""quorvex-survey report as an operator runs it: what it says and exits with
when its VPD folder gives nothing to read, and the partition IDs it takes
from the names of documents that name no host.

Usage: report_command_test.py QUORVEX_SURVEY SOURCE_ROOT TEST_NAME
Exit status 0 passed, 1 failed, 77 skipped (the reason is printed).
"""
import csv
import os
import shutil
import subprocess
import sys
import tempfile
import unittest

import report_test_runner

FLEET = ""
SOURCE_ROOT = ""
NOTHING_TO_READ = 64


def report(vpd_folder, folder, prefix=()):
    """The exit status, standard output and standard error of a report."""
    run = subprocess.run([*prefix, FLEET, "report", "--from", vpd_folder, folder],
                         capture_output=True, text=True, check=False)
    return run.returncode, run.stdout, run.stderr


def as_unprivileged():
    """What runs a command as a user that folder modes bind: root reads any
    folder whatever its mode, so it runs the report as nobody."""
    if os.geteuid() != 0:
        return ()
    if shutil.which("setpriv") is None:
        return None
    return ("setpriv", "--reuid=65534", "--regid=65534", "--clear-groups")


class ReportCommandTest(unittest.TestCase):
    def setUp(self):
        self.root = tempfile.TemporaryDirectory()  # pylint: disable=consider-using-with
        self.addCleanup(self.root.cleanup)
        self.out = os.path.join(self.root.name, "report")

    def test_missing_folder_is_said_on_one_line_and_nothing_is_written(self):
        missing = os.path.join(self.root.name, "missing")
        self.assertEqual(
            (NOTHING_TO_READ, "",
             f"quorvex-survey: report: cannot read {missing}: No such file or directory\n"),
            report(missing, self.out))
        self.assertFalse(os.path.exists(self.out))

    def test_file_given_as_folder_is_said_on_one_line_and_nothing_is_written(self):
        file = os.path.join(self.root.name, "file")
        with open(file, "w", encoding="utf-8") as handle:
            handle.write("x")
        self.assertEqual(
            (NOTHING_TO_READ, "", f"quorvex-survey: report: cannot read {file}: Not a directory\n"),
            report(file, self.out))
        self.assertFalse(os.path.exists(self.out))

    def test_unreadable_folder_is_said_on_one_line_and_nothing_is_written(self):
        prefix = as_unprivileged()
        if prefix is None:
            self.skipTest("running as root without setpriv to drop the privilege")
        os.chmod(self.root.name, 0o777)
        unreadable = os.path.join(self.root.name, "VPD")
        os.mkdir(unreadable, 0o000)
        self.assertEqual(
            (NOTHING_TO_READ, "",
             f"quorvex-survey: report: cannot read {unreadable}: Permission denied\n"),
            report(unreadable, self.out, prefix))
        self.assertFalse(os.path.exists(self.out))

    def test_folder_without_status_file_is_said_and_nothing_is_written(self):
        self.assertEqual(
            (NOTHING_TO_READ, "",
             f"quorvex-survey: report: {self.root.name} holds no status file of a survey run\n"),
            report(self.root.name, self.out))
        self.assertFalse(os.path.exists(self.out))

    def test_surveyed_partition_whose_document_names_no_host_has_its_id_and_link(self):
        vpd = os.path.join(SOURCE_ROOT, "tests/e2e/scenarios/worked-run/expected/VPD")
        self.assertEqual((0, f"{self.out}/index.html\n", ""), report(vpd, self.out))
        with open(os.path.join(self.out, "partitions.csv"), encoding="utf-8", newline="") as file:
            rows = list(csv.DictReader(file))
        self.assertEqual(
            [("", "host1", ""),
             ("2", "host2", "VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE-2.VPD.xml"),
             ("3", "host3", "VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE-3.VPD.xml")],
            [(row["partition_id"], row["host"], row["document"]) for row in rows])


def main():
    global FLEET, SOURCE_ROOT  # pylint: disable=global-statement
    FLEET, SOURCE_ROOT = sys.argv[1], sys.argv[2]
    return report_test_runner.run(sys.argv[3], sys.modules[__name__])


if __name__ == "__main__":
    sys.exit(main())
