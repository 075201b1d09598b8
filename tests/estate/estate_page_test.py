#!/usr/bin/python3
"""The estate report of a generated collection, checked in headless
Chromium (driven through chromium-driver with Selenium) against the
report's own estate.json: consoles not collected first, every console once,
the partitions' list sorted, filtered and drawn as far as it is scrolled,
and the page without script.

Usage: estate_page_test.py REPORT_FOLDER TEST_NAME
Exit status 0 passed, 1 failed, 77 skipped (the reason is printed).
"""
import json
import os
import shutil
import sys
import tempfile
import unittest

sys.path.insert(0, os.path.join(os.path.dirname(os.path.abspath(__file__)), "..", "report"))
import report_test_runner  # noqa: E402 pylint: disable=wrong-import-position
from report_page_test import browser_missing, start_chromium  # noqa: E402 pylint: disable=wrong-import-position

REPORT = ""
FAILING = ("channel_failure", "client_failure", "fetch_failure", "timed_out", "worker_died")
RECORD_LABELS = {"unreachable": "unreachable", "timed_out": "timed out", "tool_error": "tool error",
                 "stale": "stale", "collected": "collected"}


def load_estate():
    with open(os.path.join(REPORT, "estate.json"), encoding="utf-8") as file:
        return json.load(file)


def rows_of(estate):
    """The partitions' list as the page holds it, in the estate's order:
    (console, machine, partition or None for a machine whose listing failed)."""
    rows = []
    for console in estate["consoles"]:
        for machine in (console["summary"] or {}).get("machines", []):
            if machine.get("listing_failure") is not None:
                rows.append((console, machine, None))
            rows.extend((console, machine, partition) for partition in machine["partitions"])
    return rows


def row_count_text(shown, total):
    return f"{shown:,} of {total:,} partitions"


class EstatePageTest(unittest.TestCase):
    driver = None

    @classmethod
    def setUpClass(cls):
        reason = browser_missing()
        if reason:
            raise unittest.SkipTest(reason)
        cls.profile = tempfile.mkdtemp(prefix="estate-chromium-")
        cls.driver = start_chromium(cls.profile)
        cls.estate = load_estate()
        cls.rows = rows_of(cls.estate)

    @classmethod
    def tearDownClass(cls):
        if cls.driver is not None:
            cls.driver.quit()
            shutil.rmtree(cls.profile, ignore_errors=True)

    def setUp(self):
        self.driver.get("file://" + os.path.join(REPORT, "index.html"))
        self.assertEqual(self.script("return document.body.dataset.ready;"), "true")

    def script(self, code, *arguments):
        return self.driver.execute_script(code, *arguments)

    def after_frame(self, code, *arguments):
        """Runs code, then waits for the next frame, when the list is drawn."""
        return self.driver.execute_async_script(
            "const done = arguments[arguments.length - 1];"
            "(new Function(arguments[0])).apply(null, Array.from(arguments).slice(1, -1));"
            "requestAnimationFrame(() => requestAnimationFrame(() => done("
            " document.getElementById('row-count').textContent)));", code, *arguments)

    def choose(self, select, value):
        return self.after_frame("const s = document.getElementById(arguments[0]); s.value = arguments[1];"
                                "s.dispatchEvent(new Event('change'));", select, value)

    def type_text(self, text):
        return self.after_frame("const t = document.getElementById('text-filter'); t.value = arguments[0];"
                                "t.dispatchEvent(new Event('input'));", text)

    def drawn_hosts(self):
        return self.script("const header = document.querySelector('.estate-rows th[data-column=host]');"
                           "return Array.from(document.querySelectorAll('#row-body tr:not(.spacer)'))"
                           ".map(r => r.cells[header.cellIndex].textContent);")

    def test_not_collected_consoles_come_first_with_their_reasons(self):
        expected = [[c["console"], RECORD_LABELS[c["record"]], c["message"]]
                    for c in self.estate["consoles"] if c["record"] != "collected"]
        self.assertTrue(expected, "the estate has consoles not collected")
        first = self.script("return document.querySelector('main section').id;")
        self.assertEqual(first, "not-collected")
        shown = self.script("return Array.from(document.querySelectorAll('#not-collected tbody tr'))"
                            ".map(r => Array.from(r.cells).slice(0, 3).map(c => c.textContent));")
        self.assertEqual(shown, expected)

    def test_consoles_table_lists_every_console_exactly_once(self):
        names = self.script("return Array.from(document.querySelectorAll('table.consoles tbody th'))"
                            ".map(th => th.textContent);")
        self.assertEqual(names, [c["console"] for c in self.estate["consoles"]])
        self.assertEqual(len(set(names)), len(names))

    def test_hostile_names_show_as_text_and_run_nothing(self):
        names = [c["console"] for c in self.estate["consoles"] if "<" in c["console"]]
        self.assertTrue(names, "the estate has a console whose name carries markup")
        self.assertIn(names[0], self.script("return document.body.innerText;"))
        self.assertEqual(self.script("return document.querySelectorAll('main b b, main img').length;"), 0)
        self.assertEqual(self.script("return window.__alerts;"), [])

    def test_partitions_list_counts_every_partition(self):
        total = len(self.rows)
        self.assertEqual(total, self.estate["totals"]["partitions"] +
                         self.estate["totals"]["machines_listing_failed"])
        self.assertEqual(self.script("return document.getElementById('row-count').textContent;"),
                         row_count_text(total, total))

    def test_sorting_by_host_puts_the_first_host_first_then_the_last(self):
        hosts = [partition["host"] if partition else "" for _, _, partition in self.rows]
        self.after_frame("document.querySelector('.estate-rows th[data-column=host] button').click();")
        self.assertEqual(self.drawn_hosts()[0], min(hosts))
        self.after_frame("document.querySelector('.estate-rows th[data-column=host] button').click();")
        self.assertEqual(self.drawn_hosts()[0], max(hosts))
        self.assertEqual(self.script("return document.querySelector('.estate-rows th[data-column=host]')"
                                     ".getAttribute('aria-sort');"), "descending")

    def test_outcome_filter_counts_one_outcome_and_every_failure(self):
        total = len(self.rows)
        channel = self.estate["totals"]["outcomes"]["channel_failure"]
        self.assertGreater(channel, 0)
        self.assertEqual(self.choose("outcome-choice", "channel_failure"), row_count_text(channel, total))
        classes = self.script("return Array.from(document.querySelectorAll('#row-body tr:not(.spacer)'))"
                              ".map(r => r.className);")
        self.assertEqual(len(set(classes)), 1)
        failing = sum(self.estate["totals"]["outcomes"][name] for name in FAILING) + \
            self.estate["totals"]["machines_listing_failed"]
        self.assertEqual(self.choose("outcome-choice", "failed"), row_count_text(failing, total))

    def test_console_filter_counts_that_consoles_partitions(self):
        total = len(self.rows)
        for index, console in enumerate(self.estate["consoles"]):
            mine = sum(1 for owner, _, _ in self.rows if owner is console)
            self.assertEqual(self.choose("console-choice", str(index)), row_count_text(mine, total),
                             console["console"])

    def test_text_filter_counts_rows_holding_the_text(self):
        total = len(self.rows)
        hostile = next(c for c in self.estate["consoles"] if "<" in c["console"])
        for text in ("PART-0017.", "ZÜRICH"):
            expected = sum(1 for console, _, partition in self.rows
                           if text.lower() in (console["console"] + "\n" +
                                               (partition["host"] if partition else "")).lower())
            self.assertGreater(expected, 0, text)
            self.assertEqual(self.type_text(text), row_count_text(expected, total), text)
        self.assertIn("zürich", hostile["console"].lower())

    def test_scrolling_to_the_bottom_draws_the_last_row(self):
        last = self.rows[-1][2]["host"]
        self.assertNotIn(last, self.drawn_hosts())
        self.after_frame("const v = document.getElementById('row-viewport'); v.scrollTop = v.scrollHeight;")
        self.assertEqual(self.drawn_hosts()[-1], last)
        in_view = self.script(
            "const v = document.getElementById('row-viewport').getBoundingClientRect();"
            "const rows = document.querySelectorAll('#row-body tr:not(.spacer)');"
            "const r = rows[rows.length - 1].getBoundingClientRect();"
            "return r.top >= v.top && r.bottom <= v.bottom + 1;")
        self.assertTrue(in_view)
        drawn = self.script("return document.querySelectorAll('#row-body tr:not(.spacer)').length;")
        self.assertLess(drawn, len(self.rows))


class WithoutScriptTest(unittest.TestCase):
    def setUp(self):
        reason = browser_missing()
        if reason:
            raise unittest.SkipTest(reason)
        self.profile = tempfile.mkdtemp(prefix="estate-chromium-")
        self.driver = start_chromium(self.profile, script=False)
        self.addCleanup(shutil.rmtree, self.profile, True)
        self.addCleanup(self.driver.quit)
        self.estate = load_estate()
        self.driver.get("file://" + os.path.join(REPORT, "index.html"))

    def test_page_shows_consoles_not_collected_and_links_each_consoles_report(self):
        from selenium.webdriver.common.by import By  # pylint: disable=import-outside-toplevel
        text = self.driver.find_element(By.ID, "not-collected").text
        for console in self.estate["consoles"]:
            if console["record"] != "collected":
                self.assertIn(console["console"], text)
                self.assertIn(console["message"], text)
        links = {a.text: a.get_attribute("href")
                 for a in self.driver.find_elements(By.CSS_SELECTOR, "table.consoles a")}
        expected = {c["console"]: c["report"] for c in self.estate["consoles"] if c["report"]}
        self.assertEqual(set(links), set(expected))
        for name, report in expected.items():
            self.assertTrue(report.startswith("consoles/") and report.endswith("/index.html"), report)
            self.assertEqual(links[name], "file://" + os.path.join(REPORT, report))
        console = next(c for c in self.estate["consoles"] if "<" in c["console"])
        self.driver.get(links[console["console"]])
        self.assertIn(console["summary"]["console_host"], self.driver.find_element(By.TAG_NAME, "body").text)
        self.assertIn(console["summary"]["machines"][0]["partitions"][0]["host"],
                      self.driver.find_element(By.TAG_NAME, "body").text)


def main():
    global REPORT  # pylint: disable=global-statement
    REPORT = os.path.abspath(sys.argv[1])
    if not os.path.isfile(os.path.join(REPORT, "estate.json")):
        print(f"skipped: no estate report in {REPORT} (see the test estate.MakeEstateReport)")
        return report_test_runner.SKIP
    return report_test_runner.run(sys.argv[2], sys.modules[__name__])


if __name__ == "__main__":
    sys.exit(main())
