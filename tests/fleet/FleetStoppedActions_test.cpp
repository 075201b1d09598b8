// Remote actions that never return: the time limit stops them, and so does an
// interruption. Runs inside the sandbox (the console tools are the simulator)
// with actions that wait an hour and leave a child process waiting an hour.
//
// A stopped partition gets the record the one-machine tool makes for an
// action killed before printing anything (KilledActionReference), plus one
// note line in its default document's reason and at the end of its trace
// block; the rest of the run goes on or, when interrupted, is marked as not
// surveyed.

#include "FleetTools.h"
#include "KilledActionReference.h"
#include "LeftProcesses.h"
#include "Lines.h"
#include "QuorvexTest.h"
#include "SummaryFile.h"
#include "SurveyProcess.h"

#include <gtest/gtest.h>

#include <csignal>
#include <ctime>
#include <regex>
#include <thread>

namespace {

using FleetTest::gc_Answer;
using FleetTest::gc_Identity;
using FleetTest::KilledActionReference;
using FleetTest::listing;
using FleetTest::SurveyProcess;
using QuorvexTest::SimulatedConsole;

constexpr char gc_VPD[] = "/var/adm/quorvex/VPD/";
constexpr char gc_Trace[] =
    "/var/adm/quorvex/Trace/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE.Trace";
constexpr char gc_Document[] = "quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE-";
constexpr char gc_StatusFile[] = "quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE.status";
// Far above any bound a test waits for.
constexpr char gc_Hang[] = "child-delay 3600\ndelay 3600\n";
// Generous: the bound a run must keep is the limit plus one second.
constexpr double gc_Margin = 3.0;

std::string fetchAnswer() {
    return std::string("[getFileFromPartition *]\n") + gc_Answer + "document-nolf <fetched/>\n";
}

std::string document(std::string const& id) {
    return std::string(gc_Document) + id + ".VPD.xml";
}

void clearResultFolders() {
    QuorvexTest::clearFolder(QuorvexTest::gc_VPD_Folder);
    QuorvexTest::clearFolder(QuorvexTest::gc_TraceFolder);
}

// The lines matching the pattern.
std::vector<std::string> matching(std::string const& text, std::regex const& pattern) {
    std::vector<std::string> found;
    for (std::string const& line : QuorvexTest::linesOf(text)) {
        if (std::regex_match(line, pattern)) {
            found.push_back(line);
        }
    }
    return found;
}

// The text without every line matching the pattern.
std::string withoutMatching(std::string const& text, std::regex const& pattern) {
    std::string kept;
    std::size_t start = 0;
    while (start < text.size()) {
        std::size_t const end = text.find('\n', start);
        std::size_t const next = end == std::string::npos ? text.size() : end + 1;
        std::string const line = text.substr(start, next - start);
        std::string const bare = end == std::string::npos ? line : line.substr(0, line.size() - 1);
        if (!std::regex_match(bare, pattern)) {
            kept += line;
        }
        start = next;
    }
    return kept;
}

// The trace block of one partition: from its banner up to the next one.
std::string traceBlock(std::string const& trace, std::string const& id) {
    std::string const start = "    Partition    : 1234-ABC_10ABCDE-" + id + "\n";
    std::size_t const begin = trace.find(start);
    if (begin == std::string::npos) {
        return "";
    }
    std::size_t const next = trace.find("\n+++", begin);
    return trace.substr(begin, next == std::string::npos ? std::string::npos : next - begin);
}

// The text without its final line feeds: the blank lines that separate a
// block from the next one are missing after the last block.
std::string withoutFinalLineFeeds(std::string text) {
    text.erase(text.find_last_not_of('\n') + 1);
    return text;
}

// quorvex-survey with two partitions in flight, the given time limit and a
// summary, surveying the one machine; its output goes to files in work.
SurveyProcess startSurvey(QuorvexTest::TemporaryDirectory const& work, char const* timeLimit) {
    return SurveyProcess({FleetTest::consoleWideTool(), "-t", timeLimit, "-j", "2", "--summary",
                          work.file("summary.json"), gc_Identity},
                         work.file("stdout"), work.file("stderr"));
}

// Waits until the console has received the client run of each partition.
bool waitForClientRuns(SimulatedConsole const& console, std::vector<std::string> const& ids) {
    double const until = FleetTest::monotonicSeconds() + 30.0;
    while (FleetTest::monotonicSeconds() < until) {
        std::string const log = console.logText();
        bool all = true;
        for (std::string const& id : ids) {
            all = all && log.find("runCmdOnPartition::CallerID::0::CecMT::1234-ABC::CecMS::"
                                  "10ABCDE::PartitionId::" +
                                  id + "::") != std::string::npos;
        }
        if (all) {
            return true;
        }
        std::this_thread::sleep_for(std::chrono::milliseconds(50));
    }
    return false;
}

void expectNothingLeft(SimulatedConsole const& console) {
    EXPECT_EQ(FleetTest::processesOfConsole(console.logPath()), std::vector<std::string>{})
        << "processes of stopped actions left running";
    for (std::string const& name : QuorvexTest::listFolder("/tmp")) {
        EXPECT_NE(name.rfind("ShellCommand.", 0), 0u) << "temporary file left in /tmp: " << name;
    }
}

// The stopped partition's default document and trace block are the killed
// action's record with the note line added once.
void expectRecordWithNote(KilledActionReference const& reference, std::string const& trace,
                          std::string const& id, std::regex const& note, long first, long last) {
    std::string const fleetDocument = QuorvexTest::readFile(gc_VPD + document(id));
    EXPECT_EQ(matching(fleetDocument, note).size(), 1u) << "note in the document of " << id << ":\n"
                                                        << fleetDocument;
    EXPECT_EQ(QuorvexTest::normaliseTimeStamps(withoutMatching(fleetDocument, note), first, last),
              QuorvexTest::normaliseTimeStamps(reference.vpdFile(document(id)), first, last))
        << "document of partition " << id << " without the note";
    std::string const block = traceBlock(trace, id);
    EXPECT_EQ(matching(block, note).size(), 1u) << "note in the trace block of " << id << ":\n"
                                                << block;
    EXPECT_EQ(withoutFinalLineFeeds(QuorvexTest::normaliseTemporaryNames(
                  withoutMatching(block, note), QuorvexTest::TemporaryNames::Numbered)),
              withoutFinalLineFeeds(QuorvexTest::normaliseTemporaryNames(
                  traceBlock(reference.trace(), id), QuorvexTest::TemporaryNames::Numbered)))
        << "trace block of partition " << id << " without the note";
}

// The check for processes left behind finds one when there is one.
TEST(FleetLeftProcesses, FindTheChildAConsoleToolLeftRunning) {
    SimulatedConsole const console("[lsvtc]\nchild-delay 30\n");
    EXPECT_EQ(QuorvexTest::runCommand({"/opt/lsvtc/bin/lsvtc", "-t0"}).exitStatus, 0);
    std::vector<std::string> const left = FleetTest::processesOfConsole(console.logPath());
    ASSERT_EQ(left.size(), 1u);
    EXPECT_NE(left.front().find(" /opt/lsvtc/bin/lsvtc -t0"), std::string::npos) << left.front();
    EXPECT_EQ(::kill(std::stoi(left.front()), SIGKILL), 0);
}

TEST(FleetTimeLimit, HungActionIsStoppedAtTheLimitAndTheRunGoesOn) {
    clearResultFolders();
    SimulatedConsole const console(listing(3) + "[runCmdOnPartition 2]\n" + gc_Hang +
                                   "[runCmdOnPartition *]\n" + gc_Answer + fetchAnswer());
    QuorvexTest::TemporaryDirectory const work;
    long const first = static_cast<long>(std::time(nullptr));
    SurveyProcess survey = startSurvey(work, "2");
    int const status = survey.waitForExit(60.0);
    EXPECT_LE(survey.secondsTaken(), 2.0 + 1.0 + gc_Margin) << "the run waited for the hung action";
    EXPECT_EQ(status, 4) << QuorvexTest::readFile(work.file("stderr"));
    expectNothingLeft(console);

    KilledActionReference const reference(gc_Identity, {"2"});
    long const last = static_cast<long>(std::time(nullptr));
    EXPECT_EQ(QuorvexTest::readFile(work.file("stdout")), reference.result().stdoutText);
    EXPECT_EQ(QuorvexTest::readFile(work.file("stderr")), reference.result().stderrText);
    EXPECT_EQ(QuorvexTest::readFile(gc_VPD + std::string(gc_StatusFile)),
              reference.vpdFile(gc_StatusFile));
    EXPECT_EQ(QuorvexTest::readFile(gc_VPD + document("3")), "<fetched/>")
        << "the partition after the hung one was surveyed";
    std::regex const note(R"(Stopped by the time limit of 2 s after ([0-9]+\.[0-9]) s\.)");
    expectRecordWithNote(reference, QuorvexTest::readFile(gc_Trace), "2", note, first, last);

    FleetTest::SummaryFile const summary(work.file("summary.json"));
    EXPECT_EQ(summary.validationProblems(), "");
    EXPECT_EQ(summary.outcomes(), (std::vector<std::string>{"surveyed", "timed_out", "surveyed"}));
    EXPECT_EQ(summary.partitionField(1, "/time_limit/action"), "\"runCmdOnPartition\"");
    double const stoppedAfter =
        std::stod(summary.partitionField(1, "/time_limit/stopped_after_seconds"));
    EXPECT_GE(stoppedAfter, 2.0);
    EXPECT_LE(stoppedAfter, 2.0 + 1.0 + gc_Margin);
}

TEST(FleetTimeLimit, ZeroMeansNoLimit) {
    clearResultFolders();
    SimulatedConsole const console(listing(1) + "[runCmdOnPartition 1]\ndelay 1.5\n" + gc_Answer +
                                   fetchAnswer());
    QuorvexTest::TemporaryDirectory const work;
    SurveyProcess survey({FleetTest::consoleWideTool(), "-t", "0", gc_Identity},
                         work.file("stdout"), work.file("stderr"));
    EXPECT_EQ(survey.waitForExit(60.0), 0) << QuorvexTest::readFile(work.file("stderr"));
    EXPECT_EQ(QuorvexTest::readFile(gc_VPD + document("1")), "<fetched/>");
}

class FleetInterruption : public ::testing::TestWithParam<int> {};

std::string signalNameOf(int signalNumber) {
    switch (signalNumber) {
    case SIGINT:
        return "SIGINT";
    case SIGHUP:
        return "SIGHUP";
    default:
        return "SIGTERM";
    }
}

// Partition 1 is surveyed at once; 2 and 3 hang in flight (-j 2); 4 never starts.
TEST_P(FleetInterruption, StopsWhatIsInFlightAndMarksWhatDidNotFinish) {
    int const signalNumber = GetParam();
    std::string const signalName = signalNameOf(signalNumber);
    // A closed terminal is nobody's request: the run says why it stopped.
    std::string const closing =
        signalNumber == SIGHUP ? "\nquorvex-survey: stopped by SIGHUP\n" : "";
    clearResultFolders();
    SimulatedConsole const console(listing(4) + "[runCmdOnPartition 1]\n" + gc_Answer +
                                   "[runCmdOnPartition *]\n" + gc_Hang + fetchAnswer());
    QuorvexTest::TemporaryDirectory const work;
    long const first = static_cast<long>(std::time(nullptr));
    SurveyProcess survey = startSurvey(work, "0");
    ASSERT_TRUE(waitForClientRuns(console, {"2", "3"})) << "partitions 2 and 3 never started";
    std::this_thread::sleep_for(std::chrono::milliseconds(300));
    survey.signal(signalNumber);
    int const status = survey.waitForExit(30.0);
    EXPECT_EQ(status, 128 + signalNumber) << QuorvexTest::readFile(work.file("stderr"));
    expectNothingLeft(console);

    std::string const interrupted = " - VPD Survey - Interrupted - not surveyed\n";
    EXPECT_EQ(QuorvexTest::readFile(gc_VPD + std::string(gc_StatusFile)),
              "host1 [10.1.1.11] - VPD Survey - Ok\nhost2 [10.1.1.12]" + interrupted +
                  "host3 [10.1.1.13]" + interrupted + "host4 [10.1.1.14]" + interrupted);
    EXPECT_EQ(QuorvexTest::readFile(work.file("stdout")),
              "VPD/" + document("1") + "\nVPD/" + document("2") + "\nVPD/" + document("3") + "\n");
    EXPECT_EQ(QuorvexTest::readFile(work.file("stderr")),
              "0\n8\n8\n\nquorvexPYLON_VPD_Survey_ClientPartition ReturnCode: \n4" + closing);
    EXPECT_EQ(
        QuorvexTest::listFolder(gc_VPD),
        (std::vector<std::string>{document("1"), document("2"), document("3"), gc_StatusFile}))
        << "no document for the partition never started, no half-written file";

    KilledActionReference const reference(gc_Identity, {"2", "3", "4"});
    long const last = static_cast<long>(std::time(nullptr));
    std::regex const note("Stopped by " + signalName + R"( after ([0-9]+\.[0-9]) s\.)");
    std::string const trace = QuorvexTest::readFile(gc_Trace);
    expectRecordWithNote(reference, trace, "2", note, first, last);
    expectRecordWithNote(reference, trace, "3", note, first, last);

    FleetTest::SummaryFile const summary(work.file("summary.json"));
    EXPECT_EQ(summary.validationProblems(), "");
    EXPECT_EQ(summary.field("/interrupted"), "\"" + signalName + "\"");
    EXPECT_EQ(summary.field("/exit_status"), std::to_string(128 + signalNumber));
    EXPECT_EQ(summary.outcomes(),
              (std::vector<std::string>{"surveyed", "interrupted", "interrupted", "interrupted"}));
}

// The run's processes and files die with the run and with their worker.
// Generous bound for the processes of a killed run to be gone: the
// documented one is a second.
constexpr double gc_GoneBound = 1.0 + gc_Margin;

// The survey's own process: the test's one child.
int surveyPid() {
    std::vector<int> const children = FleetTest::childrenOf(::getpid());
    return children.size() == 1 ? children.front() : -1;
}

// Waits up to the bound until no process of the console is left.
std::vector<std::string> processesLeftAfter(SimulatedConsole const& console, double bound) {
    double const until = FleetTest::monotonicSeconds() + bound;
    std::vector<std::string> left = FleetTest::processesOfConsole(console.logPath());
    while (!left.empty() && FleetTest::monotonicSeconds() < until) {
        std::this_thread::sleep_for(std::chrono::milliseconds(20));
        left = FleetTest::processesOfConsole(console.logPath());
    }
    return left;
}

TEST(FleetSupervision, KilledRunLeavesNoProcessAndNoTemporaryFile) {
    clearResultFolders();
    SimulatedConsole const console(listing(3) + "[runCmdOnPartition *]\n" + gc_Hang);
    QuorvexTest::TemporaryDirectory const work;
    SurveyProcess survey = startSurvey(work, "0");
    ASSERT_TRUE(waitForClientRuns(console, {"1", "2"})) << "partitions 1 and 2 never started";
    survey.signal(SIGKILL);
    EXPECT_EQ(survey.waitForExit(30.0), 128 + SIGKILL);
    EXPECT_EQ(processesLeftAfter(console, gc_GoneBound), std::vector<std::string>{})
        << "processes of the killed run left running";
    expectNothingLeft(console);
}

// -j 1: while partition 2 hangs, its worker is the survey's one child.
TEST(FleetSupervision, KilledWorkerIsRecordedAsDiedAndLeavesNothingBehind) {
    clearResultFolders();
    SimulatedConsole const console(listing(3) + "[runCmdOnPartition 2]\n" + gc_Hang +
                                   "[runCmdOnPartition *]\n" + gc_Answer + fetchAnswer());
    QuorvexTest::TemporaryDirectory const work;
    SurveyProcess survey({FleetTest::consoleWideTool(), "-j", "1", "--summary",
                          work.file("summary.json"), gc_Identity},
                         work.file("stdout"), work.file("stderr"));
    ASSERT_TRUE(waitForClientRuns(console, {"2"})) << "partition 2 never started";
    std::vector<int> const workers = FleetTest::childrenOf(surveyPid());
    ASSERT_EQ(workers.size(), 1u);
    EXPECT_EQ(::kill(workers.front(), SIGKILL), 0);
    EXPECT_EQ(survey.waitForExit(60.0), 4) << QuorvexTest::readFile(work.file("stderr"));
    expectNothingLeft(console);

    EXPECT_EQ(QuorvexTest::readFile(gc_VPD + std::string(gc_StatusFile)),
              "host1 [10.1.1.11] - VPD Survey - Ok\n"
              "host2 [10.1.1.12] - VPD Survey - Worker died - not surveyed\n"
              "host3 [10.1.1.13] - VPD Survey - Ok\n");
    EXPECT_EQ(QuorvexTest::readFile(work.file("stderr")),
              "0\n8\n0\n\nquorvexPYLON_VPD_Survey_ClientPartition ReturnCode: \n4");
    std::regex const reason(R"(The survey's worker was killed by SIGKILL after [0-9]+\.[0-9] s\.)");
    std::string const died = QuorvexTest::readFile(gc_VPD + document("2"));
    EXPECT_TRUE(std::regex_search(died, reason)) << died;
    FleetTest::SummaryFile const summary(work.file("summary.json"));
    EXPECT_EQ(summary.validationProblems(), "");
    EXPECT_EQ(summary.outcomes(),
              (std::vector<std::string>{"surveyed", "worker_died", "surveyed"}));
}

// The hung action and the helper it left hold only standard input, output
// and error: neither the trace piece nor a pipe of the run.
TEST(FleetSupervision, ActionsInheritOnlyTheStandardDescriptors) {
    clearResultFolders();
    SimulatedConsole const console(listing(1) + "[runCmdOnPartition *]\n" + gc_Hang);
    QuorvexTest::TemporaryDirectory const work;
    SurveyProcess survey = startSurvey(work, "0");
    ASSERT_TRUE(waitForClientRuns(console, {"1"})) << "partition 1 never started";
    int const worker = FleetTest::childrenOf(surveyPid()).at(0);
    std::vector<std::string> const actions = FleetTest::processesOfConsole(console.logPath());
    std::size_t checked = 0;
    // The shell keeps descriptors of its own for the redirections (10, 11).
    for (std::string const& action : actions) {
        int const pid = std::stoi(action);
        bool const isShell = action.find(" sh -c ") != std::string::npos;
        if (pid != worker && pid != surveyPid() && !isShell) {
            EXPECT_EQ(FleetTest::descriptorsOf(pid), (std::vector<int>{0, 1, 2})) << action;
            ++checked;
        }
    }
    EXPECT_GE(checked, 2u) << "the action and its helper";
    survey.signal(SIGTERM);
    EXPECT_EQ(survey.waitForExit(30.0), 128 + SIGTERM);
}

INSTANTIATE_TEST_SUITE_P(Signals, FleetInterruption, ::testing::Values(SIGINT, SIGTERM, SIGHUP),
                         [](::testing::TestParamInfo<int> const& info) {
                             return signalNameOf(info.param);
                         });

} // namespace
