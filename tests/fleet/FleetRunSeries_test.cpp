// A console followed over six runs whose answers change between them
// (series/run-1.scn to run-6.scn): boreas fails, fails again and recovers;
// aurora's ent0 gets a new serial number at the same location, then the
// partition a new code level; cirrus is no longer listed, the machine's
// listing fails, and cirrus is listed again. Each change must be told
// exactly, and alike, by every output that tells changes: the history
// database's events, the history command (its tables and --json), the
// report's "Since the last run", the metrics file and the JUnit file.
// The series runs once, in the sandbox, whose state folder is its own; the
// outputs are compared with series/expected/ byte for byte, with the run
// times and the console's host name made fixed.

#include "FleetTools.h"
#include "QuorvexTest.h"
#include "SummaryFile.h"
#include "SurveyProcess.h"
#include "utility/Trace.h"

#include <SQLiteCpp/SQLiteCpp.h>

#include <gtest/gtest.h>

#include <memory>
#include <regex>
#include <string>
#include <utility>
#include <vector>

namespace {

constexpr char gc_Identity[] = "9119-MHE_21ABCDE";
constexpr char gc_StateFolder[] = "/var/lib/quorvex-survey";
constexpr char gc_History[] = "/var/lib/quorvex-survey/history.sqlite";
constexpr char gc_Python[] = QUORVEX_SYSTEM_PYTHON;
constexpr char gc_Promtool[] = QUORVEX_PROMTOOL;
constexpr char gc_MetricsReader[] = QUORVEX_FLEET_METRICS_READER;
constexpr char gc_JunitReader[] = QUORVEX_FLEET_JUNIT_READER;
constexpr int gc_Runs = 6;
constexpr double gc_Bound = 60.0;

std::string seriesFile(std::string const& name) {
    return QuorvexTest::sourceRoot() + "/tests/fleet/series/" + name;
}

std::string expectedFile(std::string const& name) {
    return seriesFile("expected/" + name);
}

std::string runName(int run) {
    return "run-" + std::to_string(run);
}

// text with every time of a run, as the outputs write it, replaced by a
// placeholder of the same length, so that tables keep their columns.
std::string withFixedTimes(std::string const& text) {
    static std::regex const iso(R"(\d{4}-\d\d-\d\dT\d\d:\d\d:\d\d[+-]\d\d:\d\d)");
    static std::regex const minutes(R"(\d{4}-\d\d-\d\d \d\d:\d\d)");
    static std::regex const readable(
        R"([A-Z][a-z]{2} \d{1,2} [A-Z][a-z]{2} \d{4} \d\d:\d\d:\d\d UTC)"
        R"((?:[+-]\d\d:\d\d)?)");
    std::string fixed = std::regex_replace(text, iso, "YYYY-MM-DDThh:mm:ss+hh:mm");
    fixed = std::regex_replace(fixed, minutes, "YYYY-MM-DD hh:mm");
    return std::regex_replace(fixed, readable, "Www D Mmm YYYY hh:mm:ss UTC");
}

// text with the console's host name replaced where the outputs name the
// console, and the run's times fixed.
std::string steady(std::string text) {
    std::string const host = Utility::get_HostName();
    for (auto const& [form, fixed] :
         {std::pair<std::string, std::string>{R"("console": ")" + host + "\"",
                                              R"("console": "CONSOLE")"},
          {"console=\"" + host + "\"", "console=\"CONSOLE\""},
          {" of " + host + ", started", " of CONSOLE, started"},
          {" (" + host + "): ", " (CONSOLE): "}}) {
        for (std::string::size_type at = text.find(form); at != std::string::npos;
             at = text.find(form, at + fixed.size())) {
            text.replace(at, form.size(), fixed);
        }
    }
    return withFixedTimes(text);
}

// read-metrics.py's lines with the values of the run's start, end and
// length, which vary, replaced.
std::string withFixedRunTimes(std::string const& lines) {
    static std::regex const varying(
        R"((quorvex_survey_run_(?:start_timestamp|end_timestamp|duration)_seconds\{[^}\n]*\}) [^\n]*)");
    return std::regex_replace(lines, varying, "$1 (varies)");
}

// The rows a query gives, one line each, the columns separated by " | ",
// null as "-" and line ends in texts as \n.
std::string rowsOf(std::string const& sql) {
    SQLite::Database database(gc_History, SQLite::OPEN_READONLY);
    SQLite::Statement query(database, sql);
    std::string lines;
    while (query.executeStep()) {
        for (int column = 0; column < query.getColumnCount(); ++column) {
            std::string value =
                query.getColumn(column).isNull() ? "-" : query.getColumn(column).getString();
            for (std::string::size_type at = value.find('\n'); at != std::string::npos;
                 at = value.find('\n', at + 2)) {
                value.replace(at, 1, "\\n");
            }
            lines += (column == 0 ? "" : " | ") + value;
        }
        lines += "\n";
    }
    return lines;
}

// The HTML of the report's "Since the last run" section, or why there is
// none.
std::string sinceLastRunSection(std::string const& page) {
    std::string::size_type const start = page.find("<section id=\"since-last-run\">");
    std::string::size_type const end = page.find("</section>", start);
    if (start == std::string::npos || end == std::string::npos) {
        return "(no section \"since-last-run\")\n";
    }
    return page.substr(start, end + std::string("</section>").size() - start) + "\n";
}

class FleetRunSeries : public ::testing::Test {
protected:
    // The runs, one after the other, each with its own scenario and
    // its own report, metrics and JUnit files.
    static void SetUpTestSuite() {
        ASSERT_TRUE(QuorvexTest::isInsideSandbox());
        QuorvexTest::clearFolder(QuorvexTest::gc_VPD_Folder);
        QuorvexTest::clearFolder(QuorvexTest::gc_TraceFolder);
        QuorvexTest::clearFolder(gc_StateFolder);
        s_work = std::make_unique<QuorvexTest::TemporaryDirectory>();
        for (int run = 1; run <= gc_Runs; ++run) {
            QuorvexTest::SimulatedConsole const console(
                QuorvexTest::ScenarioFile{seriesFile(runName(run) + ".scn")});
            s_exitStatuses.push_back(_survey(run).waitForExit(gc_Bound));
        }
    }

    static void TearDownTestSuite() { s_work.reset(); }

    static FleetTest::SurveyProcess _survey(int run) {
        std::string const name = runName(run);
        return FleetTest::SurveyProcess(
            {FleetTest::consoleWideTool(), "--summary", _output(name + "/summary.json"), "--report",
             _output(name + "/report"), "--metrics", _output(name + "/run.prom"), "--junit",
             _output(name + "/run.xml"), gc_Identity},
            _output(name + ".stdout"), _output(name + ".stderr"));
    }

    static std::string _output(std::string const& name) { return s_work->file(name); }

    // The history command's standard output; its status and standard error
    // must say it answered.
    static std::string _history(std::vector<std::string> const& arguments) {
        std::vector<std::string> argv{FleetTest::consoleWideTool(), "history"};
        argv.insert(argv.end(), arguments.begin(), arguments.end());
        QuorvexTest::CommandResult const answer = QuorvexTest::runCommand(argv);
        EXPECT_EQ(answer.exitStatus, 0) << answer.stderrText;
        EXPECT_EQ(answer.stderrText, "");
        return answer.stdoutText;
    }

    static std::string _read(std::string const& reader, std::string const& file) {
        QuorvexTest::CommandResult const read =
            QuorvexTest::runCommand({gc_Python, reader, _output(file)});
        EXPECT_EQ(read.exitStatus, 0) << read.stdoutText << read.stderrText;
        return read.stdoutText;
    }

    static std::unique_ptr<QuorvexTest::TemporaryDirectory> s_work;
    static std::vector<int> s_exitStatuses;
};

std::unique_ptr<QuorvexTest::TemporaryDirectory> FleetRunSeries::s_work;
std::vector<int> FleetRunSeries::s_exitStatuses;

TEST_F(FleetRunSeries, EachRunEndsWithItsOverallCodeAndIsRecordedUnderTheNextId) {
    EXPECT_EQ(s_exitStatuses, (std::vector<int>{0, 4, 4, 0, 8, 0}));
    for (int run = 1; run <= gc_Runs; ++run) {
        FleetTest::SummaryFile const summary(_output(runName(run) + "/summary.json"));
        EXPECT_EQ(summary.field("/history/run_id"), std::to_string(run));
        EXPECT_EQ(summary.field("/history/recorded"), "true");
    }
}

TEST_F(FleetRunSeries, EventsTableHoldsExactlyTheChangesOfEachRun) {
    EXPECT_TRUE(QuorvexTest::matchesExpectedFile(
        rowsOf("SELECT run_id, scope, kind, machine, partition, component, component_name, "
               "property, old_value, new_value, outcome, reason, failing_since_run, runs_failing "
               "FROM events ORDER BY id"),
        expectedFile("events.txt")));
}

TEST_F(FleetRunSeries, PartitionRowsCarryEachRunsFailingStreakLastSurveyAndInventory) {
    EXPECT_TRUE(QuorvexTest::matchesExpectedFile(
        rowsOf("SELECT run_id, machine, partition, outcome, failing_since_run, runs_failing, "
               "last_surveyed_run, inventory, inventory_problem FROM partition_results "
               "ORDER BY run_id, machine, partition"),
        expectedFile("partitions.txt")));
}

TEST_F(FleetRunSeries, HistoryChangesJsonOfEachRunListsExactlyItsChanges) {
    for (int run = 1; run <= gc_Runs; ++run) {
        EXPECT_TRUE(QuorvexTest::matchesExpectedFile(
            steady(_history({"changes", "--run", std::to_string(run), "--json"})),
            expectedFile(runName(run) + "-changes.json")));
    }
}

TEST_F(FleetRunSeries, HistoryChangesTableOfEachRunListsExactlyItsChanges) {
    for (int run = 1; run <= gc_Runs; ++run) {
        EXPECT_TRUE(QuorvexTest::matchesExpectedFile(
            steady(_history({"changes", "--run", std::to_string(run)})),
            expectedFile(runName(run) + "-changes.txt")));
    }
}

TEST_F(FleetRunSeries, PartitionStoryOfTheFailingPartitionTellsItsFailureStreakAndRecovery) {
    EXPECT_TRUE(QuorvexTest::matchesExpectedFile(
        steady(_history({"partition", gc_Identity, "boreas"})), expectedFile("boreas-story.txt")));
}

TEST_F(FleetRunSeries, PartitionStoryOfTheChangedPartitionTellsTheReplacementAndTheCodeLevel) {
    EXPECT_TRUE(QuorvexTest::matchesExpectedFile(
        steady(_history({"partition", gc_Identity, "aurora"})), expectedFile("aurora-story.txt")));
    EXPECT_TRUE(QuorvexTest::matchesExpectedFile(
        steady(_history({"partition", gc_Identity, "aurora", "--json"})),
        expectedFile("aurora-story.json")));
}

TEST_F(FleetRunSeries, ReportOfEachRunShowsExactlyItsChangesSinceTheLastRun) {
    for (int run = 1; run <= gc_Runs; ++run) {
        std::string const page =
            QuorvexTest::readFile(_output(runName(run) + "/report/index.html"));
        EXPECT_TRUE(QuorvexTest::matchesExpectedFile(steady(sinceLastRunSection(page)),
                                                     expectedFile(runName(run) + "-report.html")));
    }
}

TEST_F(FleetRunSeries, MetricsOfEachRunCountItsNewFailuresRecoveriesAndInventoryChanges) {
    for (int run = 1; run <= gc_Runs; ++run) {
        std::string const metrics = runName(run) + "/run.prom";
        QuorvexTest::CommandResult const lint = QuorvexTest::runShell(
            std::string(gc_Promtool) + " check metrics < " + _output(metrics));
        EXPECT_EQ(lint.exitStatus, 0) << lint.stdoutText << lint.stderrText;
        EXPECT_EQ(lint.stdoutText + lint.stderrText, "");
        EXPECT_TRUE(QuorvexTest::matchesExpectedFile(
            steady(withFixedRunTimes(_read(gc_MetricsReader, metrics))),
            expectedFile(runName(run) + "-metrics.txt")));
    }
}

TEST_F(FleetRunSeries, JunitOfEachRunFailsExactlyTheFailingPartitionWithItsReason) {
    for (int run = 1; run <= gc_Runs; ++run) {
        EXPECT_TRUE(
            QuorvexTest::matchesExpectedFile(_read(gc_JunitReader, runName(run) + "/run.xml"),
                                             expectedFile(runName(run) + "-junit.txt")));
    }
}

} // namespace
