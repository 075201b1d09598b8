#!/usr/bin/python3
"""The report of a generated survey, checked the way people and programs
meet it: the page in headless Chromium (driven through chromium-driver with
Selenium), partitions.csv with Python's csv reader. Both against the
report's summary.json.

Usage: report_page_test.py REPORT_FOLDER TEST_NAME
Exit status 0 passed, 1 failed, 77 skipped (the reason is printed).
"""
import csv
import io
import json
import os
import re
import shutil
import sys
import tempfile
import unittest

SKIP = 77
MARKUP_HOST = "<img src=x onerror=alert(1)>"
CSV_COLUMNS = ["machine", "machine_return_code", "partition_id", "host", "ip", "active_status",
               "outcome", "status_text", "return_code", "rc", "rc_cmd", "seconds", "document",
               "reason"]
REPORT = os.environ.get("REPORT_FOLDER", "")


def load_summary():
    with open(os.path.join(REPORT, "summary.json"), encoding="utf-8") as file:
        return json.load(file)


def all_partitions(summary):
    return [(machine, partition) for machine in summary["machines"]
            for partition in machine["partitions"]]


def browser_missing():
    """Why no headless Chromium can be driven here, or None."""
    for program in ("chromium", "chromedriver"):
        if shutil.which(program) is None:
            return f"{program} is not installed (Debian packages chromium, chromium-driver)"
    try:
        import selenium  # noqa: F401 pylint: disable=import-outside-toplevel,unused-import
    except ImportError:
        return "Python's selenium is not installed (Debian package python3-selenium)"
    return None


def start_chromium(profile, script=True):
    from selenium import webdriver  # pylint: disable=import-outside-toplevel
    from selenium.webdriver.chrome.service import Service  # pylint: disable=import-outside-toplevel
    options = webdriver.ChromeOptions()
    options.binary_location = shutil.which("chromium")
    for argument in ("--headless", "--no-sandbox", "--disable-gpu", "--disable-quic",
                     "--no-first-run", "--disable-background-networking",
                     "--disable-component-update", "--disable-sync",
                     "--window-size=1400,1000", f"--user-data-dir={profile}"):
        options.add_argument(argument)
    if not script:
        options.add_argument("--blink-settings=scriptEnabled=false")
    driver = webdriver.Chrome(service=Service(shutil.which("chromedriver")), options=options)
    # Any alert the page might raise is recorded instead of shown.
    driver.execute_cdp_cmd("Page.addScriptToEvaluateOnNewDocument", {
        "source": "window.__alerts = []; window.alert = function (m) { window.__alerts.push(String(m)); };"})
    return driver


class CsvTest(unittest.TestCase):
    def test_csv_rows_match_the_summary(self):
        with open(os.path.join(REPORT, "partitions.csv"), "rb") as file:
            raw = file.read()
        text = raw.decode("utf-8")
        rows = list(csv.reader(io.StringIO(text, newline="")))
        # RFC 4180 as Python writes it: CRLF after each row, quotes only where needed.
        rewritten = io.StringIO(newline="")
        csv.writer(rewritten, lineterminator="\r\n").writerows(rows)
        self.assertEqual(rewritten.getvalue(), text)
        self.assertEqual(CSV_COLUMNS, rows[0])
        expected = []
        for machine, partition in all_partitions(load_summary()):
            def field(value):
                return "" if value is None else (value if isinstance(value, str) else json.dumps(value))
            expected.append([machine["identity"], machine["return_code"], field(partition["id"])] +
                            [field(partition[column]) for column in CSV_COLUMNS[3:]])
        self.assertEqual(expected, rows[1:])

    def test_csv_carries_markup_and_replacement_characters_as_text(self):
        with open(os.path.join(REPORT, "partitions.csv"), encoding="utf-8", newline="") as file:
            hosts = [row["host"] for row in csv.DictReader(file)]
        self.assertIn(MARKUP_HOST, hosts)
        self.assertIn("a&b<c\"d", hosts)
        self.assertIn("h\ufffdst", hosts)


class RunReportTest(unittest.TestCase):
    def test_report_after_a_run_carries_the_runs_summary(self):
        run = os.path.join(os.path.dirname(REPORT), "run-report")
        with open(os.path.join(run, "summary.json"), encoding="utf-8") as file:
            reported = json.load(file)
        with open(os.path.join(os.path.dirname(REPORT), "run-summary.json"),
                  encoding="utf-8") as file:
            self.assertEqual(json.load(file), reported)
        self.assertEqual(1, reported["totals"]["timed_out"])
        self.assertTrue(os.path.isfile(os.path.join(run, "index.html")))
        self.assertTrue(os.path.isfile(os.path.join(run, "partitions.csv")))

    def test_time_limit_is_read_back_from_the_default_document(self):
        stopped = [p for _, p in all_partitions(load_summary()) if p["outcome"] == "timed_out"]
        self.assertEqual(1, len(stopped))
        self.assertEqual("slowpoke", stopped[0]["host"])
        self.assertEqual("9", stopped[0]["id"])
        self.assertEqual("runCmdOnPartition", stopped[0]["time_limit"]["action"])
        self.assertIn("Stopped by the time limit of 1 s after ", stopped[0]["reason"])


class PageTest(unittest.TestCase):
    driver = None

    @classmethod
    def setUpClass(cls):
        reason = browser_missing()
        if reason:
            raise unittest.SkipTest(reason)
        cls.profile = tempfile.mkdtemp(prefix="report-chromium-")
        cls.driver = start_chromium(cls.profile)
        cls.summary = load_summary()

    @classmethod
    def tearDownClass(cls):
        if cls.driver is not None:
            cls.driver.quit()
            shutil.rmtree(cls.profile, ignore_errors=True)

    def setUp(self):
        self.driver.get("file://" + os.path.join(REPORT, "index.html"))

    def script(self, code, *arguments):
        return self.driver.execute_script(code, *arguments)

    def outcome_classes(self):
        """Each outcome's name and the class of its rows, as the page's totals
        carry them: the page, not this test, knows the classes."""
        return self.script("const classes = {};"
                           "document.querySelectorAll('.totals li[data-outcome]').forEach(li => {"
                           " classes[li.dataset.outcome] = li.className; }); return classes;")

    def column_texts(self, column):
        """The texts of one column of the rows listed, found by its header."""
        return self.script("const header = document.querySelector("
                           " `#parts thead th[data-column=${arguments[0]}]`);"
                           "return Array.from(document.querySelectorAll('#parts tbody tr'))"
                           ".map(r => r.cells[header.cellIndex].textContent);", column)

    def rendered_row_classes(self):
        return self.script("return Array.from(document.querySelectorAll('#parts tbody tr'))"
                           ".filter(r => r.offsetParent !== null).map(r => r.className);")

    def choose_only(self, outcome):
        self.script("document.querySelectorAll('#filters input[data-outcome]').forEach(b => {"
                    " b.checked = b.dataset.outcome === arguments[0]; });"
                    "document.getElementById('filters').dispatchEvent(new Event('change'));",
                    outcome)

    def test_page_names_a_class_for_every_outcome_of_the_summary(self):
        classes = self.outcome_classes()
        outcomes = set(self.summary["totals"]) - {"machines", "partitions"}
        self.assertEqual(outcomes, set(classes))
        self.assertEqual(len(classes), len(set(classes.values())))
        self.assertTrue(all(classes.values()), classes)

    def test_header_totals_match_the_summary(self):
        page_totals = self.script(
            "const t = {}; document.querySelectorAll('.totals li').forEach(li => {"
            " t[li.dataset.outcome || li.lastChild.textContent.trim()] ="
            " Number(li.querySelector('b').textContent); }); return t;")
        totals = self.summary["totals"]
        self.assertEqual(totals["machines"], page_totals["machines"])
        self.assertEqual(totals["partitions"], page_totals["partitions"])
        for outcome in self.outcome_classes():
            self.assertEqual(totals[outcome], page_totals[outcome], outcome)

    def test_rows_per_outcome_match_the_summary(self):
        classes = self.rendered_row_classes()
        self.assertEqual(self.summary["totals"]["partitions"], len(classes))
        for outcome, css_class in self.outcome_classes().items():
            self.assertEqual(self.summary["totals"][outcome], classes.count(css_class), outcome)

    def test_markup_host_name_shows_as_text_and_runs_nothing(self):
        hosts = self.column_texts("host")
        self.assertIn(MARKUP_HOST, hosts)
        self.assertIn("a&b<c\"d", hosts)
        self.assertEqual(0, self.script("return document.images.length;"))
        self.assertEqual([], self.script("return window.__alerts;"))

    def test_bytes_that_are_not_utf8_show_as_replacement_character(self):
        self.assertIn("h\ufffdst", self.column_texts("host"))

    def test_filtering_by_outcome_leaves_only_those_rows(self):
        for outcome, css_class in self.outcome_classes().items():
            self.choose_only(outcome)
            classes = self.rendered_row_classes()
            self.assertEqual(self.summary["totals"][outcome], len(classes), outcome)
            self.assertTrue(all(c == css_class for c in classes), outcome)

    def test_clicking_a_total_shows_only_its_partitions(self):
        self.script("document.querySelector('.totals li[data-outcome=fetch_failure]').click();")
        classes = self.rendered_row_classes()
        self.assertEqual(self.summary["totals"]["fetch_failure"], len(classes))
        self.assertEqual({self.outcome_classes()["fetch_failure"]}, set(classes))

    def test_free_text_filter_keeps_matching_rows(self):
        self.script("const filter = document.getElementById('text-filter');"
                    "filter.value = arguments[0]; filter.dispatchEvent(new Event('input'));",
                    ' B<C"D ')
        self.script("return new Promise(r => setTimeout(r, 400));")
        self.assertEqual(["a&b<c\"d"], self.column_texts("host"))

    def test_sorting_by_host_orders_rows_both_ways(self):
        header = "#parts thead th[data-column=host]"
        click = f"document.querySelector('{header} button').click();"
        self.script(click)
        ascending = self.column_texts("host")
        non_empty = [h for h in ascending if h]
        self.assertEqual(sorted(non_empty, key=str.lower), non_empty)
        self.script(click)
        descending = [h for h in self.column_texts("host") if h]
        self.assertEqual(sorted(non_empty, key=str.lower, reverse=True), descending)
        self.assertEqual("descending", self.script(
            f"return document.querySelector('{header}').getAttribute('aria-sort');"))

    def test_machine_link_shows_that_machines_partitions(self):
        self.script("document.querySelector('a[data-machine=\"8286-42A_10XYZ99\"]').click();")
        self.assertEqual({"8286-42A_10XYZ99"}, set(self.column_texts("machine")))

    def test_reason_opens_on_demand_and_document_links_resolve(self):
        reasons = self.script("return Array.from(document.querySelectorAll('#parts details'))"
                              ".map(d => d.open);")
        failed = sum(1 for _, p in all_partitions(self.summary) if p["reason"] is not None)
        self.assertEqual([False] * failed, reasons)
        links = self.script("return Array.from(document.querySelectorAll('#parts a')).map(a => a.href);")
        documents = [p for _, p in all_partitions(self.summary) if p["document"] is not None]
        self.assertEqual(len(documents), len(links))
        for link in links:
            self.assertTrue(link.startswith("file://"))
            self.assertTrue(os.path.isfile(link[len("file://"):]), link)

    def test_large_page_reads_every_row_and_sorts_them_all(self):
        """A page too large for one slice of the script's reading: its rows
        are those of the report repeated, written beside it so that its
        links resolve the same way."""
        copies = 1000
        with open(os.path.join(REPORT, "index.html"), encoding="utf-8") as file:
            page = file.read()
        start = page.index("<tbody>", page.index('<noscript id="partition-rows">')) + len("<tbody>")
        end = page.index("</tbody>", start)
        rows = re.sub(r" id=m\d+", "", page[start:end])
        large = os.path.join(REPORT, "large-test.html")
        with open(large, "w", encoding="utf-8") as file:
            file.write(page[:start] + rows * copies + page[end:])
        try:
            self.driver.get("file://" + large)
            # Sorting at once reads the rows not yet read before it sorts.
            self.script("document.querySelector('#parts thead th[data-column=id] button').click();")
            partitions = self.summary["totals"]["partitions"] * copies
            self.assertEqual(f"showing 200 of {partitions} of {partitions} partitions",
                             self.script("return document.getElementById('row-count').textContent;"))
            ids = [int(i) for i in self.column_texts("id")]
            self.assertEqual(sorted(ids), ids)
            self.assertEqual(min(int(p["id"]) for _, p in all_partitions(self.summary)
                                 if p["id"] is not None), ids[0])
            # The rarest outcome's rows fit on the page after one "Show more".
            totals = self.summary["totals"]
            rarest = min((o for o in self.outcome_classes() if totals[o] > 0), key=totals.get)
            self.choose_only(rarest)
            self.assertEqual(totals[rarest] * copies, len(self.script(
                "document.querySelector('#show-more button').click();"
                "return document.querySelectorAll('#parts tbody tr');")))
        finally:
            os.remove(large)

    def test_page_reads_fully_without_script(self):
        driver = start_chromium(tempfile.mkdtemp(prefix="report-chromium-"), script=False)
        try:
            driver.get("file://" + os.path.join(REPORT, "index.html"))
            rows = driver.execute_cdp_cmd("Runtime.evaluate", {
                "expression": "document.querySelectorAll('.parts tbody tr').length"})
            self.assertEqual(self.summary["totals"]["partitions"], rows["result"]["value"])
            # The filters work only with script: they are not shown without it.
            filters = driver.execute_cdp_cmd("Runtime.evaluate", {
                "expression": "getComputedStyle(document.getElementById('filters')).display"})
            self.assertEqual("none", filters["result"]["value"])
        finally:
            driver.quit()


def main():
    global REPORT  # pylint: disable=global-statement
    REPORT = os.path.abspath(sys.argv[1])
    if not os.path.isfile(os.path.join(REPORT, "summary.json")):
        print(f"skipped: no report in {REPORT}: the survey could not be made here "
              "(see the test report.MakeSurveyAndReport)")
        return SKIP
    suite = unittest.defaultTestLoader.loadTestsFromName(sys.argv[2], sys.modules[__name__])
    result = unittest.TextTestRunner(verbosity=2).run(suite)
    if result.skipped and not result.failures and not result.errors:
        print("skipped:", "; ".join(reason for _, reason in result.skipped))
        return SKIP
    return 0 if result.wasSuccessful() and result.testsRun > 0 else 1


if __name__ == "__main__":
    sys.exit(main())
