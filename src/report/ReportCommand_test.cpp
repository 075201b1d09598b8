#include "report/ReportCommand.h"

#include "QuorvexTest.h"

#include <CLI/CLI.hpp>
#include <gtest/gtest.h>

#include <sstream>

namespace {

constexpr char statusName[] = "quorvexPYLON_VPD_Survey_ClientPartition_1-A_S.status";

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

TEST(ReportCommand, FromThatIsNoFolderIsRefusedInPlainWords) {
    CLI::App app;
    report::ReportRequest request;
    report::addReportSubcommand(app, request);
    try {
        parse(app, {"report", "--from", "/nonexistent/folder", "out"});
        FAIL() << "no refusal";
    } catch (CLI::ValidationError const& error) {
        EXPECT_STREQ("--from /nonexistent/folder: no such folder", error.what());
    }
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
    QuorvexTest::writeFile(root.file(statusName), "h [1] - VPD Survey - Ok\n");
    std::ostringstream out;
    std::ostringstream errors;
    EXPECT_EQ(0, report::runReportSubcommand({root.path(), root.file("r")}, out, errors));
    EXPECT_EQ(root.file("r") + "/index.html\n", out.str());
    EXPECT_EQ("", errors.str());
    EXPECT_TRUE(QuorvexTest::fileExists(root.file("r/index.html")));
}

TEST(ReportCommand, RunThatCannotWriteSaysWhyAndFails) {
    QuorvexTest::TemporaryDirectory root;
    QuorvexTest::writeFile(root.file("file"), "x");
    std::ostringstream out;
    std::ostringstream errors;
    EXPECT_EQ(1, report::runReportSubcommand({root.path(), root.file("file/r")}, out, errors));
    EXPECT_EQ("", out.str());
    EXPECT_EQ(0U,
              errors.str().find("quorvex-survey: report: cannot create " + root.file("file/r")));
}

TEST(ReportCommand, RunReportPrintsNothingOnSuccess) {
    QuorvexTest::TemporaryDirectory root;
    std::ostringstream errors;
    EXPECT_TRUE(report::writeRunReport(nlohmann::ordered_json::object(), root.file("r"), errors));
    EXPECT_EQ("", errors.str());
    EXPECT_TRUE(QuorvexTest::fileExists(root.file("r/summary.json")));
}

} // namespace
