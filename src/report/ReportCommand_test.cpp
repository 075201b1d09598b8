#include "report/ReportCommand.h"

#include "HistorySeed.h"
#include "QuorvexTest.h"

#include <CLI/CLI.hpp>
#include <gtest/gtest.h>

#include <unistd.h>

#include <filesystem>
#include <iostream>
#include <sstream>

namespace {

namespace fs = std::filesystem;

constexpr char gc_StatusName[] = "quorvexPYLON_VPD_Survey_ClientPartition_1-A_S.status";

// What "report --from vpdFolder folder" is given.
report::ReportRequest requestFor(std::string const& vpdFolder, std::string const& folder) {
    report::ReportRequest request;
    request.vpdFolder = vpdFolder;
    request.folder = folder;
    return request;
}

void parse(CLI::App& app, std::vector<std::string> arguments) {
    std::reverse(arguments.begin(), arguments.end());
    app.parse(arguments);
}

TEST(ReportCommand, SubcommandTakesFolderAndDefaultsToTheConsolesVpdFolder) {
    CLI::App app;
    report::ReportRequest request;
    CLI::App* const command = report::addReportSubcommand(app, request);
    parse(app, {"report", "/tmp/r"});
    EXPECT_TRUE(command->parsed());
    EXPECT_EQ("/var/adm/quorvex/VPD", request.vpdFolder);
    EXPECT_EQ("/tmp/r", request.folder);
}

TEST(ReportCommand, SubcommandTakesFrom) {
    QuorvexTest::TemporaryDirectory folder;
    CLI::App app;
    report::ReportRequest request;
    report::addReportSubcommand(app, request);
    parse(app, {"report", "--from", folder.path(), "out"});
    EXPECT_EQ(folder.path(), request.vpdFolder);
    EXPECT_EQ("out", request.folder);
}

TEST(ReportCommand, SubcommandWithoutFolderIsRefusedInPlainWords) {
    CLI::App app;
    report::ReportRequest request;
    report::addReportSubcommand(app, request);
    parse(app, {"report"});
    try {
        report::checkReportRequest(request);
        FAIL() << "no refusal";
    } catch (CLI::ValidationError const& error) {
        EXPECT_STREQ("no DIR given (the folder to write the report into)", error.what());
    }
}

TEST(ReportCommand, SubcommandWithFolderPassesTheCheck) {
    CLI::App app;
    report::ReportRequest request;
    report::addReportSubcommand(app, request);
    parse(app, {"report", "out"});
    EXPECT_NO_THROW(report::checkReportRequest(request));
}

TEST(ReportCommand, SubcommandLeavesAMissingFromFolderToTheRun) {
    CLI::App app;
    report::ReportRequest request;
    report::addReportSubcommand(app, request);
    parse(app, {"report", "--from", "/nonexistent/folder", "out"});
    EXPECT_EQ("/nonexistent/folder", request.vpdFolder);
}

// What a run that has nothing to read gives: its status, its standard
// output and error, and whether it wrote into its report folder.
std::string refusedRun(std::string const& vpdFolder, std::string const& folder) {
    std::ostringstream out;
    std::ostringstream errors;
    int const status = report::runReportSubcommand(requestFor(vpdFolder, folder), out, errors);
    return std::to_string(status) + "|" + out.str() + "|" + errors.str() + "|" +
           (QuorvexTest::fileExists(folder) ? "written" : "nothing written");
}

TEST(ReportCommand, RunFromAMissingFolderOrAFileSaysWhyAndWritesNothing) {
    QuorvexTest::TemporaryDirectory root;
    QuorvexTest::writeFile(root.file("file"), "x");
    EXPECT_EQ("64||quorvex-survey: report: cannot read " + root.file("missing") +
                  ": No such file or directory\n|nothing written",
              refusedRun(root.file("missing"), root.file("r")));
    EXPECT_EQ("64||quorvex-survey: report: cannot read " + root.file("file") +
                  ": Not a directory\n|nothing written",
              refusedRun(root.file("file"), root.file("r")));
}

TEST(ReportCommand, RunFromAFolderWithoutStatusFilesSaysSoAndWritesNothing) {
    QuorvexTest::TemporaryDirectory root;
    fs::create_directory(root.file("VPD"));
    QuorvexTest::writeFile(root.file("VPD/quorvexPYLON_VPD_Survey_ClientPartition_1-A_S-1.VPD.xml"),
                           "x");
    EXPECT_EQ("64||quorvex-survey: report: " + root.file("VPD") +
                  " holds no status file of a survey run\n|nothing written",
              refusedRun(root.file("VPD"), root.file("r")));
}

// The user root reads a folder whatever its mode: the run that is refused
// runs in a child as the unprivileged user nobody.
constexpr uid_t gc_Nobody = 65534;

TEST(ReportCommand, RunFromAnUnreadableFolderSaysWhyAndWritesNothing) {
    QuorvexTest::TemporaryDirectory root;
    fs::permissions(root.path(),
                    fs::perms::owner_all | fs::perms::others_read | fs::perms::others_exec);
    fs::create_directory(root.file("VPD"));
    fs::permissions(root.file("VPD"), fs::perms::none);
    QuorvexTest::CommandResult const result = QuorvexTest::runInChild([&] {
        if (geteuid() == 0 && (setgid(gc_Nobody) != 0 || setuid(gc_Nobody) != 0)) {
            return 2;
        }
        std::cout << refusedRun(root.file("VPD"), root.file("r"));
        return 0;
    });
    fs::permissions(root.file("VPD"), fs::perms::owner_all);
    EXPECT_EQ(0, result.exitStatus) << result.stderrText;
    EXPECT_EQ("64||quorvex-survey: report: cannot read " + root.file("VPD") +
                  ": Permission denied\n|nothing written",
              result.stdoutText);
}

TEST(ReportCommand, ReportOptionTakesTheFolder) {
    CLI::App app;
    std::string folder;
    report::addReportOption(app, folder);
    parse(app, {"--report", "r"});
    EXPECT_EQ("r", folder);
}

TEST(ReportCommand, RunWritesTheReportAndPrintsThePagesPath) {
    QuorvexTest::TemporaryDirectory root;
    QuorvexTest::writeFile(root.file(gc_StatusName), "h [1] - VPD Survey - Ok\n");
    std::ostringstream out;
    std::ostringstream errors;
    EXPECT_EQ(0, report::runReportSubcommand(requestFor(root.path(), root.file("r")), out, errors));
    EXPECT_EQ(root.file("r") + "/index.html\n", out.str());
    EXPECT_EQ("", errors.str());
    EXPECT_TRUE(QuorvexTest::fileExists(root.file("r/index.html")));
}

TEST(ReportCommand, RunThatCannotWriteSaysWhyAndFails) {
    QuorvexTest::TemporaryDirectory root;
    QuorvexTest::writeFile(root.file(gc_StatusName), "h [1] - VPD Survey - Ok\n");
    QuorvexTest::writeFile(root.file("file"), "x");
    std::ostringstream out;
    std::ostringstream errors;
    EXPECT_EQ(
        73, report::runReportSubcommand(requestFor(root.path(), root.file("file/r")), out, errors));
    EXPECT_EQ("", out.str());
    EXPECT_EQ(0U,
              errors.str().find("quorvex-survey: report: cannot create " + root.file("file/r")));
}

TEST(ReportCommand, RunReportPrintsNothingOnSuccess) {
    QuorvexTest::TemporaryDirectory root;
    EXPECT_EQ(report::writeRunReport(nlohmann::ordered_json::object(), root.file("r")),
              std::nullopt);
    EXPECT_TRUE(QuorvexTest::fileExists(root.file("r/summary.json")));
}

TEST(ReportCommand, RunReportThatCannotBeWrittenSaysWhy) {
    QuorvexTest::TemporaryDirectory root;
    QuorvexTest::writeFile(root.file("file"), "x");
    EXPECT_EQ(report::writeRunReport(nlohmann::ordered_json::object(), root.file("file/r")),
              "report: cannot create " + root.file("file/r") + ": Not a directory");
}

// The files' console as the report names it: this machine's host name.
std::string consoleOfFiles(QuorvexTest::TemporaryDirectory const& root) {
    std::ostringstream out;
    std::ostringstream errors;
    EXPECT_EQ(
        0, report::runReportSubcommand(requestFor(root.path(), root.file("plain")), out, errors));
    return nlohmann::ordered_json::parse(QuorvexTest::readFile(root.file("plain/summary.json")))
        .at("console_host")
        .get<std::string>();
}

TEST(ReportCommand, HistoryGivesTheChangesOfTheNewestRunOfTheFilesConsole) {
    QuorvexTest::TemporaryDirectory root;
    QuorvexTest::writeFile(root.file(gc_StatusName), "h [1] - VPD Survey - Ok\n");
    QuorvexTest::HistorySeed const seed(root.file("history.sqlite"));
    std::string const console = consoleOfFiles(root);
    seed.addRun(console, "2026-11-20T08:00:00+01:00");
    long long const newest = seed.addRun(console, "2026-11-21T08:00:00+01:00");
    seed.addRun("another " + console, "2026-11-22T08:00:00+01:00");
    seed.addPartition(newest, {"1-A_S", "h", "surveyed", {}, {}, newest});
    report::ReportRequest request = requestFor(root.path(), root.file("r"));
    request.historyFile = seed.path();
    std::ostringstream out;
    std::ostringstream errors;
    EXPECT_EQ(0, report::runReportSubcommand(request, out, errors));
    EXPECT_EQ("", errors.str());
    std::string const page = QuorvexTest::readFile(root.file("r/index.html"));
    EXPECT_NE(std::string::npos, page.find("Compared with the run started <time "
                                           "datetime=\"2026-11-20T08:00:00+01:00\">"));
    EXPECT_NE(std::string::npos, page.find("<td class=outcome>surveyed<td><time "
                                           "datetime=\"2026-11-21T08:00:00+01:00\""));
}

TEST(ReportCommand, HistoryWithoutARunOfTheConsoleIsSaidAndTheReportHasNoChanges) {
    QuorvexTest::TemporaryDirectory root;
    QuorvexTest::writeFile(root.file(gc_StatusName), "h [1] - VPD Survey - Ok\n");
    QuorvexTest::HistorySeed const seed(root.file("history.sqlite"));
    std::string const console = consoleOfFiles(root);
    seed.addRun("another " + console, "2026-11-22T08:00:00+01:00");
    report::ReportRequest request = requestFor(root.path(), root.file("r"));
    request.historyFile = seed.path();
    std::ostringstream out;
    std::ostringstream errors;
    EXPECT_EQ(0, report::runReportSubcommand(request, out, errors));
    EXPECT_EQ("quorvex-survey: report: " + seed.path() + " holds no run of the console " + console +
                  ": the report shows no changes\n",
              errors.str());
    EXPECT_EQ(std::string::npos,
              QuorvexTest::readFile(root.file("r/index.html")).find("since-last-run"));
}

TEST(ReportCommand, HistoryThatCannotBeReadIsSaidAndTheReportHasNoChanges) {
    QuorvexTest::TemporaryDirectory root;
    QuorvexTest::writeFile(root.file(gc_StatusName), "h [1] - VPD Survey - Ok\n");
    report::ReportRequest request = requestFor(root.path(), root.file("r"));
    request.historyFile = root.file("missing.sqlite");
    std::ostringstream out;
    std::ostringstream errors;
    EXPECT_EQ(0, report::runReportSubcommand(request, out, errors));
    EXPECT_EQ("quorvex-survey: report: cannot read " + request.historyFile +
                  ": No such file or directory: the report shows no changes\n",
              errors.str());
    EXPECT_TRUE(QuorvexTest::fileExists(root.file("r/index.html")));
}

TEST(ReportCommand, SubcommandTakesHistoryAndStaleAfter) {
    CLI::App app;
    report::ReportRequest request;
    report::addReportSubcommand(app, request);
    EXPECT_EQ(3, request.staleAfterRuns);
    parse(app, {"report", "--history", "h.sqlite", "--stale-after", "5", "out"});
    EXPECT_EQ("h.sqlite", request.historyFile);
    EXPECT_EQ(5, request.staleAfterRuns);
}

TEST(ReportCommand, StaleAfterRefusesZeroWordsAndHugeNumbersSayingWhatItTakes) {
    for (std::string const value : {"0", "three", "2x", "-1", "1000001"}) {
        CLI::App app;
        int staleAfter = 3;
        report::addStaleAfterOption(app, staleAfter);
        try {
            parse(app, {"--stale-after=" + value});
            ADD_FAILURE() << "taken: " << value;
        } catch (CLI::ValidationError const& refusal) {
            EXPECT_EQ("--stale-after takes a whole number of runs from 1 to 1000000, not '" +
                          value + "'",
                      std::string(refusal.what()));
        }
        EXPECT_EQ(3, staleAfter);
    }
}

} // namespace
