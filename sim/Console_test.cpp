// The simulated console as the survey tool meets it: the three tools at their
// fixed paths inside the sandbox, answering from a scenario.

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <sstream>
#include <string>
#include <unistd.h>

using QuorvexTest::CommandResult;
using QuorvexTest::Invocation;
using QuorvexTest::runCommand;
using QuorvexTest::runShell;
using QuorvexTest::SimulatedConsole;

namespace {

constexpr char gc_Lsvtc[] = "/opt/lsvtc/bin/lsvtc";
constexpr char gc_Lspartition[] = "/opt/vtc/bin/lspartition";
constexpr char gc_Runact[] = "/usr/bin/runact-api";
constexpr int gc_ExitBadScenario = 97;

// The remote action command line of a survey's client run on partition 2, as
// the survey tool hands it to the shell.
constexpr char gc_RunCommandLine[] =
    "/usr/bin/runact-api -c "
    "ZOR.ServiceEvent::::runCmdOnPartition::CallerID::0::CecMT::\"1234-ABC\"::"
    "CecMS::\"10ABCDE\"::PartitionId::\"2\"::CmdID::0::CmdOpts::\" -v  -of "
    "1234-ABC_10ABCDE-2.VPD.xml -c "
    "1234-ABC_10ABCDE -pylonv "
    "4.0.11\"::RemoteFN::\"1234-ABC_10ABCDE-2.QuorvexOutput\"::RemoteFileInfo::"
    "\"FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=system\"";

// The same after the shell removed the double quotes: one argument.
constexpr char gc_RunCommandArgument[] = "ZOR.ServiceEvent::::runCmdOnPartition::CallerID::0::"
                                         "CecMT::1234-ABC::CecMS::10ABCDE::PartitionId::2::"
                                         "CmdID::0::CmdOpts:: -v  -of 1234-ABC_10ABCDE-2.VPD.xml "
                                         "-c 1234-ABC_10ABCDE -pylonv 4.0.11::RemoteFN::"
                                         "1234-ABC_10ABCDE-2.QuorvexOutput::RemoteFileInfo::FILE_"
                                         "PERM=660;FILE_OWNER=quorvex;FILE_GROUP=system";

// The get-file command line of a survey for partition 3.
std::string _getFileLine(std::string const& partition, std::string const& localFN) {
    return std::string(gc_Runact) +
           " -c "
           "ZOR.ServiceEvent::::getFileFromPartition::CallerID::0::CecMT::\"1234-ABC\"::CecMS::"
           "\"10ABCDE\"::"
           "PartitionId::\"" +
           partition + "\"::RemoteFN::\"1234-ABC_10ABCDE-" + partition + ".VPD.xml\"::LocalFN::\"" +
           localFN + R"("::LocalFileInfo::"FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=pylon")";
}

std::string _remoteAction(std::string const& action, std::string const& partition) {
    return "ZOR.ServiceEvent::::" + action +
           "::CallerID::0::CecMT::1234-ABC::CecMS::10ABCDE::PartitionId::" + partition;
}

void _expectAnswer(CommandResult const& result, std::string const& out, std::string const& err,
                   int status) {
    EXPECT_EQ(out, result.stdoutText);
    EXPECT_EQ(err, result.stderrText);
    EXPECT_EQ(status, result.exitStatus);
}

double _secondsToRun(std::vector<std::string> const& argv) {
    auto const start = std::chrono::steady_clock::now();
    runCommand(argv);
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

std::string const& _document() {
    static std::string const document =
        "<?xml version=\"1.0\" encoding=\"UTF-8\"?><com.zor.inventory version=\"1.0\">\n"
        "   <ResourceSet class=\"com.zor.inventory.Hardware\" timestamp=\"1700000000000\" "
        "type=\"Hardware\" "
        "version=\"1.0\">\n"
        "   </ResourceSet>\n"
        "</com.zor.inventory>";
    return document;
}

} // namespace

TEST(SimulatedConsole, LsvtcPrintsItsLinesStderrAndExitCode) {
    SimulatedConsole console(
        "[lsvtc]\nstdout 0:1234-ABC_10ABCDE;0:5678-DEF_65XYZ12;2:4321-XYZ_10QRSTU;\n"
        "stderr lsvtc: warning\nexit 4\n");
    _expectAnswer(runCommand({gc_Lsvtc, "-t0"}),
                  "0:1234-ABC_10ABCDE;0:5678-DEF_65XYZ12;2:4321-XYZ_10QRSTU;\n", "lsvtc: warning\n",
                  4);
}

TEST(SimulatedConsole, LastLineWithoutLineFeed) {
    SimulatedConsole console("[lsvtc]\nstdout first\nstdout-nolf 0:A_B;\n");
    _expectAnswer(runCommand({gc_Lsvtc, "-t0"}), "first\n0:A_B;", "", 0);
}

TEST(SimulatedConsole, ToolWithoutStdoutPrintsNothingAtAll) {
    SimulatedConsole console("[lsvtc]\nexit 1\n");
    _expectAnswer(runCommand({gc_Lsvtc, "-t0"}), "", "", 1);
}

TEST(SimulatedConsole, MalformedListingLinesArePrintedAsWritten) {
    SimulatedConsole console("[lspartition *]\nstdout ;;,,;abc:1,\"x\";  \n");
    EXPECT_EQ(";;,,;abc:1,\"x\";  \n", runCommand({gc_Lspartition, "-ix", "-c", "A_B"}).stdoutText);
}

TEST(SimulatedConsole, LspartitionAnswersPerIdentity) {
    SimulatedConsole console(
        "[lspartition 1234-ABC_10ABCDE]\nstdout 1,10.1.1.11,1,host1,Zeph,5.3;\n"
        "[lspartition 5678-DEF_65XYZ12]\nstdout 2,10.1.1.12,0,host2,Linux,2.6;\n"
        "stderr two\nexit 2\n");
    _expectAnswer(runCommand({gc_Lspartition, "-ix", "-c", "1234-ABC_10ABCDE"}),
                  "1,10.1.1.11,1,host1,Zeph,5.3;\n", "", 0);
    _expectAnswer(runCommand({gc_Lspartition, "-ix", "-c", "5678-DEF_65XYZ12"}),
                  "2,10.1.1.12,0,host2,Linux,2.6;\n", "two\n", 2);
}

TEST(SimulatedConsole, LspartitionFallsBackToTheDefaultSection) {
    SimulatedConsole console(
        "[lspartition 1234-ABC_10ABCDE]\nstdout known\n"
        "[lspartition *]\nstderr lspartition: managed system not found\nexit 1\n");
    _expectAnswer(runCommand({gc_Lspartition, "-ix", "-c", "9999-XXX_0000000"}), "",
                  "lspartition: managed system not found\n", 1);
    _expectAnswer(runCommand({gc_Lspartition, "-ix"}), "",
                  "lspartition: managed system not found\n", 1);
}

TEST(SimulatedConsole, UndescribedIdentityWithoutDefaultPrintsNothing) {
    SimulatedConsole console("[lspartition 1234-ABC_10ABCDE]\nstdout known\nexit 3\n");
    _expectAnswer(runCommand({gc_Lspartition, "-ix", "-c", "5678-DEF_65XYZ12"}), "", "", 0);
}

TEST(SimulatedConsole, EachActionAnswersPerPartition) {
    SimulatedConsole console(
        "[runCmdOnPartition 2]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
        "[runCmdOnPartition 3]\nstdout Rc::1::RcCmd::0::RetStr1::timeout::RetStr2::\nexit 1\n"
        "[getFileFromPartition 2]\nstdout Rc::4::RcCmd::0::RetStr1::no file::RetStr2::\n"
        "stderr get failed\nexit 5\n"
        "[putFileToPartition 2]\nstdout Rc::0::RcCmd::0::RetStr1::put::RetStr2::\n");
    _expectAnswer(runCommand({gc_Runact, "-c", _remoteAction("runCmdOnPartition", "2")}),
                  "Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n", "", 0);
    _expectAnswer(runCommand({gc_Runact, "-c", _remoteAction("runCmdOnPartition", "3")}),
                  "Rc::1::RcCmd::0::RetStr1::timeout::RetStr2::\n", "", 1);
    _expectAnswer(runCommand({gc_Runact, "-c", _remoteAction("getFileFromPartition", "2")}),
                  "Rc::4::RcCmd::0::RetStr1::no file::RetStr2::\n", "get failed\n", 5);
    _expectAnswer(
        runCommand({gc_Runact, "-c",
                    "ZOR.ServiceEvent::::putFileToPartition::CallerID::0::CecMT::1234-ABC::CecMS::"
                    "10ABCDE::PartitionArray::{2}::LocalFN::/tmp/quorvex.tar"}),
        "Rc::0::RcCmd::0::RetStr1::put::RetStr2::\n", "", 0);
}

TEST(SimulatedConsole, ActionFallsBackToItsDefaultSection) {
    SimulatedConsole console(
        "[runCmdOnPartition *]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
        "[runCmdOnPartition 4]\nstdout Rc::0::RcCmd::5::RetStr1::failed::RetStr2::\n");
    EXPECT_EQ("Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n",
              runCommand({gc_Runact, "-c", _remoteAction("runCmdOnPartition", "9")}).stdoutText);
    EXPECT_EQ("Rc::0::RcCmd::5::RetStr1::failed::RetStr2::\n",
              runCommand({gc_Runact, "-c", _remoteAction("runCmdOnPartition", "4")}).stdoutText);
    _expectAnswer(runCommand({gc_Runact, "-c", _remoteAction("getFileFromPartition", "9")}), "", "",
                  0);
}

TEST(SimulatedConsole, ActionWithoutAnyOutputLine) {
    SimulatedConsole console("[runCmdOnPartition 2]\nexit 1\n");
    _expectAnswer(runShell(gc_RunCommandLine), "", "", 1);
}

TEST(SimulatedConsole, MalformedReturnCodeLinesArePrintedAsWritten) {
    SimulatedConsole console("[runCmdOnPartition *]\nstdout Rc\nstdout\nstdout x::1::Rc::5::x::2\n"
                             "stdout-nolf ::\n");
    EXPECT_EQ("Rc\n\nx::1::Rc::5::x::2\n::", runShell(gc_RunCommandLine).stdoutText);
}

TEST(SimulatedConsole, OutputFromFileKeepsEveryByte) {
    SimulatedConsole console("[lspartition *]\nstdout-file listing.bin\n");
    std::string const bytes =
        std::string(200000, 'x') + std::string("\0;\r\n\xff", 5) + "no line feed";
    QuorvexTest::writeFile(console.directory() + "/listing.bin", bytes);
    EXPECT_EQ(bytes, runCommand({gc_Lspartition, "-ix", "-c", "A_B"}).stdoutText);
}

TEST(SimulatedConsole, WithoutScenarioEveryToolPrintsNothing) {
    SimulatedConsole console("");
    ::unsetenv("PYLON_SIM_SCENARIO");
    _expectAnswer(runCommand({gc_Lsvtc, "-t0"}), "", "", 0);
    _expectAnswer(runCommand({gc_Lspartition, "-ix", "-c", "A_B"}), "", "", 0);
    _expectAnswer(runShell(gc_RunCommandLine), "", "", 0);
}

TEST(SimulatedConsole, GetFilePlacesTheDocumentUnderTheQuorvexFolder) {
    SimulatedConsole console(
        "[getFileFromPartition 3]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
        "document-file p3.xml\n");
    QuorvexTest::writeFile(console.directory() + "/p3.xml", _document());
    std::string const localFN =
        "VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE-3.VPD.xml";
    _expectAnswer(runShell(_getFileLine("3", localFN)),
                  "Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n", "", 0);
    EXPECT_EQ(_document(), QuorvexTest::readFile("/var/adm/quorvex/" + localFN));
}

TEST(SimulatedConsole, GetFileReplacesAnEarlierDocument) {
    SimulatedConsole console("[getFileFromPartition 3]\ndocument <<END\nnew\nEND\n");
    QuorvexTest::writeFile("/var/adm/quorvex/VPD/p3.xml", std::string(5000, 'o'));
    runShell(_getFileLine("3", "VPD/p3.xml"));
    EXPECT_EQ("new\n", QuorvexTest::readFile("/var/adm/quorvex/VPD/p3.xml"));
}

TEST(SimulatedConsole, GetFileWithoutDocumentPlacesNothing) {
    SimulatedConsole console(
        "[getFileFromPartition 3]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n");
    runShell(_getFileLine("3", "VPD/p3.xml"));
    EXPECT_FALSE(QuorvexTest::fileExists("/var/adm/quorvex/VPD/p3.xml"));
}

TEST(SimulatedConsole, GetFilePlacesTheDocumentEvenWhenItReportsFailure) {
    SimulatedConsole console(
        "[getFileFromPartition 3]\nstdout Rc::4\nexit 1\ndocument-nolf half\n");
    _expectAnswer(runShell(_getFileLine("3", "VPD/p3.xml")), "Rc::4\n", "", 1);
    EXPECT_EQ("half", QuorvexTest::readFile("/var/adm/quorvex/VPD/p3.xml"));
}

TEST(SimulatedConsole, GetFileIntoAMissingFolderSaysSoOnStderr) {
    SimulatedConsole console(
        "[getFileFromPartition 3]\nstdout Rc::0\nstderr console text\ndocument x\n");
    CommandResult const result = QuorvexTest::runInSandbox(
        {"--no-vpd-dir"}, {"/bin/sh", "-c", _getFileLine("3", "VPD/p3.xml")});
    _expectAnswer(result, "Rc::0\n",
                  "runact-api: cannot write /var/adm/quorvex/VPD/p3.xml\nconsole text\n", 0);
}

TEST(SimulatedConsole, GetFileIntoAReadOnlyFolderSaysSoOnStderr) {
    SimulatedConsole console("[getFileFromPartition 3]\nstdout Rc::0\ndocument x\n");
    CommandResult const result = QuorvexTest::runInSandbox(
        {"--readonly-vpd"}, {"/bin/sh", "-c", _getFileLine("3", "VPD/p3.xml")});
    _expectAnswer(result, "Rc::0\n", "runact-api: cannot write /var/adm/quorvex/VPD/p3.xml\n", 0);
}

TEST(SimulatedConsole, GetFileWithoutLocalFileNameSaysSoOnStderr) {
    SimulatedConsole console("[getFileFromPartition *]\nstdout Rc::0\ndocument x\n");
    _expectAnswer(runCommand({gc_Runact, "-c", _remoteAction("getFileFromPartition", "3")}),
                  "Rc::0\n", "runact-api: no LocalFN given, no document placed\n", 0);
}

TEST(SimulatedConsole, UnknownActionAnswersWithRcThree) {
    SimulatedConsole console("[runCmdOnPartition *]\nstdout ok\n");
    _expectAnswer(runCommand({gc_Runact, "-c", _remoteAction("rebootPartition", "2")}),
                  "Rc::3::RcCmd::0::RetStr1::unknown action::RetStr2::\n",
                  "runact-api: unknown action \"rebootPartition\"\n", 3);
}

TEST(SimulatedConsole, MissingActionAnswersLikeAnUnknownOne) {
    SimulatedConsole console("");
    std::string const answer = "Rc::3::RcCmd::0::RetStr1::unknown action::RetStr2::\n";
    _expectAnswer(runCommand({gc_Runact}), answer, "runact-api: unknown action \"\"\n", 3);
    _expectAnswer(runCommand({gc_Runact, "-c", "ZOR.ServiceEvent::::"}), answer,
                  "runact-api: unknown action \"\"\n", 3);
    _expectAnswer(runCommand({gc_Runact, "-c", "runCmdOnPartition::PartitionId::2"}), answer,
                  "runact-api: unknown action \"\"\n", 3);
}

TEST(SimulatedConsole, LogsTheExactArgumentsOfEveryCall) {
    SimulatedConsole console("");
    runShell("/opt/lsvtc/bin/lsvtc -t0");
    runShell("/opt/vtc/bin/lspartition -ix -c 1234-ABC_10ABCDE");
    runShell(gc_RunCommandLine);
    EXPECT_EQ("lsvtc\t-t0\n"
              "lspartition\t-ix\t-c\t1234-ABC_10ABCDE\n"
              "runact-api\t-c\t" +
                  std::string(gc_RunCommandArgument) + "\n",
              console.logText());
    std::vector<Invocation> const expected{{"lsvtc", "-t0"},
                                           {"lspartition", "-ix", "-c", "1234-ABC_10ABCDE"},
                                           {"runact-api", "-c", gc_RunCommandArgument}};
    EXPECT_EQ(expected, console.invocations());
}

TEST(SimulatedConsole, LogEscapesBackslashTabAndLineFeed) {
    SimulatedConsole console("");
    runCommand({gc_Lsvtc, "a\\b", "c\td", "e\nf", ""});
    EXPECT_EQ("lsvtc\ta\\\\b\tc\\td\te\\nf\t\n", console.logText());
    std::vector<Invocation> const expected{{"lsvtc", "a\\b", "c\td", "e\nf", ""}};
    EXPECT_EQ(expected, console.invocations());
}

TEST(SimulatedConsole, NothingIsLoggedWithoutLogVariable) {
    SimulatedConsole console("[lsvtc]\nstdout x\n");
    ::unsetenv("PYLON_SIM_LOG");
    EXPECT_EQ("x\n", runCommand({gc_Lsvtc, "-t0"}).stdoutText);
    EXPECT_FALSE(QuorvexTest::fileExists(console.logPath()));
}

TEST(SimulatedConsole, UnwritableLogIsReportedAndTheToolStillAnswers) {
    SimulatedConsole console("[lsvtc]\nstdout x\n");
    ::setenv("PYLON_SIM_LOG", "/nonexistent/folder/calls.log", 1);
    _expectAnswer(runCommand({gc_Lsvtc, "-t0"}), "x\n",
                  "pylon-sim: cannot append to the invocation log /nonexistent/folder/calls.log\n",
                  0);
}

TEST(SimulatedConsole, CopesWithOddShellWords) {
    SimulatedConsole console(
        "[runCmdOnPartition 2]\nstdout two\n[getFileFromPartition 3]\nstdout three\n"
        "document-nolf doc\n");
    // Unquoted blanks split the text into several words; quotes inside
    // values and "::" inside values reach the tool as they come.
    EXPECT_EQ("two\n",
              runShell("/usr/bin/runact-api -c ZOR.ServiceEvent::::runCmdOnPartition::CallerID::0::"
                       "PartitionId::2::CmdOpts:: -v  -of x y::RemoteFN::a'\"'b")
                  .stdoutText);
    EXPECT_EQ(
        "three\n",
        runShell("/usr/bin/runact-api -c ZOR.ServiceEvent::::getFileFromPartition::PartitionId::"
                 "\"3\"::LocalFN::\"VPD/a b\"::x::y::LocalFileInfo::\"::\"")
            .stdoutText);
    EXPECT_EQ("doc", QuorvexTest::readFile("/var/adm/quorvex/VPD/a b"));
    std::vector<Invocation> const invocations = console.invocations();
    ASSERT_EQ(2u, invocations.size());
    Invocation const split{
        "runact-api",
        "-c",
        "ZOR.ServiceEvent::::runCmdOnPartition::CallerID::0::PartitionId::2::CmdOpts::",
        "-v",
        "-of",
        "x",
        "y::RemoteFN::a\"b"};
    EXPECT_EQ(split, invocations[0]);
}

TEST(SimulatedConsole, HonoursTheDelayOfASection) {
    SimulatedConsole console("[lsvtc]\ndelay 0.4\n[lspartition *]\n");
    double const slow = _secondsToRun({gc_Lsvtc, "-t0"});
    EXPECT_GE(slow, 0.4);
    EXPECT_LT(slow, 3.0);
    EXPECT_LT(_secondsToRun({gc_Lspartition, "-ix", "-c", "A_B"}), 0.4);
}

TEST(SimulatedConsole, DefaultDelayAppliesWhereASectionSetsNone) {
    SimulatedConsole console("delay 0.3\n[lsvtc]\n[runCmdOnPartition *]\ndelay 0\n");
    double const slow = _secondsToRun({gc_Lsvtc, "-t0"});
    EXPECT_GE(slow, 0.3);
    EXPECT_LT(slow, 3.0);
    double const remote = _secondsToRun({gc_Runact, "-c", "ZOR.ServiceEvent::::unknown"});
    EXPECT_GE(remote, 0.3);
    EXPECT_LT(_secondsToRun({gc_Runact, "-c", _remoteAction("runCmdOnPartition", "1")}), 0.3);
}

TEST(SimulatedConsole, ChildDelayLeavesAProcessRunningAfterTheAnswer) {
    SimulatedConsole console("[lsvtc]\nstdout 0:A_B;\nchild-delay 30\n");
    // An argument of its own makes the left process's command line unique.
    std::string const commandLine =
        std::string(gc_Lsvtc) + " -t0 left-child-" + std::to_string(::getpid());
    CommandResult const found =
        runShell(commandLine + " > /dev/null; echo $?; pgrep -f -x '" + commandLine + "'");
    std::size_t const statusEnd = found.stdoutText.find('\n');
    ASSERT_NE(std::string::npos, statusEnd) << found.stderrText;
    EXPECT_EQ("0", found.stdoutText.substr(0, statusEnd)) << "the tool's own exit status";
    std::string const left = found.stdoutText.substr(statusEnd + 1);
    ASSERT_FALSE(left.empty()) << "no process left behind by the tool";
    EXPECT_EQ(1, std::count(left.begin(), left.end(), '\n')) << "processes left: " << left;
    EXPECT_EQ(0, ::kill(std::stoi(left), SIGKILL));
}

TEST(SimulatedConsole, DaemonDelayLeavesAProcessInASessionOfItsOwn) {
    SimulatedConsole console("[lsvtc]\nstdout 0:A_B;\ndaemon-delay 30\n");
    std::string const commandLine =
        std::string(gc_Lsvtc) + " -t0 left-daemon-" + std::to_string(::getpid());
    CommandResult const found = runShell(commandLine + " > /dev/null; echo $?; pgrep -f -x '" +
                                         commandLine + "' | xargs -r ps -o pid=,sid= -p");
    std::size_t const statusEnd = found.stdoutText.find('\n');
    ASSERT_NE(std::string::npos, statusEnd) << found.stderrText;
    EXPECT_EQ("0", found.stdoutText.substr(0, statusEnd)) << "the tool's own exit status";
    std::istringstream left(found.stdoutText.substr(statusEnd + 1));
    pid_t pid = 0;
    pid_t session = 0;
    ASSERT_TRUE(left >> pid >> session) << "no daemon left behind: " << found.stdoutText;
    EXPECT_NE(::getsid(0), session) << "the daemon is in a session of its own";
    EXPECT_FALSE(left >> pid) << "one daemon only: " << found.stdoutText;
    EXPECT_EQ(0, ::kill(pid, SIGKILL));
}

// Starts lsvtc in the background, waits (up to ten seconds) until it has
// stopped itself, then runs the shell commands given with $! its PID, and
// kills it.
CommandResult _onceStopped(std::string const& commands) {
    return runShell(std::string(gc_Lsvtc) +
                    " -t0 > /dev/null & for i in $(seq 1000); do"
                    " case $(cut -d' ' -f3 /proc/$!/stat) in T) break;; esac; sleep 0.01; done; " +
                    commands + "; kill -KILL $!");
}

TEST(SimulatedConsole, StopSelfStopsTheToolBeforeItAnswers) {
    SimulatedConsole console("[lsvtc]\nmisbehave stop-self\nstdout 0:A_B;\n");
    EXPECT_EQ("T\n", _onceStopped("cut -d' ' -f3 /proc/$!/stat").stdoutText);
}

TEST(SimulatedConsole, RenameGivesTheToolAnotherProcessName) {
    SimulatedConsole console("[lsvtc]\nmisbehave rename\nmisbehave stop-self\n");
    EXPECT_EQ("renamed-action\n", _onceStopped("cat /proc/$!/comm").stdoutText);
}

TEST(SimulatedConsole, IgnoreSignalsLeavesTheToolRunningAfterSigterm) {
    SimulatedConsole console("[lsvtc]\nmisbehave ignore-signals\nmisbehave stop-self\n");
    EXPECT_EQ("alive\n",
              _onceStopped("kill -TERM $!; kill -HUP $!; kill -INT $!; kill -0 $! && echo alive")
                  .stdoutText);
}

TEST(SimulatedConsole, CloseStdoutClosesTheToolsStandardOutput) {
    SimulatedConsole console("[lsvtc]\nmisbehave close-stdout\nmisbehave stop-self\n");
    EXPECT_EQ("no stdout\n", _onceStopped("test -e /proc/$!/fd/1 || echo no stdout").stdoutText);
}

TEST(SimulatedConsole, ForkStormKeepsStartingProcessesInTheToolsGroup) {
    SimulatedConsole console("[lsvtc]\nmisbehave fork-storm\nmisbehave stop-self\n");
    // The tool leads a session and group of its own (setsid); two looks a
    // while apart find the chain's member in it under a new PID, and the
    // group is then killed whole.
    CommandResult const found = runShell(
        "setsid " + std::string(gc_Lsvtc) +
        " -t0 > /dev/null 2>&1 & group=$!; members() { pgrep -s $group | grep -v -x $group; };"
        " first=$(members); for i in $(seq 1000); do now=$(members);"
        " [ -n \"$first\" ] && [ -n \"$now\" ] && [ \"$now\" != \"$first\" ] && break;"
        " [ -n \"$first\" ] || first=$now; sleep 0.01; done;"
        " [ -n \"$first\" ] && [ \"$now\" != \"$first\" ] && echo forking; kill -KILL -$group");
    EXPECT_EQ("forking\n", found.stdoutText) << found.stderrText;
}

TEST(SimulatedConsole, MalformedScenarioIsRejectedNamingFileLineAndProblem) {
    SimulatedConsole console("[lsvtc]\nstdout fine\n\n[lspartition *]\nexit many\n");
    _expectAnswer(runCommand({gc_Lsvtc, "-t0"}), "",
                  "pylon-sim: bad scenario: " + console.scenarioPath() +
                      ":5: exit code must be a whole number from 0 to 255, not \"many\"\n",
                  gc_ExitBadScenario);
    std::vector<Invocation> const expected{{"lsvtc", "-t0"}};
    EXPECT_EQ(expected, console.invocations());
}

TEST(SimulatedConsole, MalformedScenarioIsRejectedByEveryTool) {
    SimulatedConsole console("[getFileFromPartition *]\ndocument <<END\nnever closed\n");
    std::string const message = "pylon-sim: bad scenario: " + console.scenarioPath() +
                                ":2: block \"<<END\" is not closed by a line \"END\"\n";
    _expectAnswer(runCommand({gc_Lspartition, "-ix", "-c", "A_B"}), "", message,
                  gc_ExitBadScenario);
    _expectAnswer(runShell(gc_RunCommandLine), "", message, gc_ExitBadScenario);
}

TEST(SimulatedConsole, MissingScenarioFileIsRejected) {
    SimulatedConsole console(QuorvexTest::ScenarioFile{"/nonexistent.scn"});
    _expectAnswer(runCommand({gc_Lsvtc, "-t0"}), "",
                  "pylon-sim: bad scenario: /nonexistent.scn: cannot read the scenario file\n",
                  gc_ExitBadScenario);
}

TEST(SimulatedConsole, CheckOptionValidatesAScenario) {
    SimulatedConsole console("[lsvtc\n");
    _expectAnswer(runCommand({QuorvexTest::simulatorPath(), "--check",
                              QuorvexTest::shippedScenario("demo.scn")}),
                  "", "", 0);
    _expectAnswer(runCommand({QuorvexTest::simulatorPath(), "--check", console.scenarioPath()}), "",
                  "pylon-sim: bad scenario: " + console.scenarioPath() +
                      ":1: section header must end with \"]\"\n",
                  gc_ExitBadScenario);
}

TEST(SimulatedConsole, OtherNamesGetTheUsage) {
    CommandResult const result = runCommand({QuorvexTest::simulatorPath(), "-t0"});
    EXPECT_EQ(2, result.exitStatus);
    EXPECT_EQ("", result.stdoutText);
    EXPECT_EQ(0u, result.stderrText.find("usage: run as lsvtc, lspartition or runact-api"));
}

TEST(SimulatedConsole, DemoScenarioAnswersASurveyOfItsMachine) {
    SimulatedConsole console(QuorvexTest::ScenarioFile{QuorvexTest::shippedScenario("demo.scn")});
    EXPECT_EQ("1,10.20.30.41,3,aurora,Zeph,7.2;2,10.20.30.42,3,boreas,Zeph,7.3;3,10.20.30.43,1,"
              "cirrus,Zeph,7.1;"
              "4,10.20.30.44,3,delta,Zeph,7.2;5,10.20.30.45,3,eos,Linux,5.14;6,10.20.30.46,3,fjord,"
              "Zeph,7.3;"
              "7,10.20.30.47,3,,Zeph,7.2;\n",
              runShell("/opt/vtc/bin/lspartition -ix -c 9119-MHE_21ABCDE").stdoutText);
    _expectAnswer(runCommand({gc_Runact, "-c", _remoteAction("runCmdOnPartition", "4")}),
                  "Rc::1::RcCmd::0::RetStr1::timeout::RetStr2::\n", "", 1);
    _expectAnswer(runCommand({gc_Runact, "-c", _remoteAction("runCmdOnPartition", "5")}),
                  "Rc::0::RcCmd::5::RetStr1::client survey failed::RetStr2::\n", "", 0);
    _expectAnswer(runShell(_getFileLine("6", "VPD/p6.xml")),
                  "Rc::4::RcCmd::0::RetStr1::file not found::RetStr2::\n",
                  "runact-api: getFileFromPartition failed on partition 6\n", 1);
    _expectAnswer(runShell(_getFileLine("1", "VPD/p1.xml")),
                  "Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n", "", 0);
    EXPECT_EQ(QuorvexTest::readFile(QuorvexTest::sourceRoot() +
                                    "/sim/scenarios/documents/aurora.VPD.xml"),
              QuorvexTest::readFile("/var/adm/quorvex/VPD/p1.xml"));
}

TEST(SimulatedConsole, SeveralMachinesScenarioListsObjectTypesZeroAndTwo) {
    SimulatedConsole console(
        QuorvexTest::ScenarioFile{QuorvexTest::shippedScenario("several-machines.scn")});
    EXPECT_EQ("0:9119-MHE_21ABCDE;2:7063-CR2_06QRV01;0:8286-42A_10XYZ99;\n",
              runShell("/opt/lsvtc/bin/lsvtc -t0").stdoutText);
    EXPECT_EQ("1,10.40.50.61,3,gemini,Linux,5.14;3,10.40.50.63,2,hydra,Zeph,7.1;\n",
              runShell("/opt/vtc/bin/lspartition -ix -c 8286-42A_10XYZ99").stdoutText);
}

TEST(SimulatedConsole, EmptyScenarioListsNoPartitions) {
    SimulatedConsole console(QuorvexTest::ScenarioFile{QuorvexTest::shippedScenario("empty.scn")});
    _expectAnswer(runShell("/opt/vtc/bin/lspartition -ix -c 9119-MHE_21ABCDE"), "", "", 0);
}
