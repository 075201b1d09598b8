// The scheduled survey as the installation gives it: quorvex-survey.service,
// quorvex-survey.timer and /etc/default/quorvex-survey, installed with the
// prefix /usr into a scratch root inside the build tree. systemd is not
// running here: the units are read as systemd reads them, checked by
// systemd-analyze (tools/check-units), and the service's command line,
// expanded with the shipped options as systemd expands it, surveys the
// simulated console inside the sandbox with the service's folders bound to
// scratch folders. How to check the service under systemd on a console:
// docs/schedule.md.

#include "EnvironmentFile.h"
#include "SystemdUnit.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <string>
#include <vector>

namespace {

namespace fs = std::filesystem;

constexpr char gc_Service[] = "Service";
constexpr char gc_UnitFolder[] = "/lib/systemd/system/";
constexpr char gc_DefaultFile[] = "/etc/default/quorvex-survey";
constexpr char gc_Program[] = "/usr/bin/quorvex-survey";
constexpr char gc_StateFolder[] = "/var/lib/quorvex-survey";
constexpr char gc_MetricsFolder[] = "/var/lib/prometheus/node-exporter";

std::string u_testName() {
    return ::testing::UnitTest::GetInstance()->current_test_info()->name();
}

// The build tree installed with the prefix (/usr, as the package has it)
// into a scratch root of this test's own (tests of this program may run at
// the same time).
std::string u_installedRoot(std::string const& prefix = "/usr") {
    std::string root = std::string(QUORVEX_UNITS_SCRATCH) + "/" + u_testName();
    std::error_code ignored;
    fs::remove_all(root, ignored);
    QuorvexTest::CommandResult const install =
        QuorvexTest::runCommand({"/usr/bin/env", "DESTDIR=" + root, QUORVEX_CMAKE_COMMAND,
                                 "--install", QUORVEX_BINARY_DIR, "--prefix", prefix});
    EXPECT_EQ(install.exitStatus, 0) << install.stdoutText << install.stderrText;
    return root;
}

SystemdUnit u_unit(std::string const& root, std::string const& name) {
    return SystemdUnit(QuorvexTest::readFile(root + gc_UnitFolder + name));
}

EnvironmentFile u_shippedOptions(std::string const& root) {
    return EnvironmentFile(QuorvexTest::readFile(root + gc_DefaultFile));
}

std::vector<std::string> u_command(std::string const& root, EnvironmentFile const& options) {
    return options.expand(u_unit(root, "quorvex-survey.service").value(gc_Service, "ExecStart"));
}

bool u_isWithin(std::string const& path, std::string const& folder) {
    return path == folder || path.rfind(folder + "/", 0) == 0;
}

TEST(ScheduledSurvey, InstalledUnitsPassSystemdAnalyzeVerifyAndHaveAnExposureOfAtMost3) {
    QuorvexTest::CommandResult const check =
        QuorvexTest::runCommand({QUORVEX_CHECK_UNITS, QUORVEX_BINARY_DIR});
    EXPECT_EQ(check.exitStatus, 0) << check.stdoutText << check.stderrText;
    EXPECT_NE(check.stdoutText.find("systemd-analyze verify: no findings\n"), std::string::npos)
        << check.stdoutText;
    EXPECT_NE(check.stdoutText.find("(at most 3.0)\n"), std::string::npos) << check.stdoutText;
    EXPECT_EQ(check.stderrText, "");
}

TEST(ScheduledSurvey, ServiceSurveysEveryMachineWithTheShippedOptions) {
    std::string const root = u_installedRoot();
    std::vector<std::string> const expected{
        gc_Program,  "--all",
        "--jobs",    "8",
        "--timeout", "1800",
        "--history", "/var/lib/quorvex-survey/history.sqlite",
        "--report",  "/var/lib/quorvex-survey/report",
        "--summary", "/var/lib/quorvex-survey/summary.json",
        "--metrics", "/var/lib/prometheus/node-exporter/quorvex-survey.prom",
        "--junit",   "/var/lib/quorvex-survey/junit.xml",
    };
    EXPECT_EQ(u_command(root, u_shippedOptions(root)), expected);
    EXPECT_EQ(u_unit(root, "quorvex-survey.service").value(gc_Service, "EnvironmentFile"),
              std::string("-") + gc_DefaultFile);
}

// The unit is written when it is installed, so it follows the prefix of
// that installation, not the one the build was configured with.
TEST(ScheduledSurvey, ServiceNamesTheProgramWhereAnInstallationWithAnotherPrefixPutsIt) {
    std::string const root = u_installedRoot("/opt/quorvex");
    EXPECT_TRUE(QuorvexTest::fileExists(root + "/opt/quorvex/bin/quorvex-survey"));
    EXPECT_EQ(u_command(root, EnvironmentFile("")),
              (std::vector<std::string>{"/opt/quorvex/bin/quorvex-survey", "--all"}));
}

// The file is optional ("-"): without it, or with every variable emptied,
// the program's own defaults apply.
TEST(ScheduledSurvey, ServiceWithoutOptionsRunsTheSurveyOfEveryMachineWithTheProgramsDefaults) {
    std::string const root = u_installedRoot();
    std::vector<std::string> const expected{gc_Program, "--all"};
    EXPECT_EQ(u_command(root, EnvironmentFile("")), expected);
    EnvironmentFile const shipped = u_shippedOptions(root);
    EnvironmentFile emptied = shipped;
    for (auto const& variable : shipped.variables()) {
        emptied.set(variable.first, "");
    }
    EXPECT_EQ(u_command(root, emptied), expected);
}

TEST(ScheduledSurvey, ExtraOptionsFromTheDefaultFileComeLastWordByWord) {
    std::string const root = u_installedRoot();
    EnvironmentFile options = u_shippedOptions(root);
    options.set("QUORVEX_SURVEY_OPTIONS", "--stale-after 7  --wait");
    std::vector<std::string> const command = u_command(root, options);
    std::vector<std::string> const last(command.end() - 3, command.end());
    EXPECT_EQ(last, (std::vector<std::string>{"--stale-after", "7", "--wait"}));
}

// Only 4 joins 0 as a success: a survey that finished with some partitions
// not surveyed. SIGTERM goes to the run alone, which stops its own workers.
TEST(ScheduledSurvey, ServiceIsAOneShotThatCountsStatus4AsSuccessAndIsStoppedThroughTheRun) {
    SystemdUnit const service = u_unit(u_installedRoot(), "quorvex-survey.service");
    EXPECT_EQ(service.value(gc_Service, "Type"), "oneshot");
    EXPECT_EQ(service.value(gc_Service, "SuccessExitStatus"), "4");
    EXPECT_EQ(service.value(gc_Service, "KillMode"), "mixed");
    EXPECT_EQ(service.value(gc_Service, "StateDirectory"), "quorvex-survey");
    // Started by the timer alone: nothing can enable the service itself.
    EXPECT_FALSE(service.hasSection("Install"));
}

TEST(ScheduledSurvey, EveryFolderTheServiceWritesIsWritableUnderItsReadOnlySystem) {
    std::string const root = u_installedRoot();
    SystemdUnit const service = u_unit(root, "quorvex-survey.service");
    EXPECT_EQ(service.value(gc_Service, "ProtectSystem"), "strict");
    // A leading '-' lets a missing folder pass: it is not part of the path.
    std::vector<std::string> writable = service.words(gc_Service, "ReadWritePaths");
    std::transform(writable.begin(), writable.end(), writable.begin(),
                   [](std::string path) { return path[0] == '-' ? path.substr(1) : path; });
    writable.emplace_back(gc_StateFolder);
    for (char const* folder : {QuorvexTest::gc_VPD_Folder, QuorvexTest::gc_TraceFolder}) {
        EXPECT_NE(std::find(writable.begin(), writable.end(), folder), writable.end()) << folder;
    }
    std::vector<std::string> const command = u_command(root, u_shippedOptions(root));
    for (std::size_t i = 2; i < command.size(); ++i) {
        if (command[i][0] != '/') {
            continue;
        }
        EXPECT_TRUE(
            std::any_of(writable.begin(), writable.end(),
                        [&](std::string const& folder) { return u_isWithin(command[i], folder); }))
            << command[i - 1] << " " << command[i];
    }
}

TEST(ScheduledSurvey, TimerRunsTheServiceDailyAtAFixedlyDelayedTimeAndCatchesUpMissedDays) {
    SystemdUnit const timer = u_unit(u_installedRoot(), "quorvex-survey.timer");
    EXPECT_EQ(timer.value("Timer", "OnCalendar"), "*-*-* 03:30:00");
    EXPECT_EQ(timer.value("Timer", "RandomizedDelaySec"), "30min");
    EXPECT_EQ(timer.value("Timer", "FixedRandomDelay"), "true");
    EXPECT_EQ(timer.value("Timer", "Persistent"), "true");
    // The timer of the same name starts the service of the same name.
    EXPECT_EQ(timer.value("Timer", "Unit"), "");
    EXPECT_EQ(timer.value("Install", "WantedBy"), "timers.target");
}

// The service's own command line, as systemd would run it, against the
// simulated console: the program at the service's path, its folders at
// theirs (bound to scratch folders).
TEST(ScheduledSurvey, ServiceCommandLineSurveysTheConsoleIntoTheServicesFolders) {
    std::string const root = u_installedRoot();
    EnvironmentFile const options = u_shippedOptions(root);
    std::string const scratch = std::string(QUORVEX_UNITS_SCRATCH) + "/" + u_testName() + "-run";
    std::error_code ignored;
    fs::remove_all(scratch, ignored);
    for (char const* folder : {"state", "metrics", "VPD", "Trace"}) {
        fs::create_directories(scratch + "/" + folder);
    }
    QuorvexTest::SimulatedConsole const console(
        QuorvexTest::ScenarioFile{QuorvexTest::shippedScenario("several-machines.scn")});
    QuorvexTest::CommandResult const run = QuorvexTest::runInSandbox(
        {"--bind", root + gc_Program + ":" + gc_Program, "--bind",
         scratch + "/state:" + gc_StateFolder, "--bind", scratch + "/metrics:" + gc_MetricsFolder,
         "--vpd", scratch + "/VPD", "--trace", scratch + "/Trace"},
        u_command(root, options));
    EXPECT_EQ(run.exitStatus, 4) << run.stderrText;
    EXPECT_EQ(
        QuorvexTest::listFolder(scratch + "/state"),
        (std::vector<std::string>{"history.sqlite", "history.sqlite-shm", "history.sqlite-wal",
                                  "junit.xml", "report", "summary.json"}));
    EXPECT_TRUE(QuorvexTest::fileExists(scratch + "/state/report/index.html"));
    EXPECT_EQ(QuorvexTest::listFolder(scratch + "/metrics"),
              std::vector<std::string>{"quorvex-survey.prom"});
    EXPECT_EQ(QuorvexTest::listFolder(scratch + "/Trace").size(), 2U);
}

} // namespace
