// Builds the Debian package with cpack in the build tree, checks its control
// fields, file list and maintainer scripts, unpacks it with dpkg -x into a
// scratch root inside the build tree (nothing is installed on the host) and
// surveys the shipped demo machine with the unpacked tool inside the sandbox.
// Then installs, upgrades, removes and purges it with dpkg in another
// scratch root (dpkg --root, its maintainer scripts run outside a chroot with
// DPKG_ROOT set, so that they touch that root alone), to see the scheduled
// survey's units put in place and the timer left disabled.
//
// One test does it all: cpack first brings the whole build tree up to date,
// and two of them at once in one tree could build the same target twice.

#include "EndToEndScenario.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <filesystem>
#include <iterator>
#include <map>
#include <sstream>
#include <string>
#include <vector>

namespace {

namespace fs = std::filesystem;

constexpr char gc_Tool[] = "quorvexPYLON_VPD_Survey_ClientPartition";
// The console-wide survey that the package carries beside the tool.
constexpr char gc_FleetProgram[] = "quorvex-survey";
constexpr char gc_PackageName[] = "quorvex-pylon-vpd-survey";
// The scheduled survey (docs/schedule.md).
constexpr char gc_UnitFolder[] = "/lib/systemd/system/";
constexpr char gc_ServiceUnit[] = "quorvex-survey.service";
constexpr char gc_TimerUnit[] = "quorvex-survey.timer";
constexpr char gc_DefaultFile[] = "/etc/default/quorvex-survey";
// Where the timer's enablement link goes, and deb-systemd-helper's record of it.
constexpr char gc_TimerLink[] = "/etc/systemd/system/timers.target.wants/quorvex-survey.timer";
constexpr char gc_TimerState[] =
    "/var/lib/systemd/deb-systemd-helper-enabled/quorvex-survey.timer.dsh-also";

std::string u_trim_LineEnd(std::string text) {
    while (!text.empty() && text.back() == '\n') {
        text.pop_back();
    }
    return text;
}

std::string u_architecture() {
    return u_trim_LineEnd(QuorvexTest::runCommand({"dpkg", "--print-architecture"}).stdoutText);
}

std::string u_package_FileName() {
    return std::string(gc_PackageName) + "_" + QUORVEX_PACKAGE_VERSION + "_" + u_architecture() +
           ".deb";
}

// The entries of the package, path to mode, from "dpkg-deb --contents":
// the mode is the first field of a line and the path the last.
std::map<std::string, std::string> u_package_Contents(std::string const& package) {
    QuorvexTest::CommandResult const listing =
        QuorvexTest::runCommand({"dpkg-deb", "--contents", package});
    EXPECT_EQ(listing.exitStatus, 0) << listing.stderrText;
    std::map<std::string, std::string> entries;
    std::istringstream lines(listing.stdoutText);
    std::string line;
    while (std::getline(lines, line)) {
        std::istringstream fields(line);
        std::string mode;
        std::string path;
        fields >> mode;
        for (std::string field; fields >> field;) {
            path = field;
        }
        entries[path] = mode;
    }
    return entries;
}

std::vector<std::string> u_paths(std::map<std::string, std::string> const& entries) {
    std::vector<std::string> paths;
    paths.reserve(entries.size());
    std::transform(entries.begin(), entries.end(), std::back_inserter(paths),
                   [](auto const& entry) { return entry.first; });
    return paths;
}

// The tool is executable by all, the manual page readable by all, and the
// result folders open to all; the modes of the folders above them follow the
// umask of whoever builds the package, and dpkg leaves existing ones alone.
void u_expect_Contents(std::string const& package) {
    std::string const tool = std::string("./usr/bin/") + gc_Tool;
    std::string const manualPage = std::string("./usr/share/man/man8/") + gc_Tool + ".8";
    std::string const program = std::string("./usr/bin/") + gc_FleetProgram;
    std::string const programPage = std::string("./usr/share/man/man8/") + gc_FleetProgram + ".8";
    std::map<std::string, std::string> const entries = u_package_Contents(package);
    std::vector<std::string> const expected{
        "./etc/",
        "./etc/default/",
        std::string(".") + gc_DefaultFile,
        "./lib/",
        "./lib/systemd/",
        "./lib/systemd/system/",
        std::string(".") + gc_UnitFolder + gc_ServiceUnit,
        std::string(".") + gc_UnitFolder + gc_TimerUnit,
        "./usr/",
        "./usr/bin/",
        program,
        tool,
        "./usr/share/",
        "./usr/share/man/",
        "./usr/share/man/man8/",
        programPage,
        "./usr/share/man/man8/quorvex-survey.service.8",
        "./usr/share/man/man8/quorvex-survey.timer.8",
        manualPage,
        "./var/",
        "./var/adm/",
        "./var/adm/quorvex/",
        "./var/adm/quorvex/Trace/",
        "./var/adm/quorvex/VPD/",
        "./var/lib/",
        "./var/lib/prometheus/",
        "./var/lib/prometheus/node-exporter/",
    };
    ASSERT_EQ(u_paths(entries), expected);
    EXPECT_EQ(entries.at(tool), "-rwxr-xr-x");
    EXPECT_EQ(entries.at(manualPage), "-rw-r--r--");
    EXPECT_EQ(entries.at(program), "-rwxr-xr-x");
    EXPECT_EQ(entries.at(programPage), "-rw-r--r--");
    EXPECT_EQ(entries.at("./var/adm/quorvex/Trace/"), "drwxr-xr-x");
    EXPECT_EQ(entries.at("./var/adm/quorvex/VPD/"), "drwxr-xr-x");
    EXPECT_EQ(entries.at("./var/lib/prometheus/node-exporter/"), "drwxr-xr-x");
    EXPECT_EQ(entries.at(std::string(".") + gc_DefaultFile), "-rw-r--r--");
    EXPECT_EQ(entries.at(std::string(".") + gc_UnitFolder + gc_ServiceUnit), "-rw-r--r--");
    EXPECT_EQ(entries.at(std::string(".") + gc_UnitFolder + gc_TimerUnit), "-rw-r--r--");
}

// The maintainer scripts and the conffile list, byte for byte as in
// packaging/debian, the scripts executable.
void u_expect_MaintainerScripts(std::string const& package, std::string const& scratch) {
    std::string const control = scratch + "/control";
    QuorvexTest::CommandResult const extract =
        QuorvexTest::runCommand({"dpkg-deb", "--control", package, control});
    ASSERT_EQ(extract.exitStatus, 0) << extract.stderrText;
    EXPECT_EQ(QuorvexTest::listFolder(control),
              (std::vector<std::string>{"conffiles", "control", "md5sums", "postinst", "postrm",
                                        "prerm"}));
    for (char const* name : {"conffiles", "postinst", "prerm", "postrm"}) {
        EXPECT_EQ(QuorvexTest::readFile(control + "/" + name),
                  QuorvexTest::readFile(std::string(QUORVEX_PACKAGING_SOURCE) + "/debian/" + name))
            << name;
    }
    EXPECT_EQ(QuorvexTest::readFile(control + "/conffiles"), std::string(gc_DefaultFile) + "\n");
    for (char const* script : {"postinst", "prerm", "postrm"}) {
        EXPECT_EQ(fs::status(control + "/" + script).permissions(),
                  fs::perms::owner_all | fs::perms::group_read | fs::perms::group_exec |
                      fs::perms::others_read | fs::perms::others_exec)
            << script;
    }
}

// The units and the options as shipped; the service names the program where
// the package puts it.
void u_expect_ScheduledSurvey(std::string const& root) {
    std::string service = QuorvexTest::readFile(std::string(QUORVEX_PACKAGING_SOURCE) +
                                                "/systemd/quorvex-survey.service.in");
    std::string const placeholder = "@QUORVEX_SURVEY_PROGRAM@";
    service.replace(service.find(placeholder), placeholder.size(),
                    std::string("/usr/bin/") + gc_FleetProgram);
    EXPECT_EQ(QuorvexTest::readFile(root + gc_UnitFolder + gc_ServiceUnit), service);
    EXPECT_EQ(
        QuorvexTest::readFile(root + gc_UnitFolder + gc_TimerUnit),
        QuorvexTest::readFile(std::string(QUORVEX_PACKAGING_SOURCE) + "/systemd/" + gc_TimerUnit));
    EXPECT_EQ(
        QuorvexTest::readFile(root + gc_DefaultFile),
        QuorvexTest::readFile(std::string(QUORVEX_PACKAGING_SOURCE) + "/default/quorvex-survey"));
}

std::string u_control_Field(std::string const& package, std::string const& field) {
    return u_trim_LineEnd(
        QuorvexTest::runCommand({"dpkg-deb", "--field", package, field}).stdoutText);
}

void u_expect_Control(std::string const& package) {
    EXPECT_EQ(u_control_Field(package, "Package"), gc_PackageName);
    EXPECT_EQ(u_control_Field(package, "Version"), QUORVEX_PACKAGE_VERSION);
    EXPECT_EQ(u_control_Field(package, "Section"), "admin");
    EXPECT_EQ(u_control_Field(package, "Architecture"), u_architecture());
    EXPECT_NE(u_control_Field(package, "Maintainer"), "");
    EXPECT_NE(u_control_Field(package, "Description"), "");
    std::string const depends = u_control_Field(package, "Depends");
    EXPECT_NE(depends.find("libc6"), std::string::npos) << depends;
    EXPECT_NE(depends.find("libstdc++6"), std::string::npos) << depends;
}

void u_expect_Unpacked(std::string const& root) {
    fs::file_status const tool = fs::status(root + "/usr/bin/" + gc_Tool);
    EXPECT_TRUE(fs::is_regular_file(tool));
    EXPECT_NE(tool.permissions() & fs::perms::owner_exec, fs::perms::none);
    std::string const manualPage = root + "/usr/share/man/man8/" + gc_Tool + ".8";
    ASSERT_TRUE(QuorvexTest::fileExists(manualPage));
    EXPECT_EQ(QuorvexTest::readFile(manualPage), QuorvexTest::readFile(QUORVEX_MANUAL_PAGE));
    std::string const programPage = root + "/usr/share/man/man8/" + gc_FleetProgram + ".8";
    ASSERT_TRUE(QuorvexTest::fileExists(programPage));
    EXPECT_EQ(QuorvexTest::readFile(programPage), QuorvexTest::readFile(QUORVEX_FLEET_MANUAL_PAGE));
    QuorvexTest::CommandResult const version =
        QuorvexTest::runCommand({root + "/usr/bin/" + gc_FleetProgram, "--version"});
    EXPECT_EQ(version.exitStatus, 0);
    EXPECT_EQ(version.stdoutText,
              std::string(gc_FleetProgram) + " " + QUORVEX_PACKAGE_VERSION + "\n");
    for (char const* folder : {QuorvexTest::gc_VPD_Folder, QuorvexTest::gc_TraceFolder}) {
        EXPECT_TRUE(fs::is_directory(root + folder)) << folder;
        EXPECT_EQ(QuorvexTest::listFolder(root + folder), std::vector<std::string>{}) << folder;
    }
}

// dpkg acting on the scratch root alone: its database and log there, the
// maintainer scripts run outside a chroot with DPKG_ROOT set; the package's
// run-time libraries are not in that root. Without root, dpkg is told to go
// on all the same: the files then belong to the caller.
QuorvexTest::CommandResult u_dpkg(std::string const& root, std::vector<std::string> arguments) {
    std::vector<std::string> command{"dpkg",
                                     "--root=" + root,
                                     "--log=" + root + "/dpkg.log",
                                     "--force-script-chrootless",
                                     "--force-depends",
                                     "--force-not-root"};
    command.insert(command.end(), arguments.begin(), arguments.end());
    return QuorvexTest::runCommand(command);
}

bool u_exists(std::string const& path) {
    return fs::exists(fs::symlink_status(path));
}

// A root with an empty dpkg database.
std::string u_dpkgRoot(std::string const& scratch) {
    std::string root = scratch + "/dpkg-root";
    fs::create_directories(root + "/var/lib/dpkg/info");
    fs::create_directories(root + "/var/lib/dpkg/updates");
    QuorvexTest::writeFile(root + "/var/lib/dpkg/status", "");
    return root;
}

// Installed: the units and options in place, the timer not enabled, and
// deb-systemd-helper knowing the link that enabling it makes, for purge.
void u_expect_InstalledDisabled(std::string const& root) {
    EXPECT_TRUE(QuorvexTest::fileExists(root + gc_UnitFolder + gc_ServiceUnit));
    EXPECT_TRUE(QuorvexTest::fileExists(root + gc_UnitFolder + gc_TimerUnit));
    EXPECT_TRUE(QuorvexTest::fileExists(root + gc_DefaultFile));
    EXPECT_FALSE(u_exists(root + gc_TimerLink));
    ASSERT_TRUE(QuorvexTest::fileExists(root + gc_TimerState));
    EXPECT_EQ(QuorvexTest::readFile(root + gc_TimerState), std::string(gc_TimerLink) + "\n");
}

// An administrator's enablement and changed options outlive an upgrade and
// a removal; purge takes both away with the package's files.
void u_expect_InstallUpgradeRemovePurge(std::string const& package, std::string const& root) {
    ASSERT_EQ(u_dpkg(root, {"--install", package}).exitStatus, 0);
    u_expect_InstalledDisabled(root);
    QuorvexTest::CommandResult const enable = QuorvexTest::runCommand(
        {"systemctl", "--root=" + root, "enable", std::string(gc_TimerUnit)});
    ASSERT_EQ(enable.exitStatus, 0) << enable.stderrText;
    ASSERT_TRUE(u_exists(root + gc_TimerLink));
    std::string const changed = QuorvexTest::readFile(root + gc_DefaultFile) + "# changed\n";
    QuorvexTest::writeFile(root + gc_DefaultFile, changed);

    ASSERT_EQ(u_dpkg(root, {"--install", package}).exitStatus, 0);
    EXPECT_TRUE(u_exists(root + gc_TimerLink));
    EXPECT_EQ(QuorvexTest::readFile(root + gc_DefaultFile), changed);

    ASSERT_EQ(u_dpkg(root, {"--remove", gc_PackageName}).exitStatus, 0);
    EXPECT_FALSE(u_exists(root + gc_UnitFolder + gc_ServiceUnit));
    EXPECT_FALSE(u_exists(root + gc_UnitFolder + gc_TimerUnit));
    EXPECT_EQ(QuorvexTest::readFile(root + gc_DefaultFile), changed);
    EXPECT_TRUE(u_exists(root + gc_TimerLink));

    ASSERT_EQ(u_dpkg(root, {"--purge", gc_PackageName}).exitStatus, 0);
    EXPECT_FALSE(u_exists(root + gc_DefaultFile));
    EXPECT_FALSE(u_exists(root + gc_TimerLink));
    EXPECT_FALSE(u_exists(root + gc_TimerState));
}

TEST(SurveyPackage,
     DebianPackageCarriesProgramsPagesFoldersAndDisabledScheduleAndItsToolSurveysTheDemo) {
    std::string const scratch = QUORVEX_PACKAGE_SCRATCH;
    std::error_code ignored;
    fs::remove_all(scratch, ignored);
    QuorvexTest::CommandResult const build = QuorvexTest::runCommand(
        {QUORVEX_CPACK_COMMAND, "-G", "DEB", "--config", QUORVEX_CPACK_CONFIG, "-B", scratch});
    ASSERT_EQ(build.exitStatus, 0) << build.stdoutText << build.stderrText;
    std::string const package = scratch + "/" + u_package_FileName();
    ASSERT_TRUE(QuorvexTest::fileExists(package)) << build.stdoutText;

    u_expect_Control(package);
    u_expect_Contents(package);
    u_expect_MaintainerScripts(package, scratch);

    std::string const root = scratch + "/root";
    QuorvexTest::CommandResult const unpack =
        QuorvexTest::runCommand({"dpkg", "-x", package, root});
    ASSERT_EQ(unpack.exitStatus, 0) << unpack.stderrText;
    u_expect_Unpacked(root);
    u_expect_ScheduledSurvey(root);
    u_expect_InstallUpgradeRemovePurge(package, u_dpkgRoot(scratch));

    EndToEndScenario demo("shipped-demo");
    QuorvexTest::CommandResult const run = demo.run({root + "/usr/bin/" + gc_Tool});
    if (run.exitStatus == QuorvexTest::gc_SandboxUnavailable) {
        GTEST_SKIP() << run.stderrText;
    }
    demo.expectExpectedOutcome(run);
}

} // namespace
