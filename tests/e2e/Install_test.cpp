// Installs the build tree into a scratch DESTDIR inside the build tree and
// checks what a console gets: the tool, its manual page and the two result
// folders; then runs the installed tool once inside the sandbox.

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <string>
#include <vector>

namespace {

namespace fs = std::filesystem;

constexpr char gc_Tool[] = "quorvexPYLON_VPD_Survey_ClientPartition";
constexpr char gc_FleetProgram[] = "quorvex-survey";

// Installs the build tree with DESTDIR set to destDir and the given extra
// arguments of "cmake --install".
QuorvexTest::CommandResult u_install(std::string const& destDir,
                                     std::vector<std::string> const& arguments) {
    std::error_code ignored;
    fs::remove_all(destDir, ignored);
    std::vector<std::string> command{"/usr/bin/env", "DESTDIR=" + destDir, QUORVEX_CMAKE_COMMAND,
                                     "--install", QUORVEX_BINARY_DIR};
    command.insert(command.end(), arguments.begin(), arguments.end());
    return QuorvexTest::runCommand(command);
}

bool u_is_ExecutableFile(std::string const& path) {
    fs::file_status const status = fs::status(path);
    return fs::is_regular_file(status) &&
           (status.permissions() & fs::perms::owner_exec) != fs::perms::none;
}

void u_expect_ResultFolders(std::string const& destDir) {
    for (char const* folder : {QuorvexTest::gc_VPD_Folder, QuorvexTest::gc_TraceFolder}) {
        EXPECT_TRUE(fs::is_directory(destDir + folder)) << destDir + folder;
        EXPECT_TRUE(QuorvexTest::listFolder(destDir + folder).empty()) << destDir + folder;
    }
}

TEST(SurveyInstallation, InstallsToolManualPageAndResultFoldersUnderThePrefix) {
    std::string const destDir = std::string(QUORVEX_INSTALL_SCRATCH) + "/prefix";
    QuorvexTest::CommandResult const install = u_install(destDir, {"--prefix", "/opt/quorvex"});
    ASSERT_EQ(install.exitStatus, 0) << install.stdoutText << install.stderrText;
    EXPECT_TRUE(u_is_ExecutableFile(destDir + "/opt/quorvex/bin/" + gc_Tool));
    std::string const manualPage = destDir + "/opt/quorvex/share/man/man8/" + gc_Tool + ".8";
    ASSERT_TRUE(QuorvexTest::fileExists(manualPage));
    EXPECT_EQ(QuorvexTest::readFile(manualPage), QuorvexTest::readFile(QUORVEX_MANUAL_PAGE));
    u_expect_ResultFolders(destDir);
}

// The page is configured from its template with the version of project(),
// the one the tool sends to the partition's client.
TEST(SurveyInstallation, ManualPageCarriesTheProjectVersionAndNoPlaceholder) {
    std::string const page = QuorvexTest::readFile(QUORVEX_MANUAL_PAGE);
    std::string const version = QUORVEX_PROJECT_VERSION;
    EXPECT_EQ(page.substr(0, page.find('\n')),
              ".TH QUORVEXPYLON_VPD_SURVEY_CLIENTPARTITION 8 2026 \"Quorvex PYLON " + version +
                  "\"");
    EXPECT_NE(page.find("\" -pylonv " + version + "\"\n"), std::string::npos);
    EXPECT_EQ(page.find('@'), std::string::npos);
}

TEST(SurveyInstallation, InstallsTheConsoleWideSurveyAndItsManualPageBesideTheTool) {
    std::string const destDir = std::string(QUORVEX_INSTALL_SCRATCH) + "/fleet";
    QuorvexTest::CommandResult const install = u_install(destDir, {"--prefix", "/opt/quorvex"});
    ASSERT_EQ(install.exitStatus, 0) << install.stdoutText << install.stderrText;
    EXPECT_TRUE(u_is_ExecutableFile(destDir + "/opt/quorvex/bin/" + gc_FleetProgram));
    std::string const manualPage =
        destDir + "/opt/quorvex/share/man/man8/" + gc_FleetProgram + ".8";
    ASSERT_TRUE(QuorvexTest::fileExists(manualPage));
    EXPECT_EQ(QuorvexTest::readFile(manualPage), QuorvexTest::readFile(QUORVEX_FLEET_MANUAL_PAGE));
}

TEST(SurveyInstallation, ConfiguredPrefixIsUsedWithoutAPrefixArgument) {
    std::string const destDir = std::string(QUORVEX_INSTALL_SCRATCH) + "/configured";
    QuorvexTest::CommandResult const install = u_install(destDir, {});
    ASSERT_EQ(install.exitStatus, 0) << install.stdoutText << install.stderrText;
    EXPECT_TRUE(u_is_ExecutableFile(destDir + QUORVEX_INSTALL_PREFIX + "/bin/" + gc_Tool));
    EXPECT_TRUE(QuorvexTest::fileExists(destDir + QUORVEX_INSTALL_PREFIX + "/share/man/man8/" +
                                        gc_Tool + ".8"));
    u_expect_ResultFolders(destDir);
}

TEST(SurveyInstallation, InstalledToolSurveysAMachineInTheSandbox) {
    std::string const destDir = std::string(QUORVEX_INSTALL_SCRATCH) + "/run";
    ASSERT_EQ(u_install(destDir, {"--prefix", "/opt/quorvex"}).exitStatus, 0);
    QuorvexTest::TemporaryDirectory const vpdFolder;
    QuorvexTest::TemporaryDirectory const traceFolder;
    QuorvexTest::SimulatedConsole const console(
        "[lspartition 1234-ABC_10ABCDE]\n"
        "stdout 1,10.1.1.11,3,host1,Zeph,7.2;2,10.1.1.12,1,host2,Zeph,7.2;\n"
        "[runCmdOnPartition *]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
        "[getFileFromPartition *]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
        "document-nolf <fetched/>\n");
    QuorvexTest::CommandResult const run = QuorvexTest::runInSandbox(
        {"--vpd", vpdFolder.path(), "--trace", traceFolder.path()},
        {destDir + "/opt/quorvex/bin/" + gc_Tool, "-c", "1234-ABC_10ABCDE"});
    if (run.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
        GTEST_SKIP() << run.stderrText;
    }
    EXPECT_EQ(run.exitStatus, 2);
    EXPECT_EQ(run.stdoutText,
              "VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE-1.VPD.xml\n");
    EXPECT_EQ(run.stderrText, "0\n\nquorvexPYLON_VPD_Survey_ClientPartition ReturnCode: \n4");
    EXPECT_EQ(QuorvexTest::readFile(vpdFolder.file(
                  "quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE.status")),
              "host1 [10.1.1.11] - VPD Survey - Ok\n"
              "host2 [10.1.1.12] - VPD Survey - Failed - Active Status < 3\n");
    EXPECT_EQ(QuorvexTest::readFile(vpdFolder.file(
                  "quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE-1.VPD.xml")),
              "<fetched/>");
    EXPECT_EQ(QuorvexTest::listFolder(traceFolder.path()),
              std::vector<std::string>{"quorvexPYLON_VPD_Survey_ClientPartition.Trace"});
}

} // namespace
