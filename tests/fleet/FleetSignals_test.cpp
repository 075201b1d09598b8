// The files monitoring reads, from a run against the simulated console with
// every kind of ending: the metrics file read by promtool and by the
// Prometheus client's parser, the JUnit file by Python's XML reader and
// checked against docs/junit.xsd, host names and reasons with markup and
// non-ASCII characters read back as the console gave them; the metrics
// file's mode, no temporary file left, and folders that cannot be written
// (exit status 73). Inside the sandbox, where the console tools are the
// simulator.

#include "FleetTools.h"
#include "QuorvexTest.h"
#include "SurveyProcess.h"
#include "utility/Trace.h"

#include <gtest/gtest.h>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <chrono>
#include <csignal>

#include <cstdio>
#include <ctime>
#include <filesystem>
#include <map>
#include <sstream>
#include <thread>

namespace {

using FleetTest::SurveyProcess;
using QuorvexTest::SimulatedConsole;

constexpr char gc_Identity[] = "1234-ABC_10ABCDE";
// A machine the console does not know: its listing fails.
constexpr char gc_Unknown[] = "5678-DEF_20FGHIJ";
constexpr char gc_Python[] = QUORVEX_SYSTEM_PYTHON;
constexpr char gc_Promtool[] = QUORVEX_PROMTOOL;
constexpr char gc_Xmllint[] = QUORVEX_XMLLINT;
constexpr char gc_MetricsReader[] = QUORVEX_FLEET_METRICS_READER;
constexpr char gc_JunitReader[] = QUORVEX_FLEET_JUNIT_READER;
constexpr double gc_Bound = 30.0;
constexpr char gc_BlockEnd[] = "\nquorvexPYLON_VPD_Survey_ClientPartition ReturnCode: \n";

constexpr char gc_HostileHost[] = "db&<>\"'\xC3\xA9";
constexpr char gc_OtherHost[] = "\xC3\xBCn\xC3\xAF";
constexpr char gc_HostileMessage[] = "bad <x> & \"y\" 'z' \xC3\x9F";

// One surveyed partition, one client failure, one inactive partition on
// gc_Identity; every other machine's listing fails.
std::string mixedConsole() {
    return std::string("[lspartition ") + gc_Identity + "]\nstdout 1,10.1.1.1,3," + gc_HostileHost +
           ",Zeph,7.2;2,10.1.1.2,3," + gc_OtherHost + ",Zeph,7.2;3,10.1.1.3,1,idle,Zeph,7.2;\n" +
           "[lspartition *]\nstderr lspartition: managed system not found\nexit 1\n"
           "[runCmdOnPartition *]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
           "[runCmdOnPartition 2]\nstdout Rc::0::RcCmd::3::RetStr1::" +
           gc_HostileMessage +
           "::RetStr2::\n"
           "[getFileFromPartition *]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
           "document-nolf <fetched/>\n";
}

// The listing of gc_Identity with count inactive partitions.
std::string inactiveConsole(int count) {
    std::string line = std::string("[lspartition ") + gc_Identity + "]\nstdout ";
    for (int id = 1; id <= count; ++id) {
        line += std::to_string(id) + ",10.1.1." + std::to_string(id) + ",1,host" +
                std::to_string(id) + ",Zeph,7.2;";
    }
    return line + "\n";
}

// read-metrics.py's lines of quorvex_survey_partitions for machine, sorted
// by outcome; the outcomes not in counts are 0.
std::string outcomeLines(std::string const& machine, std::map<std::string, int> const& counts) {
    char const* const outcomes[] = {"channel_failure", "client_failure", "fetch_failure",
                                    "inactive",        "interrupted",    "surveyed",
                                    "timed_out",       "worker_died"};
    std::string text;
    for (char const* outcome : outcomes) {
        auto const count = counts.find(outcome);
        text += "quorvex_survey_partitions{console=\"" + Utility::get_HostName() + "\",machine=\"" +
                machine + "\",outcome=\"" + outcome + "\"} " +
                std::to_string(count == counts.end() ? 0 : count->second) + "\n";
    }
    return text;
}

// The umask set while the run is started, which inherits it; the test's own
// files do not depend on it.
class UmaskForAMoment {
public:
    explicit UmaskForAMoment(mode_t mask) : _previous(::umask(mask)) {}
    ~UmaskForAMoment() { ::umask(_previous); }
    UmaskForAMoment(UmaskForAMoment const&) = delete;
    UmaskForAMoment& operator=(UmaskForAMoment const&) = delete;

private:
    mode_t _previous;
};

class FleetSignals : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(QuorvexTest::isInsideSandbox());
        QuorvexTest::clearFolder(QuorvexTest::gc_VPD_Folder);
        QuorvexTest::clearFolder(QuorvexTest::gc_TraceFolder);
    }

    // quorvex-survey with these arguments under umask, started; its output
    // goes to files in _work.
    SurveyProcess _start(std::vector<std::string> const& arguments, mode_t umask = 022,
                         std::optional<rlim_t> fileSizeLimit = {}) const {
        std::vector<std::string> argv{FleetTest::consoleWideTool()};
        argv.insert(argv.end(), arguments.begin(), arguments.end());
        UmaskForAMoment const mask(umask);
        return SurveyProcess(argv, _work.file("stdout"), _work.file("stderr"), fileSizeLimit);
    }

    // The same run to its end: its exit status.
    int _run(std::vector<std::string> const& arguments, mode_t umask = 022,
             std::optional<rlim_t> fileSizeLimit = {}) const {
        return _start(arguments, umask, fileSizeLimit).waitForExit(gc_Bound);
    }

    std::string _stderr() const { return QuorvexTest::readFile(_work.file("stderr")); }

    std::string _metrics() const { return _work.file("metrics/run.prom"); }
    std::string _junit() const { return _work.file("junit/run.xml"); }

    QuorvexTest::TemporaryDirectory _work;
};

// read-metrics.py's lines without the run's times, which vary.
std::string steadyMetrics(std::string const& text) {
    std::istringstream lines(text);
    std::string kept;
    for (std::string line; std::getline(lines, line);) {
        if (line.rfind("quorvex_survey_run_", 0) != 0 ||
            line.rfind("quorvex_survey_run_exit_status", 0) == 0) {
            kept += line + "\n";
        }
    }
    return kept;
}

// The samples the Prometheus client's parser reads of every metric but
// the run's times, which vary (read-metrics.py's form).
std::string expectedSteadyMetrics() {
    std::string const console = "{console=\"" + Utility::get_HostName() + "\"";
    std::string const host = Utility::get_HostName();
    std::string changes;
    for (char const* change : {"added", "property_changed", "removed", "replaced"}) {
        changes += std::string("quorvex_survey_inventory_changes{change=\"") + change +
                   "\",console=\"" + host + "\"} 0\n";
    }
    return "# TYPE quorvex_survey_partitions gauge\n"
           "# TYPE quorvex_survey_machine_listing_failed gauge\n"
           "# TYPE quorvex_survey_new_failures gauge\n"
           "# TYPE quorvex_survey_recoveries gauge\n"
           "# TYPE quorvex_survey_inventory_changes gauge\n"
           "# TYPE quorvex_survey_run_start_timestamp_seconds gauge\n"
           "# TYPE quorvex_survey_run_end_timestamp_seconds gauge\n"
           "# TYPE quorvex_survey_run_duration_seconds gauge\n"
           "# TYPE quorvex_survey_run_exit_status gauge\n"
           "# TYPE quorvex_survey_history_recorded gauge\n"
           "quorvex_survey_history_recorded" +
           console + "} 1\n" + changes + "quorvex_survey_machine_listing_failed" + console +
           ",machine=\"" + gc_Identity + "\"} 0\nquorvex_survey_machine_listing_failed" + console +
           ",machine=\"" + gc_Unknown + "\"} 1\nquorvex_survey_new_failures" + console + "} 0\n" +
           outcomeLines(gc_Identity, {{"surveyed", 1}, {"inactive", 1}, {"client_failure", 1}}) +
           outcomeLines(gc_Unknown, {}) + "quorvex_survey_recoveries" + console +
           "} 0\nquorvex_survey_run_exit_status" + console + "} 4\n";
}

// The value of the one sample of metric in read-metrics.py's lines.
double sampleValue(std::string const& lines, std::string const& metric) {
    std::string::size_type const at = lines.find("\n" + metric + "{");
    if (at == std::string::npos) {
        return -1;
    }
    std::string::size_type const value = lines.find("} ", at) + 2;
    return std::stod(lines.substr(value, lines.find('\n', value) - value));
}

TEST_F(FleetSignals, MetricsOfAMixedRunPassPromtoolAndTheClientParserReadsTheirFigures) {
    SimulatedConsole const console(mixedConsole());
    auto const before = static_cast<double>(std::time(nullptr));
    EXPECT_EQ(_run({"--metrics", _metrics(), gc_Identity, gc_Unknown}), 4) << _stderr();
    auto const after = static_cast<double>(std::time(nullptr));
    QuorvexTest::CommandResult const lint =
        QuorvexTest::runShell(std::string(gc_Promtool) + " check metrics < " + _metrics());
    EXPECT_EQ(lint.exitStatus, 0) << lint.stdoutText << lint.stderrText;
    EXPECT_EQ(lint.stdoutText + lint.stderrText, "");
    QuorvexTest::CommandResult const read =
        QuorvexTest::runCommand({gc_Python, gc_MetricsReader, _metrics()});
    ASSERT_EQ(read.exitStatus, 0) << read.stdoutText << read.stderrText;
    EXPECT_EQ(steadyMetrics(read.stdoutText), expectedSteadyMetrics());
    double const started =
        sampleValue(read.stdoutText, "quorvex_survey_run_start_timestamp_seconds");
    double const ended = sampleValue(read.stdoutText, "quorvex_survey_run_end_timestamp_seconds");
    double const duration = sampleValue(read.stdoutText, "quorvex_survey_run_duration_seconds");
    EXPECT_LE(before, started);
    EXPECT_LE(started, ended);
    EXPECT_LE(ended, after);
    EXPECT_GT(duration, 0.0);
    EXPECT_LE(duration, after - before + 1);
}

// read-junit.py's view of the mixed run: every name and reason as the
// console gave it.
std::string expectedJunitCases() {
    std::string const reason =
        "Partition not surveyed, reason: \\nPartition Failed.\\n\\n[     Rc] = 0\\n[  RcCmd] = "
        "3\\n[RetStr1] = " +
        std::string(gc_HostileMessage) + R"(\n[RetStr2] = \n\n\n)";
    std::string const machine = std::string("    ") + gc_Identity + " | ";
    return "testsuites tests=4 failures=2 errors=0 skipped=1\n"
           "  " +
           std::string(gc_Identity) + " tests=3 failures=1 errors=0 skipped=1\n" + machine +
           gc_HostileHost + " | passed\n" + machine + gc_OtherHost +
           " | failure client_failure: " + reason + "\n" + machine +
           "idle | skipped: inactive: Failed - Active Status < 3\n"
           "  " +
           gc_Unknown +
           " tests=1 failures=1 errors=0 skipped=0\n"
           "    " +
           gc_Unknown +
           " | partition listing | failure listing_failed: "
           "/opt/vtc/bin/lspartition -ix -c " +
           gc_Unknown + " exited with status 1: lspartition: managed system not found\n";
}

TEST_F(FleetSignals, JunitOfAMixedRunIsValidAndReadsBackEveryNameAndReason) {
    SimulatedConsole const console(mixedConsole());
    EXPECT_EQ(_run({"--junit", _junit(), gc_Identity, gc_Unknown}), 4) << _stderr();
    QuorvexTest::CommandResult const read =
        QuorvexTest::runCommand({gc_Python, gc_JunitReader, _junit()});
    ASSERT_EQ(read.exitStatus, 0) << read.stdoutText << read.stderrText;
    EXPECT_EQ(read.stdoutText, expectedJunitCases());
    QuorvexTest::CommandResult const valid =
        QuorvexTest::runCommand({gc_Xmllint, "--noout", "--schema",
                                 QuorvexTest::sourceRoot() + "/docs/junit.xsd", _junit()});
    EXPECT_EQ(valid.exitStatus, 0) << valid.stdoutText << valid.stderrText;
}

std::string permissionsOf(std::string const& path) {
    struct stat status {};
    if (::stat(path.c_str(), &status) != 0) {
        return "(missing)";
    }
    char text[8];
    std::snprintf(text, sizeof text, "%o", static_cast<unsigned int>(status.st_mode & 0777U));
    return text;
}

TEST_F(FleetSignals, MetricsFileIsReadableByAllWhateverTheUmaskAndNoTemporaryFileIsLeft) {
    SimulatedConsole const console(mixedConsole());
    EXPECT_EQ(_run({"--metrics", _metrics(), "--junit", _junit(), gc_Identity}, 077), 4)
        << _stderr();
    EXPECT_EQ(permissionsOf(_metrics()), "644");
    EXPECT_EQ(permissionsOf(_junit()), "600") << "the JUnit file follows the umask";
    EXPECT_EQ(QuorvexTest::listFolder(_work.file("metrics")), std::vector<std::string>{"run.prom"});
    EXPECT_EQ(QuorvexTest::listFolder(_work.file("junit")), std::vector<std::string>{"run.xml"});
}

TEST_F(FleetSignals, MetricsFolderThatCannotBeMadeEndsWith73BeforeAnyConsoleCommand) {
    SimulatedConsole const console(mixedConsole());
    QuorvexTest::writeFile(_work.file("file"), "x");
    EXPECT_EQ(_run({"--metrics", _work.file("file/m/run.prom"), gc_Identity}), 73);
    EXPECT_EQ(_stderr(),
              "quorvex-survey: cannot create " + _work.file("file/m") + ": Not a directory\n");
    EXPECT_EQ(console.logText(), "") << "a console command ran";
}

TEST_F(FleetSignals, JunitPathThatIsAFolderEndsWith73BeforeAnyConsoleCommand) {
    SimulatedConsole const console(mixedConsole());
    std::filesystem::create_directories(_junit());
    EXPECT_EQ(_run({"--junit", _junit(), gc_Identity}), 73);
    EXPECT_EQ(_stderr(), "quorvex-survey: cannot write " + _junit() + ": Is a directory\n");
    EXPECT_EQ(console.logText(), "") << "a console command ran";
}

// Eighty inactive partitions under a file size limit of 3,000 bytes: a
// status file of over 4,000 bytes cannot be written, the metrics (about
// 2,500 bytes) can, and carry the run's final exit status.
TEST_F(FleetSignals, MetricsCarryTheExitStatusOfAStatusFileThatCannotBeWritten) {
    SimulatedConsole const console(inactiveConsole(80));
    EXPECT_EQ(_run({"--metrics", _metrics(), gc_Identity}, 022, 3000), 73) << _stderr();
    QuorvexTest::CommandResult const read =
        QuorvexTest::runCommand({gc_Python, gc_MetricsReader, _metrics()});
    EXPECT_EQ(sampleValue(read.stdoutText, "quorvex_survey_run_exit_status"), 73.0)
        << read.stdoutText;
}

// One inactive partition under a limit of 1,500 bytes: every file but the
// metrics (about 2,500 bytes) and the history database is written.
TEST_F(FleetSignals, MetricsFileThatCannotBeWrittenIsNamedAfterTheBlockAndEndsWith73) {
    SimulatedConsole const console(inactiveConsole(1));
    EXPECT_EQ(_run({"--metrics", _metrics(), "--junit", _junit(), gc_Identity}, 022, 1500), 73);
    EXPECT_EQ(_stderr(), std::string(gc_BlockEnd) + "8\nquorvex-survey: cannot write " +
                             _metrics() +
                             ": File too large\nquorvex-survey: cannot record the run in "
                             "/var/lib/quorvex-survey/history.sqlite: disk I/O error\n");
    EXPECT_EQ(QuorvexTest::listFolder(_work.file("metrics")), std::vector<std::string>{});
    EXPECT_TRUE(QuorvexTest::fileExists(_junit()));
}

// The whole of what descriptor reads from its start.
std::string contentThrough(int descriptor) {
    std::string text;
    char buffer[4096];
    for (off_t at = 0;;) {
        ssize_t const got = ::pread(descriptor, buffer, sizeof buffer, at);
        if (got <= 0) {
            return text;
        }
        text.append(buffer, static_cast<std::size_t>(got));
        at += got;
    }
}

ino_t inodeOf(std::string const& path) {
    struct stat status {};
    return ::stat(path.c_str(), &status) == 0 ? status.st_ino : 0;
}

// The textfile collector may be reading the metrics while the next run
// writes them: the next run's file replaces the old one by its name, so a
// reader that holds the old file open reads it whole, never a mixture.
TEST_F(FleetSignals, ReaderOfTheOldMetricsFileStillReadsItWholeAfterTheNextRun) {
    SimulatedConsole const console(mixedConsole());
    EXPECT_EQ(_run({"--metrics", _metrics(), gc_Identity}), 4) << _stderr();
    std::string const first = QuorvexTest::readFile(_metrics());
    ino_t const firstInode = inodeOf(_metrics());
    int const reader = ::open(_metrics().c_str(), O_RDONLY | O_CLOEXEC);
    // cppcheck-suppress resourceLeak ; nothing to close when the open failed
    ASSERT_GE(reader, 0);
    EXPECT_EQ(_run({"--metrics", _metrics(), gc_Identity}), 4) << _stderr();
    EXPECT_EQ(contentThrough(reader), first);
    ::close(reader);
    EXPECT_NE(inodeOf(_metrics()), firstInode) << "the second run wrote into the first's file";
    EXPECT_EQ(QuorvexTest::listFolder(_work.file("metrics")), std::vector<std::string>{"run.prom"});
}

// The rule set of the first "groups:" YAML block after heading in the
// markdown text.
std::string yamlBlockAfter(std::string const& text, std::string const& heading) {
    std::string const opening = "```yaml\n";
    std::string::size_type const start = text.find(opening, text.find(heading));
    if (start == std::string::npos) {
        return "";
    }
    std::string::size_type const body = start + opening.size();
    return text.substr(body, text.find("```", body) - body);
}

// A daily run that ends an hour later than the day before (a longer run, a
// day of 25 hours) does not raise docs/metrics.md's "not run for a day"
// alert; a day without a run does.
TEST(FleetSignalsAlertRules, NotRunAlertWaitsForAMissedDayNotForALateRun) {
    QuorvexTest::TemporaryDirectory const work;
    QuorvexTest::writeFile(
        work.file("rules.yml"),
        yamlBlockAfter(QuorvexTest::readFile(QuorvexTest::sourceRoot() + "/docs/metrics.md"),
                       "## Example alert rules"));
    // Runs end at 04:00 on day 0 and at 05:00 on day 1, then none.
    QuorvexTest::writeFile(work.file("late-run.yml"),
                           "rule_files: [rules.yml]\n"
                           "evaluation_interval: 1m\n"
                           "tests:\n"
                           "  - interval: 1m\n"
                           "    input_series:\n"
                           "      - series: quorvex_survey_run_end_timestamp_seconds\n"
                           "        values: 14400+0x1740 104400+0x1860\n"
                           "    alert_rule_test:\n"
                           "      - eval_time: 28h30m\n"
                           "        alertname: QuorvexSurveyNotRunForADay\n"
                           "        exp_alerts: []\n"
                           "      - eval_time: 56h\n"
                           "        alertname: QuorvexSurveyNotRunForADay\n"
                           "        exp_alerts:\n"
                           "          - exp_labels: {}\n");
    QuorvexTest::CommandResult const checked =
        QuorvexTest::runCommand({gc_Promtool, "test", "rules", work.file("late-run.yml")});
    EXPECT_EQ(checked.exitStatus, 0) << checked.stdoutText << checked.stderrText;
}

// Waits until the console has been asked to run the client somewhere.
bool waitForAClientRun(SimulatedConsole const& console) {
    double const until = FleetTest::monotonicSeconds() + gc_Bound;
    while (FleetTest::monotonicSeconds() < until) {
        if (console.logText().find("runCmdOnPartition") != std::string::npos) {
            return true;
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(50));
    }
    return false;
}

// A run stopped by SIGTERM while its one partition's client run hangs: the
// partition is skipped as interrupted, and the metrics, written last, say
// the run exited 143.
TEST_F(FleetSignals, InterruptedRunHasItsPartitionSkippedAndItsSignalsExitStatus) {
    SimulatedConsole const console(std::string("[lspartition ") + gc_Identity +
                                   "]\nstdout 1,10.1.1.1,3,db1,Zeph,7.2;\n"
                                   "[runCmdOnPartition *]\ndelay 3600\n");
    SurveyProcess survey = _start({"--metrics", _metrics(), "--junit", _junit(), gc_Identity});
    ASSERT_TRUE(waitForAClientRun(console)) << "the partition's survey never started";
    survey.signal(SIGTERM);
    EXPECT_EQ(survey.waitForExit(gc_Bound), 128 + SIGTERM) << _stderr();
    QuorvexTest::CommandResult const metrics =
        QuorvexTest::runCommand({gc_Python, gc_MetricsReader, _metrics()});
    EXPECT_EQ(sampleValue(metrics.stdoutText, "quorvex_survey_run_exit_status"), 143.0)
        << metrics.stdoutText;
    QuorvexTest::CommandResult const junit =
        QuorvexTest::runCommand({gc_Python, gc_JunitReader, _junit()});
    EXPECT_EQ(junit.stdoutText,
              std::string("testsuites tests=1 failures=0 errors=0 skipped=1\n  ") + gc_Identity +
                  " tests=1 failures=0 errors=0 skipped=1\n    " + gc_Identity +
                  " | db1 | skipped: interrupted: Interrupted - not surveyed\n");
}

} // namespace
