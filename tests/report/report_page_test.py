#!/usr/bin/python3
"""The report of a generated survey, checked the way people and programs
meet it: the page in headless Chromium (driven through chromium-driver with
Selenium), partitions.csv with Python's csv reader. Both against the
report's summary.json.

Usage: report_page_test.py REPORT_FOLDER TEST_NAME
Exit status 0 passed, 1 failed, 77 skipped (the reason is printed).
"""
import csv
import datetime
import io
import json
import os
import re
import shutil
import sys
import tempfile
import unittest
import urllib.parse

import report_test_runner

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


def start_chromium(profile, script=True, environment=None):
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
    service = Service(shutil.which("chromedriver"), env=environment)
    driver = webdriver.Chrome(service=service, options=options)
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


# Where a text of the page is laid out on more lines than one: every
# word (a run of non-blanks of one text node: an ID, a host name, an IP, a
# heading's word) of the elements of arguments[0], and the whole text of
# those of arguments[1]. Each finding names the element and the text.
BROKEN_TEXTS = """
// Boxes that overlap from top to bottom share a line: a key beside a text
// sits lower than the text's top but on its line.
function lineCount(range) {
    const boxes = Array.from(range.getClientRects()).filter(r => r.width > 0 && r.height > 0);
    boxes.sort((a, b) => a.top - b.top);
    let lines = 0;
    let bottom = -Infinity;
    for (const box of boxes) {
        if (box.top >= bottom - 1) { lines += 1; bottom = box.bottom; }
        bottom = Math.max(bottom, box.bottom);
    }
    return lines;
}
function where(element) {
    return element.tagName + ' ' + JSON.stringify(element.textContent.trim().slice(0, 60));
}
const found = [];
for (const element of document.querySelectorAll(arguments[0])) {
    const walker = document.createTreeWalker(element, NodeFilter.SHOW_TEXT);
    for (let node = walker.nextNode(); node; node = walker.nextNode()) {
        for (const word of node.data.matchAll(/\\S+/g)) {
            const range = document.createRange();
            range.setStart(node, word.index);
            range.setEnd(node, word.index + word[0].length);
            if (lineCount(range) > 1) { found.push('word ' + word[0] + ' broken in ' + where(element)); }
        }
    }
}
for (const element of document.querySelectorAll(arguments[1])) {
    const range = document.createRange();
    range.selectNodeContents(element);
    if (lineCount(range) > 1) { found.push('more than one line: ' + where(element)); }
}
return found;
"""

# Texts whose words must stay whole: everything a person reads.
WORDS = "h1, h2, .run, .totals li, .machines th, .machines td, #reading dt, #reading dd, " \
        "#filters label, #parts th, #parts td"
# Texts that must stay on one line: headings of columns, a partition's cells
# (of a reason, its summary: its text is laid out even while closed), a
# machine's identity, code and count, each outcome count, each key with its
# name, a total, a time, an option.
ONE_LINE = "#parts thead th, #parts tbody td:not(:has(details)), #parts summary, .machines th, " \
           ".machines td.code, .machines td.number, .counts > span, .keys > span, .totals li b, " \
           "time, .options span, #reading dt"
# Boxes whose content must not be cut off: headings and the cells.
NOT_CUT = "h1, h2, h3, th, td, #reading dt, .totals li, .change-counts li"
# The headings of a table that scrolls sideways, shown in part at its box's
# right edge ("Docum"): each is wholly inside the box or wholly outside it.
HEADINGS_CUT_BY_THEIR_BOX = """
const found = [];
for (const box of document.querySelectorAll('.table-scroll')) {
    const edge = box.getBoundingClientRect().left + box.clientLeft + box.clientWidth;
    for (const heading of box.querySelectorAll('thead th')) {
        const place = heading.getBoundingClientRect();
        if (place.left < edge - 0.5 && place.right > edge + 0.5) {
            found.push(heading.textContent.trim() + ' cut at ' + edge);
        }
    }
}
return found;
"""


class LayoutTest(unittest.TestCase):
    """The page at the widths people read it at, from a small laptop to a
    large screen: no word broken across lines, no heading cut off, and the
    page itself no wider than the window (a table too wide scrolls inside
    it)."""
    driver = None
    maxDiff = None

    @classmethod
    def setUpClass(cls):
        reason = browser_missing()
        if reason:
            raise unittest.SkipTest(reason)
        cls.profile = tempfile.mkdtemp(prefix="report-chromium-")
        cls.driver = start_chromium(cls.profile)

    @classmethod
    def tearDownClass(cls):
        if cls.driver is not None:
            cls.driver.quit()
            shutil.rmtree(cls.profile, ignore_errors=True)

    def check_width(self, width, page=None, words=WORDS, one_line=ONE_LINE):
        self.driver.execute_cdp_cmd("Emulation.setDeviceMetricsOverride", {
            "width": width, "height": 1000, "deviceScaleFactor": 1, "mobile": False})
        self.driver.get("file://" + (page or os.path.join(REPORT, "index.html")))
        self.assertEqual(width, self.driver.execute_script("return window.innerWidth;"))
        self.assertEqual([], self.driver.execute_script(BROKEN_TEXTS, words, one_line))
        cut = self.driver.execute_script(
            "return Array.from(document.querySelectorAll(arguments[0]))"
            ".filter(e => e.scrollWidth > e.clientWidth).map(e => e.textContent.trim());",
            NOT_CUT)
        self.assertEqual([], cut)
        self.assertEqual([], self.driver.execute_script(HEADINGS_CUT_BY_THEIR_BOX))
        self.assertLessEqual(self.driver.execute_script(
            "return document.documentElement.scrollWidth;"), width)
        # Opened, the reasons wrap between their words only.
        self.driver.execute_script(
            "document.querySelectorAll('#parts details').forEach(d => { d.open = true; });")
        self.assertEqual([], self.driver.execute_script(BROKEN_TEXTS, "#parts td", "#parts th"))

    def test_no_word_broken_nor_heading_cut_at_800_px(self):
        self.check_width(800)

    def test_no_word_broken_nor_heading_cut_at_900_px(self):
        self.check_width(900)

    def test_no_word_broken_nor_heading_cut_at_1600_px(self):
        self.check_width(1600)

    def test_no_word_broken_nor_heading_cut_at_2560_px(self):
        self.check_width(2560)


# The history's parts of the page: its words whole, its counts, names,
# outcomes and stale marks each on one line.
HISTORY_WORDS = WORDS + ", #since-last-run h3, #since-last-run p, #since-last-run li"
HISTORY_ONE_LINE = ONE_LINE + ", .change-counts li b, .change-list .machine-name, " \
    ".change-list .outcome-name, .stale"


def history_report():
    return os.path.join(os.path.dirname(REPORT), "history-report")


def csv_rows(folder):
    with open(os.path.join(folder, "partitions.csv"), encoding="utf-8", newline="") as file:
        return list(csv.reader(file))


class HistoryTest(unittest.TestCase):
    """The report of the files with a history of four runs
    (make_survey.py, history_seed.py): what changed since the last run on
    top, the partitions' history in the table and the CSV, stale partitions
    marked in words and by a mark."""
    driver = None
    maxDiff = None

    @classmethod
    def setUpClass(cls):
        reason = browser_missing()
        if reason:
            raise unittest.SkipTest(reason)
        cls.profile = tempfile.mkdtemp(prefix="report-chromium-")
        cls.driver = start_chromium(cls.profile)

    @classmethod
    def tearDownClass(cls):
        if cls.driver is not None:
            cls.driver.quit()
            shutil.rmtree(cls.profile, ignore_errors=True)

    def open_at(self, width):
        self.driver.execute_cdp_cmd("Emulation.setDeviceMetricsOverride", {
            "width": width, "height": 1000, "deviceScaleFactor": 1, "mobile": False})
        self.driver.get("file://" + os.path.join(history_report(), "index.html"))

    def script(self, code, *arguments):
        return self.driver.execute_script(code, *arguments)

    def check_section_on_top(self, width):
        self.open_at(width)
        self.assertEqual("since-last-run", self.script(
            "return document.querySelector('main > section').id;"))
        section, machines = self.script(
            "return ['since-last-run', 'machines'].map(id =>"
            " document.getElementById(id).getBoundingClientRect().toJSON());")
        self.assertLessEqual(section["bottom"], machines["top"])
        # Its heading and counts are on the first screen.
        self.assertLess(self.script("return document.querySelector('.change-counts')"
                                    ".getBoundingClientRect().bottom;"), 1000)

    def test_section_is_on_top_at_900_px(self):
        self.check_section_on_top(900)

    def test_section_is_on_top_at_1600_px(self):
        self.check_section_on_top(1600)

    def test_counts_match_their_lists(self):
        self.open_at(1600)
        counts = self.script(
            "return Array.from(document.querySelectorAll('.change-counts li')).map(li =>"
            " [li.lastChild.textContent, Number(li.querySelector('b').textContent),"
            "  (li.querySelector('a') || {}).hash || null]);")
        self.assertEqual(9, len(counts))
        for label, count, anchor in counts:
            listed = self.script(
                "const h = arguments[0] && document.querySelector(arguments[0]);"
                "return h ? h.nextElementSibling.querySelectorAll('li').length : 0;", anchor)
            self.assertEqual(count, listed, label)
        self.assertEqual({"New failures": 1, "Recovered": 1, "Still failing": 6, "Inventory changes": 3,
                          "Partitions disappeared": 1, "Machines disappeared": 1},
                         {label: count for label, count, _ in counts if count})

    def test_history_columns_follow_the_outcome_and_agree_with_the_csv(self):
        self.open_at(1600)
        headings = self.script("return Array.from(document.querySelectorAll('#parts thead th'))"
                               ".map(th => th.textContent);")
        outcome = headings.index("Outcome")
        self.assertEqual(["Last surveyed", "Failing since"], headings[outcome + 1:outcome + 3])
        cells = self.script(
            "return Array.from(document.querySelectorAll('#parts tbody tr')).map(r =>"
            " [r.cells[1].textContent, r.cells[2].textContent,"
            "  r.cells[arguments[0] + 1].textContent, r.cells[arguments[0]].textContent]);",
            outcome + 1)
        rows = csv_rows(history_report())
        self.assertEqual(CSV_COLUMNS + ["failing_since", "last_surveyed"], rows[0])

        def short(iso):
            return f"{iso[:10]} {iso[11:16]}" if iso else ""
        expected = sorted((row[2], row[3], short(row[14]), short(row[15]) or "never")
                          for row in rows[1:])
        shown = sorted((i, h, since, surveyed.replace(" stale", ""))
                       for i, h, since, surveyed in cells)
        self.assertEqual(expected, shown)

    def test_stale_partitions_are_marked_in_words_and_by_a_visible_mark(self):
        self.open_at(1600)
        marks = self.script(
            "return Array.from(document.querySelectorAll('#parts .stale')).map(mark => {"
            " const style = getComputedStyle(mark), before = getComputedStyle(mark, '::before');"
            " const place = mark.getBoundingClientRect();"
            " return [mark.textContent, style.borderTopStyle, style.color,"
            "  before.backgroundImage !== 'none' && before.width === '10px',"
            "  place.width > 0 && place.height > 0]; });")
        # Failing since the second run, last surveyed in the first; and the
        # inactive partitions, never surveyed in four runs.
        failing = [p for _, p in all_partitions(load_summary()) if p["outcome"] in
                   ("channel_failure", "client_failure", "fetch_failure", "timed_out")]
        inactive = [p for _, p in all_partitions(load_summary()) if p["outcome"] == "inactive"]
        self.assertEqual(len(failing) - 1 + len(inactive), len(marks))
        body = self.script("return getComputedStyle(document.body).color;")
        self.assertEqual({("stale", "dashed", body, True, True)},
                         {tuple(mark) for mark in marks})

    def test_history_page_is_readable_at_900_px(self):
        LayoutTest.check_width(self, 900, os.path.join(history_report(), "index.html"),
                               HISTORY_WORDS, HISTORY_ONE_LINE)

    def test_history_page_is_readable_at_1600_px(self):
        LayoutTest.check_width(self, 1600, os.path.join(history_report(), "index.html"),
                               HISTORY_WORDS, HISTORY_ONE_LINE)


def readable_time(iso):
    """The time as the page is to show it, worked out here apart from the
    program: "Mon 23 Nov 2026 14:05:09 UTC+01:00", in the time's own zone."""
    time = datetime.datetime.fromisoformat(iso)
    offset = time.strftime("%z")
    zone = "UTC" if offset in ("+0000", "-0000") else f"UTC{offset[:3]}:{offset[3:]}"
    weekdays = ["Mon", "Tue", "Wed", "Thu", "Fri", "Sat", "Sun"]
    months = ["Jan", "Feb", "Mar", "Apr", "May", "Jun", "Jul", "Aug", "Sep", "Oct", "Nov", "Dec"]
    return (f"{weekdays[time.weekday()]} {time.day} {months[time.month - 1]} {time.year} "
            f"{time:%H:%M:%S} {zone}")


class ReaderTest(unittest.TestCase):
    """What the page says beyond its data: times, links, colours and notes,
    wherever and by whomever it is read."""

    @classmethod
    def setUpClass(cls):
        reason = browser_missing()
        if reason:
            raise unittest.SkipTest(reason)
        cls.summary = load_summary()

    def open_page(self, page, environment=None):
        profile = tempfile.mkdtemp(prefix="report-chromium-")
        self.addCleanup(shutil.rmtree, profile, True)
        driver = start_chromium(profile, environment=environment)
        self.addCleanup(driver.quit)
        driver.get("file://" + page)
        return driver

    def test_times_show_in_the_runs_zone_whatever_the_readers_zone(self):
        """A reader in Berlin (TZ given to Chromium) sees the run's times as
        the run's machine wrote them, byte for byte, with their zone."""
        driver = self.open_page(os.path.join(REPORT, "index.html"),
                                dict(os.environ, TZ="Europe/Berlin"))
        self.assertEqual("Europe/Berlin", driver.execute_script(
            "return Intl.DateTimeFormat().resolvedOptions().timeZone;"))
        times = driver.execute_script(
            "return Array.from(document.querySelectorAll('.run time'))"
            ".map(t => [t.getAttribute('datetime'), t.textContent]);")
        started, ended = self.summary["started"], self.summary["ended"]
        # The report was written in UTC+05:30 (make_survey.py), not the reader's zone.
        self.assertTrue(started.endswith("+05:30"), started)
        self.assertEqual([[started, readable_time(started)], [ended, readable_time(ended)]], times)
        self.assertEqual(f"Partition survey of {self.summary['console_host']}, "
                         f"{readable_time(started)}", driver.title)

    def test_every_document_link_of_a_copied_report_folder_resolves(self):
        """The report folder copied elsewhere, its VPD folder left behind:
        every link leads to a copy of its document inside the copied folder."""
        copy = os.path.join(tempfile.mkdtemp(prefix="report-copy-"), "a", "copied report")
        self.addCleanup(shutil.rmtree, os.path.dirname(os.path.dirname(copy)), True)
        shutil.copytree(REPORT, copy)
        driver = self.open_page(os.path.join(copy, "index.html"))
        links = driver.execute_script(
            "return Array.from(document.querySelectorAll('#parts a')).map(a => a.href);")
        documents = [p["document"] for _, p in all_partitions(self.summary) if p["document"]]
        self.assertEqual(len(documents), len(links))
        vpd = os.path.join(os.path.dirname(REPORT), "VPD")
        for link, document in zip(links, documents):
            path = urllib.parse.unquote(urllib.parse.urlparse(link).path)
            self.assertEqual(os.path.join(copy, "documents", os.path.basename(document)), path)
            with open(path, "rb") as copied, \
                    open(os.path.join(vpd, os.path.basename(document)), "rb") as original:
                self.assertEqual(original.read(), copied.read(), link)

    def test_document_links_of_the_report_after_a_run_resolve_in_its_folder(self):
        run = os.path.join(os.path.dirname(REPORT), "run-report")
        driver = self.open_page(os.path.join(run, "index.html"))
        links = driver.execute_script(
            "return Array.from(document.querySelectorAll('#parts a')).map(a => a.href);")
        self.assertEqual(1, len(links))
        path = urllib.parse.unquote(urllib.parse.urlparse(links[0]).path)
        self.assertEqual(os.path.join(run, "documents"), os.path.dirname(path))
        self.assertTrue(os.path.isfile(path), path)

    def test_outcome_colours_differ_and_no_outcome_name_looks_like_a_link(self):
        driver = self.open_page(os.path.join(REPORT, "index.html"))
        colours = driver.execute_script(
            "const colours = {}; document.querySelectorAll('.totals li[data-outcome]')"
            ".forEach(li => { colours[li.dataset.outcome] = getComputedStyle(li).borderLeftColor; });"
            "return colours;")
        self.assertEqual(len(colours), len(set(colours.values())), colours)
        names = driver.execute_script(
            "return Array.from(document.querySelectorAll('#parts td.outcome')).map(td => {"
            " const style = getComputedStyle(td);"
            " return [style.color, style.textDecorationLine]; });")
        body = driver.execute_script("return getComputedStyle(document.body).color;")
        link = driver.execute_script(
            "return getComputedStyle(document.querySelector('#parts a')).color;")
        self.assertNotEqual(body, link)
        self.assertEqual({(body, "none")}, {tuple(name) for name in names})

    def test_notes_explain_the_codes_and_the_kept_status_texts(self):
        driver = self.open_page(os.path.join(REPORT, "index.html"))
        terms = driver.execute_script(
            "return Array.from(document.querySelectorAll('#reading dt')).map(dt => dt.textContent);")
        for term in ("Code 0, 4, 8", "4et result Failed, rc =", "rc = 4294967295", "listing failed"):
            self.assertIn(term, terms)


def main():
    global REPORT  # pylint: disable=global-statement
    REPORT = os.path.abspath(sys.argv[1])
    if not os.path.isfile(os.path.join(REPORT, "summary.json")):
        print(f"skipped: no report in {REPORT}: the survey could not be made here "
              "(see the test report.MakeSurveyAndReport)")
        return report_test_runner.SKIP
    return report_test_runner.run(sys.argv[2], sys.modules[__name__])


if __name__ == "__main__":
    sys.exit(main())
