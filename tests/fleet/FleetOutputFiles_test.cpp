// The run's own outputs: checked before anything runs (exit status 73 and
// the reason, no console command), files that still cannot be written at the
// end named after the machines' blocks (exit status 73), and a signal that
// comes while the last results are written, or a reader gone from standard
// output (SIGPIPE), ending the run as interrupted. Inside the sandbox, where
// the console tools are the simulator; a file size limit on the run stands
// for a full disk, for root too.

#include "FleetTools.h"
#include "LeftProcesses.h"
#include "QuorvexTest.h"
#include "SummaryFile.h"
#include "SurveyProcess.h"

#include <gtest/gtest.h>

#include <fcntl.h>
#include <sys/ioctl.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <csignal>
#include <filesystem>
#include <thread>

namespace {

using FleetTest::gc_Answer;
using FleetTest::gc_Identity;
using FleetTest::SurveyProcess;
using QuorvexTest::SimulatedConsole;

constexpr char gc_Second[] = "5678-DEF_20FGHIJ";
constexpr char gc_StatusFile[] =
    "/var/adm/quorvex/VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE.status";
constexpr char gc_TraceFile[] =
    "/var/adm/quorvex/Trace/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE.Trace";
// Far above any bound a test waits for.
constexpr char gc_Hang[] = "child-delay 3600\ndelay 3600\n";
// A run that never ends within it was waiting for a hung console command.
constexpr double gc_Bound = 30.0;
constexpr char gc_BlockEnd[] = "\nquorvexPYLON_VPD_Survey_ClientPartition ReturnCode: \n";
// The history database, in the sandbox's own state folder, cannot be written
// either (past a file size limit at its first page, or not flushed): named
// after the files that could not be written, its 74 outweighed by their 73.
constexpr char gc_HistoryNotWritten[] = "quorvex-survey: cannot record the run in "
                                        "/var/lib/quorvex-survey/history.sqlite: disk I/O error\n";

// The listing of a machine with partitions first..first+count-1, all active
// or all inactive.
std::string listing(std::string const& identity, int count, bool active, int first = 1) {
    std::string line = "[lspartition " + identity + "]\nstdout ";
    for (int id = first; id < first + count; ++id) {
        line += std::to_string(id) + ",10.1.1." + std::to_string(id) + "," + (active ? "3" : "1") +
                ",host" + std::to_string(id) + ",Zeph,7.2;";
    }
    return line + "\n";
}

std::string surveyedActions() {
    return std::string("[runCmdOnPartition *]\n") + gc_Answer + "[getFileFromPartition *]\n" +
           gc_Answer + "document-nolf <fetched/>\n";
}

class FleetOutputFiles : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(QuorvexTest::isInsideSandbox());
        QuorvexTest::clearFolder(QuorvexTest::gc_VPD_Folder);
        QuorvexTest::clearFolder(QuorvexTest::gc_TraceFolder);
    }

    // quorvex-survey with these arguments; its output goes to files in _work.
    SurveyProcess _start(std::vector<std::string> const& arguments,
                         std::optional<rlim_t> fileSizeLimit = {}) const {
        std::vector<std::string> argv{FleetTest::consoleWideTool()};
        argv.insert(argv.end(), arguments.begin(), arguments.end());
        return SurveyProcess(argv, _work.file("stdout"), _work.file("stderr"), fileSizeLimit);
    }

    std::string _stderr() const { return QuorvexTest::readFile(_work.file("stderr")); }

    // Refused before the first console command: nothing else printed or written.
    void _expectRefused(SurveyProcess& survey, SimulatedConsole const& console,
                        std::string const& message) const {
        EXPECT_EQ(survey.waitForExit(gc_Bound), 73) << _stderr();
        EXPECT_EQ(_stderr(), "quorvex-survey: " + message + "\n");
        EXPECT_EQ(QuorvexTest::readFile(_work.file("stdout")), "");
        EXPECT_EQ(console.logText(), "") << "a console command ran";
        EXPECT_TRUE(QuorvexTest::listFolder(QuorvexTest::gc_VPD_Folder).empty());
        EXPECT_TRUE(QuorvexTest::listFolder(QuorvexTest::gc_TraceFolder).empty());
    }

    QuorvexTest::TemporaryDirectory _work;
};

TEST_F(FleetOutputFiles, SummaryFolderThatCannotBeMadeEndsWith73BeforeAnyConsoleCommand) {
    SimulatedConsole const console("[lspartition *]\n" + std::string(gc_Hang));
    QuorvexTest::writeFile(_work.file("file"), "x");
    SurveyProcess survey = _start({"--summary", _work.file("file/runs/summary.json"), gc_Identity});
    _expectRefused(survey, console,
                   "cannot create " + _work.file("file/runs") + ": Not a directory");
}

TEST_F(FleetOutputFiles, SummaryPathThatIsAFolderEndsWith73BeforeAnyConsoleCommand) {
    SimulatedConsole const console("[lspartition *]\n" + std::string(gc_Hang));
    std::filesystem::create_directories(_work.file("summary.json"));
    SurveyProcess survey = _start({"--summary", _work.file("summary.json"), gc_Identity});
    _expectRefused(survey, console,
                   "cannot write " + _work.file("summary.json") + ": Is a directory");
}

TEST_F(FleetOutputFiles, ReportFolderThatIsAFileEndsWith73BeforeTheMachineListing) {
    SimulatedConsole const console("[lsvtc]\n" + std::string(gc_Hang));
    QuorvexTest::writeFile(_work.file("report"), "x");
    SurveyProcess survey = _start({"--report", _work.file("report"), "--all"});
    _expectRefused(survey, console, "cannot create " + _work.file("report") + ": Not a directory");
}

TEST_F(FleetOutputFiles, MissingFoldersOfSummaryAndReportAreCreated) {
    SimulatedConsole const console(listing(gc_Identity, 1, true) + surveyedActions());
    SurveyProcess survey = _start({"--summary", _work.file("runs/today/summary.json"), "--report",
                                   _work.file("pages/today"), gc_Identity});
    EXPECT_EQ(survey.waitForExit(gc_Bound), 0) << _stderr();
    EXPECT_EQ(FleetTest::SummaryFile(_work.file("runs/today/summary.json")).validationProblems(),
              "");
    EXPECT_TRUE(QuorvexTest::fileExists(_work.file("pages/today/index.html")));
    EXPECT_EQ(QuorvexTest::listFolder(_work.path()),
              (std::vector<std::string>{"pages", "runs", "stderr", "stdout"}))
        << "no file left by the checks";
}

// Forty inactive partitions under a file size limit of 1,000 bytes: a status
// file of over 2,000 bytes, a listing whose trace lines go past the limit
// too (the machine's trace is written with the first 1,000 bytes and named),
// no document.
TEST_F(FleetOutputFiles, StatusFileAndSummaryThatCannotBeWrittenAreNamedAndEndWith73) {
    SimulatedConsole const console(listing(gc_Identity, 40, false));
    std::string const summary = _work.file("summary.json");
    SurveyProcess survey = _start({"--summary", summary, gc_Identity}, 1000);
    EXPECT_EQ(survey.waitForExit(gc_Bound), 73) << _stderr();
    // No partition was contacted: the block is the overall code alone.
    EXPECT_EQ(_stderr(), std::string(gc_BlockEnd) + "8\nquorvex-survey: cannot write " +
                             gc_StatusFile + ": File too large\nquorvex-survey: cannot write " +
                             gc_TraceFile + ": File too large\nquorvex-survey: cannot write " +
                             summary + ": File too large\n" + gc_HistoryNotWritten);
    EXPECT_EQ(QuorvexTest::listFolder(QuorvexTest::gc_VPD_Folder), std::vector<std::string>{})
        << "a cut status file or its temporary file was left";
    EXPECT_EQ(QuorvexTest::readFile(gc_TraceFile).size(), 1000U);
    EXPECT_EQ(QuorvexTest::listFolder(_work.path()),
              (std::vector<std::string>{"stderr", "stdout"}));
}

// A failed client run gets a default document, written by the survey code in
// the worker; the document's write failing is carried back and said.
TEST_F(FleetOutputFiles, DefaultDocumentThatCannotBeWrittenIsNamedAndEndsWith73) {
    SimulatedConsole const console(listing(gc_Identity, 1, true) +
                                   "[runCmdOnPartition *]\nstdout Rc::1::RetStr1::failed\n");
    std::string const summary = _work.file("summary.json");
    SurveyProcess survey = _start({"--summary", summary, gc_Identity}, 1200);
    EXPECT_EQ(survey.waitForExit(gc_Bound), 73) << _stderr();
    std::string const document =
        "/var/adm/quorvex/VPD/"
        "quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE-1.VPD.xml";
    EXPECT_EQ(_stderr(), std::string("8\n") + gc_BlockEnd + "8\nquorvex-survey: cannot write " +
                             document + ": File too large\nquorvex-survey: cannot write " +
                             summary + ": File too large\n" + gc_HistoryNotWritten);
    EXPECT_EQ(QuorvexTest::readFile(document).size(), 1200u)
        << "the survey code leaves its document cut short under its name, as the tool does";
}

// quorvex-survey started through a shell that first links the trace piece
// of the given slot to /dev/full, where every write fails with ENOSPC as on
// a full Trace folder: the piece's name carries the run's PID, which the
// shell keeps when it becomes the run.
SurveyProcess startWithFullTracePiece(std::vector<std::string> const& arguments, int slot,
                                      std::string const& stdoutPath,
                                      std::string const& stderrPath) {
    std::vector<std::string> argv{"/bin/sh", "-c",
                                  R"(ln -s /dev/full "$0.piece-$$-)" + std::to_string(slot) +
                                      R"(" && exec "$@")",
                                  gc_TraceFile, FleetTest::consoleWideTool()};
    argv.insert(argv.end(), arguments.begin(), arguments.end());
    return SurveyProcess(argv, stdoutPath, stderrPath);
}

// The listing unit runs in slot 0: its lines are lost, the machine's trace
// is written without them and named, and the blocks stay the tool's.
TEST_F(FleetOutputFiles, ListingTracePieceThatCannotBeWrittenIsNamedAndEndsWith73) {
    SimulatedConsole const console(listing(gc_Identity, 1, true) + surveyedActions());
    std::string const summary = _work.file("summary.json");
    SurveyProcess survey = startWithFullTracePiece({"--summary", summary, gc_Identity}, 0,
                                                   _work.file("stdout"), _work.file("stderr"));
    EXPECT_EQ(survey.waitForExit(gc_Bound), 73) << _stderr();
    EXPECT_EQ(_stderr(), std::string("0\n") + gc_BlockEnd + "0\nquorvex-survey: cannot write " +
                             gc_TraceFile + ": No space left on device\n");
    EXPECT_EQ(FleetTest::SummaryFile(summary).field("/exit_status"), "73");
    std::string const trace = QuorvexTest::readFile(gc_TraceFile);
    EXPECT_EQ(trace.find("lspartition"), std::string::npos) << trace;
    EXPECT_NE(trace.find("runCmdOnPartition"), std::string::npos) << trace;
    EXPECT_EQ(QuorvexTest::listFolder(QuorvexTest::gc_TraceFolder),
              std::vector<std::string>{std::filesystem::path(gc_TraceFile).filename().string()})
        << "the linked piece is removed";
}

// At -j 2 the two surveys run in slots 0 and 1: the second one's lines are
// lost.
TEST_F(FleetOutputFiles, SurveyTracePieceThatCannotBeWrittenIsNamedAndEndsWith73) {
    SimulatedConsole const console(listing(gc_Identity, 2, true) + surveyedActions());
    SurveyProcess survey = startWithFullTracePiece({"-j", "2", gc_Identity}, 1,
                                                   _work.file("stdout"), _work.file("stderr"));
    EXPECT_EQ(survey.waitForExit(gc_Bound), 73) << _stderr();
    EXPECT_EQ(_stderr(), std::string("0\n0\n") + gc_BlockEnd + "0\nquorvex-survey: cannot write " +
                             gc_TraceFile + ": No space left on device\n");
    std::string const trace = QuorvexTest::readFile(gc_TraceFile);
    EXPECT_NE(trace.find("lspartition"), std::string::npos) << trace;
    EXPECT_EQ(QuorvexTest::listFolder(QuorvexTest::gc_TraceFolder).size(), 1U)
        << "the linked piece is removed";
}

// A disk whose flush fails (fsync and fdatasync fail with EIO in the run and
// its workers, for root too): every file quorvex-survey writes under a
// temporary name is named, its old version stays, and nothing else is left;
// the history, which SQLite flushes too, is not recorded.
TEST_F(FleetOutputFiles, FilesThatCannotBeFlushedToTheDiskAreNamedAndTheOldOnesStay) {
    SimulatedConsole const console(listing(gc_Identity, 1, true) + surveyedActions());
    std::string const summary = _work.file("summary.json");
    QuorvexTest::writeFile(gc_StatusFile, "old status\n");
    QuorvexTest::writeFile(gc_TraceFile, "old trace\n");
    QuorvexTest::writeFile(summary, "{}\n");
    SurveyProcess survey({FleetTest::consoleWideTool(), "--summary", summary, "--report",
                          _work.file("report"), gc_Identity},
                         _work.file("stdout"), _work.file("stderr"), {},
                         {SYS_fsync, SYS_fdatasync});
    EXPECT_EQ(survey.waitForExit(gc_Bound), 73) << _stderr();
    EXPECT_EQ(_stderr(), std::string("0\n") + gc_BlockEnd + "0\nquorvex-survey: cannot write " +
                             gc_StatusFile + ": Input/output error\nquorvex-survey: cannot write " +
                             gc_TraceFile +
                             ": Input/output error\nquorvex-survey: report: cannot write " +
                             _work.file("report/summary.json") +
                             ": Input/output error\nquorvex-survey: cannot write " + summary +
                             ": Input/output error\n" + gc_HistoryNotWritten);
    EXPECT_EQ(QuorvexTest::readFile(gc_StatusFile), "old status\n");
    EXPECT_EQ(QuorvexTest::readFile(gc_TraceFile), "old trace\n");
    EXPECT_EQ(QuorvexTest::readFile(summary), "{}\n");
    EXPECT_EQ(QuorvexTest::listFolder(QuorvexTest::gc_TraceFolder).size(), 1U);
    EXPECT_FALSE(QuorvexTest::fileExists(_work.file("report/index.html")));
}

// Reads the pipe until its writers are gone.
void drain(int readEnd) {
    char buffer[4096];
    while (::read(readEnd, buffer, sizeof buffer) > 0) {
    }
}

// Waits until the pipe holds something.
bool waitForOutput(int readEnd) {
    double const until = FleetTest::monotonicSeconds() + gc_Bound;
    int held = 0;
    while (FleetTest::monotonicSeconds() < until) {
        if (::ioctl(readEnd, FIONREAD, &held) == 0 && held > 0) {
            return true;
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(20));
    }
    return false;
}

// Runs the survey of gc_Identity with a summary, its standard output a pipe
// of 4,096 bytes that nobody reads until SIGTERM is sent; the exit status.
// With 80 surveyed partitions the machine's block (5,751 bytes) cannot get
// through before the signal: the signal comes once every partition has
// ended, while the results are written, whatever the timing.
int signalWhileTheBlockIsWritten(std::string const& summary, std::string const& stderrPath,
                                 std::optional<rlim_t> fileSizeLimit = {}) {
    int ends[2];
    // Close-on-exec: the run must hold no reading end of its own output.
    if (::pipe2(ends, O_CLOEXEC) != 0 || ::fcntl(ends[1], F_SETPIPE_SZ, 4096) != 4096) {
        return -2;
    }
    SurveyProcess survey(
        {FleetTest::consoleWideTool(), "-j", "8", "--summary", summary, gc_Identity},
        "/proc/self/fd/" + std::to_string(ends[1]), stderrPath, fileSizeLimit);
    ::close(ends[1]);
    bool const printing = waitForOutput(ends[0]);
    survey.signal(SIGTERM);
    drain(ends[0]);
    ::close(ends[0]);
    int const status = survey.waitForExit(gc_Bound);
    return printing ? status : -3;
}

// The signal still ends the run as interrupted, with every outcome as the
// survey left it.
TEST_F(FleetOutputFiles, SignalWhileTheLastBlockIsWrittenEndsTheRunAsInterrupted) {
    SimulatedConsole const console(listing(gc_Identity, 80, true) + surveyedActions());
    std::string const summary = _work.file("summary.json");
    EXPECT_EQ(signalWhileTheBlockIsWritten(summary, _work.file("stderr")), 143)
        << "-2: no pipe; -3: the block never came\n"
        << _stderr();
    FleetTest::SummaryFile const written(summary);
    EXPECT_EQ(written.validationProblems(), "");
    EXPECT_EQ(written.field("/interrupted"), "\"SIGTERM\"");
    EXPECT_EQ(written.field("/exit_status"), "143");
    EXPECT_EQ(written.outcomes(), std::vector<std::string>(80, "surveyed"));
    EXPECT_TRUE(QuorvexTest::fileExists(gc_StatusFile));
}

// A signal outweighs a file that could not be written (73), which is still
// named. Under a limit of 8,000 bytes the listing (under 3,000 bytes) is read
// whole, while the machine's trace (a block of commands per partition) and
// the summary do not fit.
TEST_F(FleetOutputFiles, SignalOutweighsAFileThatCannotBeWritten) {
    SimulatedConsole const console(listing(gc_Identity, 80, true) + surveyedActions());
    std::string const summary = _work.file("summary.json");
    EXPECT_EQ(signalWhileTheBlockIsWritten(summary, _work.file("stderr"), 8000), 143)
        << "-2: no pipe; -3: the block never came\n"
        << _stderr();
    std::string const printed = _stderr();
    EXPECT_NE(printed.find("\nquorvex-survey: cannot write " + std::string(gc_TraceFile) +
                           ": File too large\n"),
              std::string::npos)
        << printed;
    EXPECT_FALSE(QuorvexTest::fileExists(summary)) << "the summary did not fit either";
}

// Waits until the console has received the client run of partition id.
bool waitForClientRun(SimulatedConsole const& console, std::string const& id) {
    double const until = FleetTest::monotonicSeconds() + gc_Bound;
    while (FleetTest::monotonicSeconds() < until) {
        if (console.logText().find("runCmdOnPartition::CallerID::0::CecMT::5678-DEF::CecMS::"
                                   "20FGHIJ::PartitionId::" +
                                   id + "::") != std::string::npos) {
            return true;
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(20));
    }
    return false;
}

// Standard output read by nobody any more (a reader such as "head -1" gone):
// the first machine's block meets SIGPIPE, and the run stops as for SIGTERM,
// the second machine's hung action included, and says why. The pipe is full
// until the hung action has started, so the block cannot get through before
// the reader goes, whatever the timing.
// A standard output on a full disk stops the run as a reader gone does,
// after the cause is said.
TEST_F(FleetOutputFiles, StandardOutputThatCannotBeWrittenStopsTheRunLikeSigpipe) {
    SimulatedConsole const console(listing(gc_Identity, 2, true) + surveyedActions());
    std::string const summary = _work.file("summary.json");
    SurveyProcess survey({FleetTest::consoleWideTool(), "--summary", summary, gc_Identity},
                         "/dev/full", _work.file("stderr"));
    EXPECT_EQ(survey.waitForExit(gc_Bound), 128 + SIGPIPE) << _stderr();
    EXPECT_EQ(_stderr(), std::string("0\n0\n") + gc_BlockEnd +
                             "0\nquorvex-survey: cannot write standard output: No space left "
                             "on device\nquorvex-survey: stopped by SIGPIPE\n");
    FleetTest::SummaryFile const written(summary);
    EXPECT_EQ(written.field("/interrupted"), "\"SIGPIPE\"");
    EXPECT_EQ(written.field("/exit_status"), "141");
    EXPECT_TRUE(QuorvexTest::fileExists(gc_StatusFile));
}

TEST_F(FleetOutputFiles, ReaderGoneFromStandardOutputStopsTheRunWithSigpipe) {
    SimulatedConsole const console(listing(gc_Identity, 1, true) + listing(gc_Second, 1, true, 2) +
                                   "[runCmdOnPartition 1]\n" + gc_Answer +
                                   "[getFileFromPartition *]\n" + gc_Answer +
                                   "document-nolf <fetched/>\n[runCmdOnPartition 2]\n" + gc_Hang);
    int ends[2];
    // Close-on-exec: the run must hold no reading end of its own output.
    ASSERT_EQ(::pipe2(ends, O_CLOEXEC), 0);
    ASSERT_EQ(::fcntl(ends[1], F_SETPIPE_SZ, 4096), 4096);
    std::string const filling(4096, 'x');
    ASSERT_EQ(::write(ends[1], filling.data(), filling.size()), 4096);
    std::string const summary = _work.file("summary.json");
    SurveyProcess survey(
        {FleetTest::consoleWideTool(), "--summary", summary, gc_Identity, gc_Second},
        "/proc/self/fd/" + std::to_string(ends[1]), _work.file("stderr"));
    ::close(ends[1]);
    bool const started = waitForClientRun(console, "2");
    ::close(ends[0]);
    ASSERT_TRUE(started) << "the second machine's action never started";
    EXPECT_EQ(survey.waitForExit(gc_Bound), 128 + SIGPIPE) << _stderr();
    EXPECT_EQ(_stderr(), std::string("0\n") + gc_BlockEnd + "08\n" + gc_BlockEnd +
                             "8\nquorvex-survey: stopped by SIGPIPE\n");
    FleetTest::SummaryFile const written(summary);
    EXPECT_EQ(written.validationProblems(), "");
    EXPECT_EQ(written.field("/interrupted"), "\"SIGPIPE\"");
    EXPECT_EQ(written.outcomes(), (std::vector<std::string>{"surveyed", "interrupted"}));
    EXPECT_EQ(FleetTest::processesOfConsole(console.logPath()), std::vector<std::string>{})
        << "processes of the stopped action left running";
}

} // namespace
