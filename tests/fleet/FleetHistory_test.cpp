// The history database as quorvex-survey records its runs there, and the
// faults it must survive: a missing, read-only, locked, corrupt or newer
// database (exit status 74, every other output written), two runs recorded
// at once, a clock set back between runs, and a run killed while it records.
// Inside the sandbox, whose /var/lib/quorvex-survey is its own.

#include "FleetTools.h"
#include "QuorvexTest.h"
#include "SummaryFile.h"
#include "SurveyProcess.h"
#include "history/HistoryDatabase.h"
#include "history/Migrations.h"

#include <SQLiteCpp/SQLiteCpp.h>
#include <sqlite3.h>

#include <gtest/gtest.h>

#include <sys/stat.h>
#include <sys/wait.h>

#include <algorithm>
#include <chrono>
#include <csignal>
#include <filesystem>
#include <fstream>
#include <random>
#include <set>
#include <thread>

namespace {

using FleetTest::SurveyProcess;
using QuorvexTest::SimulatedConsole;

constexpr char gc_Identity[] = "1234-ABC_10ABCDE";
constexpr char gc_StateFolder[] = "/var/lib/quorvex-survey";
constexpr char gc_DefaultHistory[] = "/var/lib/quorvex-survey/history.sqlite";
constexpr char gc_Answer[] = "stdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n";
// The block of a machine whose one partition was surveyed, as standard
// error ends it.
constexpr char gc_SurveyedBlock[] = "0\n\nquorvexPYLON_VPD_Survey_ClientPartition ReturnCode: \n0";
// A run that never ends within it was waiting for something that never came.
constexpr double gc_Bound = 60.0;

// The listing of a machine with partitions 1..count, all active or all
// inactive.
std::string listing(std::string const& identity, int count, bool active) {
    std::string line = "[lspartition " + identity + "]\nstdout ";
    for (int id = 1; id <= count; ++id) {
        line += std::to_string(id) + ",10.1." + std::to_string(id / 250) + "." +
                std::to_string(id % 250) + "," + (active ? "3" : "1") + ",host" +
                std::to_string(id) + ",Zeph,7.2;";
    }
    return line + "\n";
}

std::string oneSurveyedPartition() {
    return listing(gc_Identity, 1, true) + "[runCmdOnPartition *]\n" + gc_Answer +
           "[getFileFromPartition *]\n" + gc_Answer + "document-nolf <fetched/>\n";
}

long long countOf(std::string const& path, std::string const& query) {
    SQLite::Database database(path, SQLite::OPEN_READONLY);
    return database.execAndGet(query).getInt64();
}

// Makes the history database at path, as a first run would.
void makeHistory(std::string const& path) {
    // cppcheck-suppress unreadVariable ; made for the file it leaves
    history::HistoryDatabase const made(path);
}

// The whole database checked: SQLite's own check, and every recorded run
// whole, with as many partition rows as it counts and nothing of a run that
// is not there.
std::string consistencyProblems(std::string const& path) {
    SQLite::Database database(path, SQLite::OPEN_READONLY);
    std::string problems;
    std::string const integrity = database.execAndGet("PRAGMA integrity_check").getString();
    if (integrity != "ok") {
        problems += "integrity_check: " + integrity + "\n";
    }
    if (database
            .execAndGet("SELECT count(*) FROM runs r WHERE partitions != (SELECT count(*) "
                        "FROM partition_results p WHERE p.run_id = r.id)")
            .getInt() != 0) {
        problems += "a run without all its partitions\n";
    }
    if (database
            .execAndGet("SELECT count(*) FROM partition_results WHERE run_id NOT IN "
                        "(SELECT id FROM runs)")
            .getInt() != 0) {
        problems += "partitions of a run that is not there\n";
    }
    if (database.execAndGet("SELECT count(*) FROM events WHERE run_id NOT IN (SELECT id FROM runs)")
            .getInt() != 0) {
        problems += "events of a run that is not there\n";
    }
    if (database
            .execAndGet("SELECT count(*) FROM partition_results WHERE document_hash IS NOT NULL "
                        "AND document_hash NOT IN (SELECT hash FROM documents)")
            .getInt() != 0) {
        problems += "partitions whose document is not there\n";
    }
    return problems;
}

// Whether this process may pass over file modes; root without capabilities
// (under proot, say) may not.
bool hasCapabilities() {
    std::ifstream status("/proc/self/status");
    for (std::string line; std::getline(status, line);) {
        if (line.rfind("CapEff:", 0) == 0) {
            return line.find_first_not_of("0\t ", 7) != std::string::npos;
        }
    }
    return false;
}

class FleetHistory : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(QuorvexTest::isInsideSandbox());
        QuorvexTest::clearFolder(QuorvexTest::gc_VPD_Folder);
        QuorvexTest::clearFolder(QuorvexTest::gc_TraceFolder);
        QuorvexTest::clearFolder(gc_StateFolder);
    }

    std::vector<std::string> _surveyArguments(std::vector<std::string> const& arguments) const {
        std::vector<std::string> argv{FleetTest::consoleWideTool(), "--summary",
                                      _work.file("summary.json"), "--report", _work.file("report")};
        argv.insert(argv.end(), arguments.begin(), arguments.end());
        return argv;
    }

    // quorvex-survey with a summary, a report and these arguments; its
    // output goes to files in _work.
    SurveyProcess _start(std::vector<std::string> const& arguments,
                         std::vector<std::string> const& prefix = {}) const {
        std::vector<std::string> argv = prefix;
        std::vector<std::string> const survey = _surveyArguments(arguments);
        argv.insert(argv.end(), survey.begin(), survey.end());
        return SurveyProcess(argv, _work.file("stdout"), _work.file("stderr"));
    }

    int _run(std::vector<std::string> const& arguments,
             std::vector<std::string> const& prefix = {}) const {
        SurveyProcess survey = _start(arguments, prefix);
        return survey.waitForExit(gc_Bound);
    }

    std::string _stderr() const { return QuorvexTest::readFile(_work.file("stderr")); }

    FleetTest::SummaryFile _summary() const {
        return FleetTest::SummaryFile(_work.file("summary.json"));
    }

    // A run that could not be recorded: 74, the one line after the block,
    // and every other output written, the summary saying why.
    void _expectNotRecorded(int exitStatus, std::string const& file, std::string const& reason,
                            std::string const& vpdFolder = QuorvexTest::gc_VPD_Folder) const {
        EXPECT_EQ(exitStatus, 74) << _stderr();
        EXPECT_EQ(_stderr(), std::string(gc_SurveyedBlock) +
                                 "\nquorvex-survey: cannot record the run in " + file + ": " +
                                 reason + "\n");
        FleetTest::SummaryFile const summary = _summary();
        EXPECT_EQ(summary.validationProblems(), "");
        EXPECT_EQ(summary.field("/exit_status"), "74");
        EXPECT_EQ(summary.field("/history"),
                  nlohmann::json(
                      {{"file", file}, {"run_id", nullptr}, {"recorded", false}, {"error", reason}})
                      .dump());
        EXPECT_TRUE(QuorvexTest::fileExists(_work.file("report/index.html")));
        EXPECT_TRUE(QuorvexTest::fileExists(
            vpdFolder + "/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE.status"));
    }

    QuorvexTest::TemporaryDirectory _work;
};

TEST_F(FleetHistory, RunIsRecordedInTheDefaultFileWithTheSummaryItWrote) {
    SimulatedConsole const console(oneSurveyedPartition());
    EXPECT_EQ(_run({gc_Identity}), 0) << _stderr();
    EXPECT_EQ(_stderr(), gc_SurveyedBlock);
    FleetTest::SummaryFile const summary = _summary();
    EXPECT_EQ(summary.validationProblems(), "");
    EXPECT_EQ(summary.field("/history"),
              R"({"error":null,"file":"/var/lib/quorvex-survey/history.sqlite","recorded":true,)"
              R"("run_id":1})");
    SQLite::Database database(gc_DefaultHistory, SQLite::OPEN_READONLY);
    EXPECT_EQ(nlohmann::json::parse(database.execAndGet("SELECT summary FROM runs").getString()),
              nlohmann::json::parse(QuorvexTest::readFile(_work.file("summary.json"))))
        << "the history keeps the summary the run wrote";
    EXPECT_EQ(database
                  .execAndGet("SELECT outcome FROM partition_results WHERE partition = "
                              "'host1' AND machine = '1234-ABC_10ABCDE'")
                  .getString(),
              "surveyed");
}

TEST_F(FleetHistory, MissingFoldersOfTheHistoryAreMade) {
    SimulatedConsole const console(oneSurveyedPartition());
    std::string const file = _work.file("state/deeper/history.sqlite");
    EXPECT_EQ(_run({"--history", file, gc_Identity}), 0) << _stderr();
    EXPECT_EQ(countOf(file, "SELECT count(*) FROM runs"), 1);
    EXPECT_EQ(QuorvexTest::listFolder(gc_StateFolder), std::vector<std::string>{})
        << "the default file was written too";
}

TEST_F(FleetHistory, NoHistoryWritesNothingAndTheSummarySaysNull) {
    SimulatedConsole const console(oneSurveyedPartition());
    EXPECT_EQ(_run({"--no-history", gc_Identity}), 0) << _stderr();
    EXPECT_EQ(_summary().field("/history"), "null");
    EXPECT_EQ(_summary().validationProblems(), "");
    EXPECT_EQ(QuorvexTest::listFolder(gc_StateFolder), std::vector<std::string>{});
}

// In a sandbox of its own whose state folder is read-only, its outputs in
// _work, bound into it.
TEST_F(FleetHistory, ReadOnlyStateFolderEndsWith74AndEveryOtherOutputIsWritten) {
    SimulatedConsole const console(oneSurveyedPartition());
    std::filesystem::create_directories(_work.file("vpd"));
    QuorvexTest::CommandResult const run =
        QuorvexTest::runInSandbox({"--readonly-state", "--bind", _work.path() + ":" + _work.path(),
                                   "--vpd", _work.file("vpd")},
                                  _surveyArguments({gc_Identity}));
    QuorvexTest::writeFile(_work.file("stderr"), run.stderrText);
    std::string const refusal = hasCapabilities() ? "Read-only file system" : "Permission denied";
    _expectNotRecorded(run.exitStatus, gc_DefaultHistory,
                       std::string("cannot create ") + gc_DefaultHistory + ": " + refusal,
                       _work.file("vpd"));
}

// Root passes over file modes: the run goes without its capabilities.
TEST_F(FleetHistory, ReadOnlyHistoryFileEndsWith74) {
    SimulatedConsole const console(oneSurveyedPartition());
    makeHistory(gc_DefaultHistory);
    ASSERT_EQ(::chmod(gc_DefaultHistory, 0444), 0);
    std::vector<std::string> prefix;
    if (hasCapabilities()) {
        prefix = {"/usr/bin/setpriv", "--inh-caps=-all", "--ambient-caps=-all",
                  "--bounding-set=-all", "--"};
    }
    _expectNotRecorded(_run({gc_Identity}, prefix), gc_DefaultHistory,
                       std::string("cannot open ") + gc_DefaultHistory + ": Permission denied");
    EXPECT_EQ(countOf(gc_DefaultHistory, "SELECT count(*) FROM runs"), 0);
}

// Another process holds the write lock for longer than the run waits.
TEST_F(FleetHistory, HistoryLockedPastTheTimeoutEndsWith74SayingAnotherProcessHoldsIt) {
    SimulatedConsole const console(oneSurveyedPartition());
    makeHistory(gc_DefaultHistory);
    SQLite::Database holder(gc_DefaultHistory, SQLite::OPEN_READWRITE);
    holder.exec("BEGIN IMMEDIATE");
    SurveyProcess survey = _start({gc_Identity});
    int const exitStatus = survey.waitForExit(gc_Bound);
    holder.exec("ROLLBACK");
    _expectNotRecorded(exitStatus, gc_DefaultHistory,
                       "the database is locked: another process has held it for more than 5 s");
    EXPECT_GE(survey.secondsTaken(), 5.0) << "the run did not wait for the lock";
    EXPECT_EQ(countOf(gc_DefaultHistory, "SELECT count(*) FROM runs"), 0);
}

TEST_F(FleetHistory, CorruptHistoryIsRefusedLeftAsItIsAndEndsWith74) {
    SimulatedConsole const console(oneSurveyedPartition());
    std::mt19937 bytes(74);
    std::string noise(16384, '\0');
    std::generate(noise.begin(), noise.end(), [&bytes] { return static_cast<char>(bytes()); });
    QuorvexTest::writeFile(gc_DefaultHistory, noise);
    _expectNotRecorded(_run({gc_Identity}), gc_DefaultHistory,
                       "it is not a quorvex-survey history database (file is not a database); "
                       "it was left as it is");
    EXPECT_EQ(QuorvexTest::readFile(gc_DefaultHistory), noise);
    EXPECT_EQ(QuorvexTest::listFolder(gc_StateFolder), std::vector<std::string>{"history.sqlite"});
}

TEST_F(FleetHistory, NewerSchemaEndsWith74NamingBothVersions) {
    SimulatedConsole const console(oneSurveyedPartition());
    int const newer = history::newestSchemaVersion() + 1;
    history::HistoryDatabase(gc_DefaultHistory)
        .connection()
        .exec("PRAGMA user_version = " + std::to_string(newer));
    _expectNotRecorded(_run({gc_Identity}), gc_DefaultHistory,
                       "its schema is version " + std::to_string(newer) +
                           ", newer than this quorvex-survey knows (versions up to " +
                           std::to_string(newer - 1) +
                           "); it was left as it is: use a newer quorvex-survey, or another file");
    EXPECT_EQ(countOf(gc_DefaultHistory, "PRAGMA user_version"), newer);
}

// The console's listing failing (69) outweighs the history (74).
TEST_F(FleetHistory, ListingFailureOutweighsAHistoryThatCannotBeRecorded) {
    SimulatedConsole const console("[lsvtc]\nstdout \nstderr lsvtc: console busy\nexit 5\n");
    QuorvexTest::writeFile(gc_DefaultHistory, "not a database, and long enough to be read");
    EXPECT_EQ(_run({"--all"}), 69) << _stderr();
    EXPECT_NE(_stderr().find("quorvex-survey: cannot record the run in "), std::string::npos)
        << _stderr();
    EXPECT_EQ(_summary().field("/exit_status"), "69");
    EXPECT_EQ(_summary().field("/history/recorded"), "false");
}

// Waits until the file ends with text; false when it never does.
bool waitForEnding(std::string const& path, std::string const& text) {
    double const until = FleetTest::monotonicSeconds() + gc_Bound;
    while (FleetTest::monotonicSeconds() < until) {
        std::string const content =
            QuorvexTest::fileExists(path) ? QuorvexTest::readFile(path) : "";
        if (content.size() >= text.size() &&
            content.compare(content.size() - text.size(), text.size(), text) == 0) {
            return true;
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(20));
    }
    return false;
}

// Two runs with result folders of their own (the second in a sandbox of its
// own) end together while the test holds the database: both wait for it,
// and both are recorded once it is free.
TEST_F(FleetHistory, TwoRunsRecordedAtOnceAreBothRecorded) {
    SimulatedConsole const console(oneSurveyedPartition());
    std::string const file = _work.file("shared/history.sqlite");
    makeHistory(file);
    SQLite::Database holder(file, SQLite::OPEN_READWRITE);
    holder.exec("BEGIN IMMEDIATE");
    std::vector<std::string> const other{QuorvexTest::sandboxPath(),
                                         "--sim",
                                         QuorvexTest::simulatorPath(),
                                         "--bind",
                                         _work.path() + ":" + _work.path(),
                                         "--bind",
                                         console.directory() + ":" + console.directory(),
                                         "--",
                                         FleetTest::consoleWideTool(),
                                         "--history",
                                         file,
                                         "--summary",
                                         _work.file("other.json"),
                                         gc_Identity};
    SurveyProcess second(other, _work.file("other.out"), _work.file("other.err"));
    ASSERT_TRUE(waitForEnding(_work.file("other.err"), gc_SurveyedBlock));
    SurveyProcess first = _start({"--history", file, gc_Identity});
    ASSERT_TRUE(waitForEnding(_work.file("stderr"), gc_SurveyedBlock));
    holder.exec("ROLLBACK");
    EXPECT_EQ(first.waitForExit(gc_Bound), 0) << _stderr();
    EXPECT_EQ(second.waitForExit(gc_Bound), 0) << QuorvexTest::readFile(_work.file("other.err"));
    std::set<std::string> const ids{
        _summary().field("/history/run_id"),
        FleetTest::SummaryFile(_work.file("other.json")).field("/history/run_id")};
    EXPECT_EQ(ids, (std::set<std::string>{"1", "2"}));
    EXPECT_EQ(countOf(file, "SELECT count(*) FROM runs"), 2);
    EXPECT_EQ(consistencyProblems(file), "");
}

// The one partition's client fails.
std::string oneFailingPartition() {
    return listing(gc_Identity, 1, true) +
           "[runCmdOnPartition *]\nstdout Rc::0::RcCmd::3::RetStr1::client failed::RetStr2::\n";
}

// The first run's times are set after the second's, as a console clock set
// back between them leaves them: the runs follow one another by id, and
// the second's changes are those against the first. The first failed the
// partition the second surveys, so the second recorded its recovery.
TEST_F(FleetHistory, ClockSetBackBetweenRunsKeepsTheRecordingOrder) {
    {
        SimulatedConsole const failing(oneFailingPartition());
        EXPECT_EQ(_run({gc_Identity}), 8) << _stderr();
    }
    SQLite::Database(gc_DefaultHistory, SQLite::OPEN_READWRITE)
        .exec("UPDATE runs SET started_unix = started_unix + 86400, "
              "started = '2099-01-01T00:00:00+00:00', ended = '2099-01-01T00:05:00+00:00'");
    SimulatedConsole const surveyed(oneSurveyedPartition());
    EXPECT_EQ(_run({gc_Identity}), 0) << _stderr();
    EXPECT_EQ(_summary().field("/history/run_id"), "2");
    SQLite::Database database(gc_DefaultHistory, SQLite::OPEN_READONLY);
    EXPECT_EQ(database
                  .execAndGet("SELECT group_concat(id) FROM (SELECT id FROM runs "
                              "ORDER BY started_unix)")
                  .getString(),
              "2,1");
    EXPECT_EQ(database
                  .execAndGet("SELECT group_concat(scope || ' ' || kind || ' ' || partition, "
                              "'; ') FROM events WHERE run_id = 2")
                  .getString(),
              "partition recovered host1");
    QuorvexTest::CommandResult const changes = QuorvexTest::runCommand(
        {FleetTest::consoleWideTool(), "history", "changes", "--run", "2", "--json"});
    ASSERT_EQ(changes.exitStatus, 0) << changes.stderrText;
    nlohmann::json const recoveries = nlohmann::json::parse(changes.stdoutText)["recoveries"];
    ASSERT_EQ(recoveries.size(), 1U) << changes.stdoutText;
    EXPECT_EQ(recoveries[0]["partition"], "host1");
    EXPECT_EQ(recoveries[0]["run"], 2);
    EXPECT_EQ(consistencyProblems(gc_DefaultHistory), "");
}

// The rows of a query, each row's columns joined by " " (NULL as "-").
std::vector<std::string> rowsOf(std::string const& path, std::string const& query) {
    SQLite::Database database(path, SQLite::OPEN_READONLY);
    SQLite::Statement statement(database, query);
    std::vector<std::string> rows;
    while (statement.executeStep()) {
        std::string row;
        for (int column = 0; column < statement.getColumnCount(); ++column) {
            SQLite::Column const value = statement.getColumn(column);
            row += (column == 0 ? "" : " ") + (value.isNull() ? "-" : value.getString());
        }
        rows.push_back(row);
    }
    return rows;
}

// A console of two machines whose partition boreas (id 2, on
// 9119-MHE_21ABCDE) fails every time.
std::string twoMachinesOneFailing() {
    return "[runCmdOnPartition 2]\nstdout Rc::1::RcCmd::0::RetStr1::failed::RetStr2::\nexit 1\n" +
           QuorvexTest::readFile(QuorvexTest::sourceRoot() + "/sim/scenarios/several-machines.scn");
}

// A run of one machine named by hand between two runs of all of them brings
// no event for the other machine, and its failing partition's streak goes
// on: nothing disappeared in the second run, nothing appeared in the third.
// (Every run ends with 4: hydra is not active.)
TEST_F(FleetHistory, RunOfOneMachineBetweenRunsOfAllLeavesTheOtherMachineAlone) {
    SimulatedConsole const console(twoMachinesOneFailing());
    EXPECT_EQ(_run({"--all"}), 4) << _stderr();
    EXPECT_EQ(_run({"8286-42A_10XYZ99"}), 4) << _stderr();
    EXPECT_EQ(_run({"--all"}), 4) << _stderr();
    EXPECT_EQ(rowsOf(gc_DefaultHistory, "SELECT machine, partition, outcome FROM"
                                        " partition_results WHERE run_id = 2 ORDER BY partition"),
              (std::vector<std::string>{"8286-42A_10XYZ99 gemini surveyed",
                                        "8286-42A_10XYZ99 hydra inactive"}));
    EXPECT_EQ(rowsOf(gc_DefaultHistory, "SELECT id, all_machines FROM runs ORDER BY id"),
              (std::vector<std::string>{"1 1", "2 0", "3 1"}));
    EXPECT_EQ(rowsOf(gc_DefaultHistory,
                     "SELECT run_id, scope, kind, machine, partition, failing_since_run,"
                     " runs_failing FROM events ORDER BY id"),
              std::vector<std::string>{"3 partition still_failing 9119-MHE_21ABCDE boreas 1 2"});
    EXPECT_EQ(rowsOf(gc_DefaultHistory,
                     "SELECT partition, outcome, failing_since_run, runs_failing,"
                     " last_surveyed_run FROM partition_results WHERE run_id = 3"
                     " AND machine = '9119-MHE_21ABCDE' ORDER BY partition"),
              (std::vector<std::string>{"aurora surveyed - - 3", "boreas channel_failure 1 2 -"}));
    EXPECT_EQ(consistencyProblems(gc_DefaultHistory), "");
}

// Whether the database's write lock is held by another connection now.
bool isWriteLocked(SQLite::Database& probe) {
    try {
        probe.exec("BEGIN IMMEDIATE");
    } catch (SQLite::Exception const& failure) {
        if (failure.getErrorCode() == SQLITE_BUSY) {
            return true;
        }
        throw;
    }
    probe.exec("ROLLBACK");
    return false;
}

// Kills the run once it holds the database's write lock, which it takes
// only to record itself (the schema is up to date), after a pause of
// pauseMilliseconds; false when the run ended before it took the lock or
// had let it go again when the pause was over.
bool killWhileRecording(SurveyProcess& survey, std::string const& file, int pauseMilliseconds) {
    SQLite::Database probe(file, SQLite::OPEN_READWRITE);
    double const until = FleetTest::monotonicSeconds() + gc_Bound;
    while (FleetTest::monotonicSeconds() < until) {
        if (isWriteLocked(probe)) {
            std::this_thread::sleep_for(std::chrono::milliseconds(pauseMilliseconds));
            bool const recording = isWriteLocked(probe);
            survey.signal(SIGKILL);
            survey.waitForExit(gc_Bound);
            return recording;
        }
        siginfo_t ended{};
        if (::waitid(P_PID, static_cast<id_t>(survey.pid()), &ended, WEXITED | WNOHANG | WNOWAIT) ==
                0 &&
            ended.si_pid != 0) {
            return false;
        }
        std::this_thread::sleep_for(std::chrono::microseconds(200));
    }
    return false;
}

// gc_SurveyedPartitions surveyed partitions whose documents are a shipped
// document with the firmware level made the partition's own for this
// series: every run brings documents the database has not stored yet, to
// be read into components, stored and compared with the run before
// (property_changed events), all within the run's transaction.
constexpr int gc_SurveyedPartitions = 50;

std::string surveyedWithDocuments(int series) {
    std::string scenario =
        listing(gc_Identity, gc_SurveyedPartitions, true) + "[runCmdOnPartition *]\n" + gc_Answer;
    std::string const document =
        QuorvexTest::sourceRoot() + "/sim/scenarios/documents/aurora.VPD.xml";
    for (int id = 1; id <= gc_SurveyedPartitions; ++id) {
        scenario += "[getFileFromPartition " + std::to_string(id) + "]\n" + gc_Answer +
                    "document-file " + document + "\ndocument-replace /FW950.80/FW9" +
                    std::to_string(series) + "." + std::to_string(id) + "/\n";
    }
    return scenario;
}

// A run that reads and stores dozens of new documents takes tens of
// milliseconds to record: it is killed at random moments within its
// transaction (the seed is printed) and leaves the database with the run
// whole or without it, its documents and events included, never part of it.
TEST_F(FleetHistory, RunKilledWhileRecordingIsWhollyThereOrNotAtAll) {
    {
        SimulatedConsole const console(surveyedWithDocuments(0));
        EXPECT_EQ(_run({gc_Identity}), 0) << _stderr();
    }
    ASSERT_EQ(countOf(gc_DefaultHistory, "SELECT count(*) FROM documents"), gc_SurveyedPartitions);
    unsigned const seed = std::random_device()();
    std::mt19937 random(seed);
    int killedWhileRecording = 0;
    for (int attempt = 1; attempt <= 3; ++attempt) {
        SimulatedConsole const console(surveyedWithDocuments(attempt));
        SurveyProcess survey = _start({gc_Identity});
        int const pause = std::uniform_int_distribution<int>(0, 20)(random);
        if (killWhileRecording(survey, gc_DefaultHistory, pause)) {
            ++killedWhileRecording;
        }
        EXPECT_EQ(consistencyProblems(gc_DefaultHistory), "") << "seed " << seed;
    }
    EXPECT_GT(killedWhileRecording, 0) << "no run was caught recording; seed " << seed;
    long long const recorded = countOf(gc_DefaultHistory, "SELECT count(*) FROM runs");
    SimulatedConsole const console(surveyedWithDocuments(4));
    EXPECT_EQ(_run({gc_Identity}), 0) << _stderr();
    EXPECT_EQ(countOf(gc_DefaultHistory, "SELECT count(*) FROM runs"), recorded + 1);
    EXPECT_EQ(countOf(gc_DefaultHistory,
                      "SELECT count(*) FROM events WHERE kind = 'property_changed' AND run_id = "
                      "(SELECT max(id) FROM runs)"),
              gc_SurveyedPartitions)
        << "the last run's documents were not compared with the run before";
    EXPECT_EQ(consistencyProblems(gc_DefaultHistory), "");
}

} // namespace
