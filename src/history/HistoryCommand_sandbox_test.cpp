// Runs "quorvex-survey history" as a whole: what it prints, its messages
// and exit statuses, and the files it writes.

#include "HistoryFixture.h"
#include "QuorvexTest.h"

#include <SQLiteCpp/Database.h>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <string>
#include <vector>

namespace {

using QuorvexTest::CommandResult;
using QuorvexTest::ExampleHistory;

CommandResult runHistory(std::vector<std::string> const& arguments) {
    std::vector<std::string> command{QUORVEX_SURVEY_PROGRAM, "history"};
    command.insert(command.end(), arguments.begin(), arguments.end());
    return QuorvexTest::runCommand(command);
}

// Exit status, standard output and standard error in one text.
std::string outcome(CommandResult const& result) {
    return std::to_string(result.exitStatus) + "|" + result.stdoutText + "|" + result.stderrText;
}

TEST(HistoryCommand, RunsListsTheRunsForAScriptWithoutCuttingLines) {
    ExampleHistory example;
    EXPECT_EQ(outcome(runHistory({"runs", "--history", example.path(), "--last", "2"})),
              "0|Run  Console  Started             Took         Exit  Surveyed  Failed  New  "
              "Recov  Inv\n"
              "  4  cons-a   2026-11-03 02:00     41s  143 SIGTERM       1/3       1    0      0"
              "    1\n"
              "  5  cons-a   2026-11-04 02:00  2m 00s            0       3/3       0    0      1"
              "    2\n|");
}

TEST(HistoryCommand, JsonNamesTheFileFirst) {
    ExampleHistory example;
    CommandResult const result = runHistory({"runs", "--json", "--history", example.path()});
    ASSERT_EQ(result.exitStatus, 0) << result.stderrText;
    nlohmann::ordered_json const document = nlohmann::ordered_json::parse(result.stdoutText);
    EXPECT_EQ(document.begin().key(), "file");
    EXPECT_EQ(document["file"], example.path());
    EXPECT_EQ(document["runs"].size(), 5U);
}

TEST(HistoryCommand, ChangesOfANamedRunAndPartitionStoryAnswer) {
    ExampleHistory example;
    CommandResult const changes =
        runHistory({"changes", "--run", "2", "--json", "--history", example.path()});
    ASSERT_EQ(changes.exitStatus, 0) << changes.stderrText;
    EXPECT_EQ(nlohmann::ordered_json::parse(changes.stdoutText)["new_failures"][0]["partition"],
              "lpar2");
    CommandResult const story = runHistory(
        {"partition", "9119-MHE_21ABCDE", "web1", "--json", "--history", example.path()});
    ASSERT_EQ(story.exitStatus, 0) << story.stderrText;
    EXPECT_EQ(nlohmann::ordered_json::parse(story.stdoutText)["console"], "cons-b");
}

TEST(HistoryCommand, APartitionListedByTwoConsolesNeedsTheConsole) {
    QuorvexTest::TemporaryDirectory folder;
    std::string const path = folder.file("history.sqlite");
    QuorvexTest::HistoryFixture history(path);
    QuorvexTest::addExampleRuns(history);
    long long const run =
        history.addRun("cons-b", "2026-11-05T03:00:00Z", "2026-11-05T03:00:09Z", 1, 1, 0);
    history.addPartition(run, QuorvexTest::gc_HistoryMachine, "lpar1");
    EXPECT_EQ(outcome(runHistory(
                  {"partition", QuorvexTest::gc_HistoryMachine, "lpar1", "--history", path})),
              "64||quorvex-survey: history: lpar1 on 8233-E8B_10ABCDE is listed by several "
              "consoles (cons-a, cons-b): choose one with --console\n");
    EXPECT_EQ(outcome(runHistory({"partition", QuorvexTest::gc_HistoryMachine, "lpar1", "--console",
                                  "cons-b", "--history", path})),
              "0|lpar1 on 8233-E8B_10ABCDE (cons-b): listed by 1 run\n"
              "\n"
              "Runs\n"
              "  Run  Started           Outcome   Change  Inventory  Reason\n"
              "    6  2026-11-05 03:00  surveyed          read\n|");
}

TEST(HistoryCommand, AMissingDatabaseExits66AndIsNotCreated) {
    QuorvexTest::TemporaryDirectory folder;
    std::string const path = folder.file("history.sqlite");
    EXPECT_EQ(outcome(runHistory({"runs", "--history", path})),
              "66||quorvex-survey: history: cannot read " + path +
                  ": No such file or directory (no run has been recorded there yet; choose "
                  "another file with --history FILE)\n");
    EXPECT_FALSE(QuorvexTest::fileExists(path));
}

// On a machine where no run has recorded its history, every action says
// where it looked and how to look elsewhere.
TEST(HistoryCommand, AMissingDefaultDatabaseSaysHowToChooseAnother) {
    ASSERT_TRUE(QuorvexTest::isInsideSandbox());
    QuorvexTest::clearFolder("/var/lib/quorvex-survey");
    std::string const hint = ": No such file or directory (no run has been recorded there yet; "
                             "choose another file with --history FILE)\n";
    EXPECT_EQ(outcome(runHistory({"runs"})),
              "66||quorvex-survey: history: cannot read /var/lib/quorvex-survey/history.sqlite" +
                  hint);
    EXPECT_EQ(outcome(runHistory({"prune", "--keep", "3"})),
              "66||quorvex-survey: history: cannot write /var/lib/quorvex-survey/history.sqlite" +
                  hint);
    EXPECT_FALSE(QuorvexTest::fileExists("/var/lib/quorvex-survey/history.sqlite"));
}

TEST(HistoryCommand, ACorruptDatabaseExits65) {
    QuorvexTest::TemporaryDirectory folder;
    std::string const path = folder.file("history.sqlite");
    QuorvexTest::writeFile(path, std::string(8192, '\x5a'));
    EXPECT_EQ(outcome(runHistory({"changes", "--history", path})),
              "65||quorvex-survey: history: " + path +
                  " is not a readable history database: file is not a database\n");
}

TEST(HistoryCommand, ANewerSchemaExits65) {
    ExampleHistory example;
    example.database().exec("PRAGMA user_version = 7");
    EXPECT_EQ(outcome(runHistory({"export", "--format", "csv", "--history", example.path()})),
              "65||quorvex-survey: history: " + example.path() +
                  " has schema version 7, newer than this program reads (1): use the "
                  "quorvex-survey that wrote it\n");
}

TEST(HistoryCommand, AnotherProgramsDatabaseExits65) {
    ExampleHistory example;
    example.database().exec("PRAGMA application_id = 0");
    EXPECT_EQ(outcome(runHistory({"prune", "--keep", "1", "--history", example.path()})),
              "65||quorvex-survey: history: " + example.path() +
                  " is not a quorvex-survey history database\n");
    EXPECT_EQ(example.database().execAndGet("SELECT count(*) FROM runs").getInt(), 5);
}

TEST(HistoryCommand, BadCommandLinesExit64WithTheirReason) {
    ExampleHistory example;
    std::string const& file = example.path();
    struct Refusal {
        std::vector<std::string> arguments;
        std::string message;
    };
    for (Refusal const& refusal : std::vector<Refusal>{
             {{},
              "history: name what to show: runs, changes, partition, export or prune "
              "(try 'quorvex-survey history --help')"},
             {{"runz"},
              "history: unknown history command 'runz': use runs, changes, partition, "
              "export or prune (try 'quorvex-survey history --help')"},
             {{"prune", "--history", file},
              "history prune: prune needs --keep N or --before DATE (try 'quorvex-survey "
              "history prune --help')"},
             {{"prune", "--keep", "2", "--before", "2026-11-01"},
              "history prune: give either --keep or --before, not both (try 'quorvex-survey "
              "history prune --help')"},
             {{"prune", "--keep", "0"},
              "history prune: --keep takes a whole number from 1, not '0' (try 'quorvex-survey "
              "history prune --help')"},
             {{"changes", "--since", "last week"},
              "history changes: --since takes a date (2026-11-01) or an ISO 8601 time "
              "(2026-11-01T14:05:09+01:00), not 'last week' (try 'quorvex-survey history "
              "changes --help')"},
             {{"changes", "--run", "2", "--since", "2026-11-01"},
              "history changes: --run and --since exclude each other: give one of them (try "
              "'quorvex-survey history changes --help')"},
             {{"export"},
              "history export: export needs --format json or --format csv (try "
              "'quorvex-survey history export --help')"},
             {{"export", "--format", "xml"},
              "history export: --format takes json or csv, not 'xml' (try 'quorvex-survey "
              "history export --help')"},
             {{"partition", "8233-E8B_10ABCDE"},
              "history partition: partition needs MACHINE and PARTITION (try 'quorvex-survey "
              "history partition --help')"},
             {{"runs", "--lats", "2"},
              "history runs: unknown option --lats: did you mean --last? (try 'quorvex-survey "
              "history runs --help')"},
             {{"changes", "--run", "99", "--history", file}, "history: no run 99 in " + file},
             {{"partition", "8233-E8B_10ABCDE", "lpar9", "--history", file},
              "history: no run listed lpar9 on 8233-E8B_10ABCDE in " + file}}) {
        EXPECT_EQ(outcome(runHistory(refusal.arguments)),
                  "64||quorvex-survey: " + refusal.message + "\n");
    }
}

TEST(HistoryCommand, ExportWritesItsFileWhole) {
    ExampleHistory example;
    CommandResult const printed =
        runHistory({"export", "--format", "csv", "--what", "changes", "--history", example.path()});
    QuorvexTest::TemporaryDirectory folder;
    std::string const file = folder.file("changes.csv");
    EXPECT_EQ(outcome(runHistory({"export", "--format", "csv", "--what", "changes", "--output",
                                  file, "--history", example.path()})),
              "0||");
    EXPECT_EQ(QuorvexTest::readFile(file), printed.stdoutText);
    EXPECT_EQ(QuorvexTest::listFolder(folder.path()), std::vector<std::string>{"changes.csv"});
}

TEST(HistoryCommand, ExportIntoAMissingFolderExits73) {
    ExampleHistory example;
    QuorvexTest::TemporaryDirectory folder;
    CommandResult const result =
        runHistory({"export", "--format", "json", "--output", folder.file("no/runs.json"),
                    "--history", example.path()});
    EXPECT_EQ(result.exitStatus, 73);
    EXPECT_EQ(result.stderrText.rfind("quorvex-survey: history: cannot ", 0), 0U)
        << result.stderrText;
}

TEST(HistoryCommand, PruneSaysHowManyRunsItRemoved) {
    ExampleHistory example;
    EXPECT_EQ(outcome(runHistory({"prune", "--keep", "1", "--history", example.path()})),
              "0|Removed 3 runs, kept 2.\n|");
    EXPECT_EQ(outcome(runHistory({"runs", "--history", example.path()})).substr(0, 2), "0|");
    EXPECT_EQ(example.database().execAndGet("SELECT count(*) FROM events").getInt(), 4);
}

// A run recording holds the write lock: prune waits for it, then gives up.
TEST(HistoryCommand, PruneOfADatabaseHeldByAnotherProcessExits75) {
    ExampleHistory example;
    example.database().exec("BEGIN EXCLUSIVE");
    EXPECT_EQ(outcome(runHistory({"prune", "--keep", "1", "--history", example.path()})),
              "75||quorvex-survey: history: " + example.path() +
                  " is locked: another process has held it for more than 5 s\n");
    example.database().exec("ROLLBACK");
}

} // namespace
