// The progress line and the recap as a person meets them: quorvex-survey
// run on a pseudo-terminal (util-linux script) shows one line redrawn in
// place and erased before every output line, so that the final screen holds
// exactly the output lines, then the recap on rows of its own; when standard
// error is not a terminal, or with --quiet, not one byte of either appears.

#include "FleetTools.h"
#include "Lines.h"
#include "QuorvexTest.h"
#include "TerminalScreen.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <optional>
#include <regex>

namespace {

using FleetTest::gc_Identity;
using QuorvexTest::CommandResult;
using QuorvexTest::SimulatedConsole;

constexpr char gc_SecondIdentity[] = "5678-DEF_20FGHIJ";
constexpr std::size_t gc_Width = 300;

// Machines of six partitions whose client runs take 0.4 s each: a run of a
// few redraws.
std::string slowConsole() {
    std::string scenario = "[lspartition *]\nstdout ";
    for (int id = 1; id <= 6; ++id) {
        scenario += std::to_string(id) + ",10.1.1.1" + std::to_string(id) + ",3,host" +
                    std::to_string(id) + ",Zeph,7.2;";
    }
    return scenario +
           "\n[runCmdOnPartition 4]\nstdout Rc::1::RcCmd::0::RetStr1::timeout::RetStr2::\n"
           "exit 1\ndelay 0.4\n"
           "[runCmdOnPartition *]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\ndelay 0.4\n"
           "[getFileFromPartition *]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
           "document-nolf <fetched/>\n";
}

// A shell command line with each word in single quotes.
std::string quoted(std::vector<std::string> const& words) {
    std::string line;
    for (std::string const& word : words) {
        line += (line.empty() ? "'" : " '") + word + "'";
    }
    return line;
}

std::string surveyCommand(std::vector<std::string> const& options,
                          std::vector<std::string> const& identities = {gc_Identity}) {
    std::vector<std::string> words{FleetTest::consoleWideTool()};
    words.insert(words.end(), options.begin(), options.end());
    words.insert(words.end(), identities.begin(), identities.end());
    return quoted(words);
}

// Runs the shell command line on a pseudo-terminal; stdout holds every byte
// the terminal received.
CommandResult onTerminal(std::string const& commandLine) {
    QuorvexTest::clearFolder(QuorvexTest::gc_VPD_Folder);
    QuorvexTest::clearFolder(QuorvexTest::gc_TraceFolder);
    return QuorvexTest::runCommand({"script", "-qfec", commandLine, "/dev/null"});
}

// The lines of a text as a screen shows them: blanks at their end cannot be seen.
std::vector<std::string> shownLines(std::string const& text) {
    std::vector<std::string> lines = QuorvexTest::linesOf(text);
    for (std::string& line : lines) {
        line.erase(line.find_last_not_of(' ') + 1);
    }
    return lines;
}

// What the run writes to its standard output and error, both going to one
// file: the output lines in the order a terminal shows them.
std::vector<std::string> outputLines(std::string const& commandLine) {
    QuorvexTest::clearFolder(QuorvexTest::gc_VPD_Folder);
    QuorvexTest::clearFolder(QuorvexTest::gc_TraceFolder);
    return shownLines(QuorvexTest::runShell(commandLine + " 2>&1").stdoutText);
}

TEST(FleetProgress, LiveLineIsRedrawnAndErasedBeforeOutputLines) {
    SimulatedConsole const console(slowConsole());
    std::vector<std::string> const expected = outputLines(surveyCommand({"-j", "2"}));
    CommandResult const terminal = onTerminal(surveyCommand({"-j", "2", "--no-recap"}));
    EXPECT_EQ(terminal.exitStatus, 4) << terminal.stderrText;
    std::string const& bytes = terminal.stdoutText;
    EXPECT_NE(bytes.find("\r\033[K0/6 partitions done, 0 failed, "), std::string::npos)
        << "no progress line drawn: " << bytes;
    EXPECT_NE(bytes.find(" elapsed  "), std::string::npos) << bytes;
    EXPECT_NE(bytes.find("  longest host"), std::string::npos) << bytes;

    FleetTest::TerminalScreen screen(gc_Width);
    screen.write(bytes);
    EXPECT_EQ(screen.unknownSequences(), std::vector<std::string>{});
    EXPECT_EQ(screen.rows(), expected) << "the final screen holds exactly the output lines";
}

TEST(FleetProgress, WideLineIsErasedOnANarrowTerminalToo) {
    SimulatedConsole const console(slowConsole());
    std::vector<std::string> const expected = outputLines(surveyCommand({"-j", "2"}));
    CommandResult const terminal =
        onTerminal("stty cols 80; " + surveyCommand({"-j", "2", "--no-recap"}));
    FleetTest::TerminalScreen screen(80);
    screen.write(terminal.stdoutText);
    EXPECT_EQ(screen.rows(), expected) << "what an 80-column terminal shows at the end";
}

// One machine's block ends with its code and no line end; the next machine's
// first line follows on the same row, as with the one-machine tool.
TEST(FleetProgress, FinalScreenOfSeveralMachinesHoldsExactlyTheOutputLines) {
    SimulatedConsole const console(slowConsole());
    std::string const command =
        surveyCommand({"-j", "3", "--no-recap"}, {gc_Identity, gc_SecondIdentity});
    std::vector<std::string> const expected = outputLines(command);
    CommandResult const terminal = onTerminal(command);
    EXPECT_EQ(terminal.exitStatus, 4) << terminal.stderrText;
    FleetTest::TerminalScreen screen(gc_Width);
    screen.write(terminal.stdoutText);
    EXPECT_EQ(screen.rows(), expected) << "the final screen holds exactly the output lines";
}

// The first machine has one quick partition, the second one that takes
// 1.5 s: a while to watch after the first block has ended with its code.
std::string secondMachineSlowConsole() {
    return std::string("[lspartition ") + gc_SecondIdentity +
           "]\nstdout 7,10.1.1.17,3,host7,Zeph,7.2;\n"
           "[lspartition *]\nstdout 1,10.1.1.11,3,host1,Zeph,7.2;\n"
           "[runCmdOnPartition 7]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\ndelay 1.5\n"
           "[runCmdOnPartition *]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
           "[getFileFromPartition *]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
           "document-nolf <fetched/>\n";
}

TEST(FleetProgress, LineIsDrawnAgainBelowTheCodeAfterTheFirstMachinesBlock) {
    SimulatedConsole const console(secondMachineSlowConsole());
    std::string const command =
        surveyCommand({"-j", "2", "--no-recap"}, {gc_Identity, gc_SecondIdentity});
    std::vector<std::string> const expected = outputLines(command);
    CommandResult const terminal = onTerminal(command);
    EXPECT_EQ(terminal.exitStatus, 0) << terminal.stderrText;
    std::string const& bytes = terminal.stdoutText;
    std::size_t const firstCode = bytes.find("ReturnCode: \r\n0");
    ASSERT_NE(firstCode, std::string::npos) << bytes;
    EXPECT_NE(
        bytes.find("\n\r1/2 partitions done, 0 failed, 1 running  1/2 machines done  ", firstCode),
        std::string::npos)
        << "no progress line below the first machine's code: " << bytes;
    EXPECT_NE(bytes.find("\033[K\033[A\033[2G", firstCode), std::string::npos) << bytes;

    FleetTest::TerminalScreen screen(gc_Width);
    screen.write(bytes);
    EXPECT_EQ(screen.unknownSequences(), std::vector<std::string>{});
    EXPECT_EQ(screen.rows(), expected) << "the final screen holds exactly the output lines";
}

TEST(FleetProgress, NothingOfItWhenStandardErrorIsAFile) {
    SimulatedConsole const console(slowConsole());
    QuorvexTest::TemporaryDirectory const work;
    std::string const plainStderr =
        QuorvexTest::runShell(surveyCommand({"-j", "2"}) + " 2>/dev/null >/dev/null; " +
                              surveyCommand({"-j", "2"}) + " 2>&1 >/dev/null")
            .stdoutText;
    CommandResult const terminal =
        onTerminal(surveyCommand({"-j", "2"}) + " 2> '" + work.file("stderr") + "'");
    std::string const written = QuorvexTest::readFile(work.file("stderr"));
    EXPECT_EQ(written.find_first_of("\r\033"), std::string::npos) << written;
    EXPECT_EQ(written, plainStderr);
    EXPECT_EQ(terminal.stdoutText.find("machines "), std::string::npos) << terminal.stdoutText;
}

TEST(FleetProgress, NothingOfItWithQuiet) {
    SimulatedConsole const console(slowConsole());
    CommandResult const terminal = onTerminal(surveyCommand({"-j", "2", "--quiet"}));
    EXPECT_EQ(terminal.exitStatus, 4);
    EXPECT_EQ(terminal.stdoutText.find('\033'), std::string::npos) << terminal.stdoutText;
    EXPECT_EQ(terminal.stdoutText.find("machines "), std::string::npos) << terminal.stdoutText;
}

// The first machine's partition takes 1.5 s, the second machine's is
// quick: the second machine's survey ends long before its block can be
// written after the first one's.
std::string firstMachineSlowConsole() {
    return std::string("[lspartition ") + gc_SecondIdentity +
           "]\nstdout 7,10.1.1.17,3,host7,Zeph,7.2;\n"
           "[lspartition *]\nstdout 1,10.1.1.11,3,host1,Zeph,7.2;\n"
           "[runCmdOnPartition 1]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\ndelay 1.5\n"
           "[runCmdOnPartition *]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
           "[getFileFromPartition *]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
           "document-nolf <fetched/>\n";
}

TEST(FleetProgress, MachineCountsDoneWhenItsSurveyEndedBeforeItsBlockIsWritten) {
    SimulatedConsole const console(firstMachineSlowConsole());
    CommandResult const terminal =
        onTerminal(surveyCommand({"-j", "2", "--no-recap"}, {gc_Identity, gc_SecondIdentity}));
    EXPECT_EQ(terminal.exitStatus, 0) << terminal.stderrText;
    std::string const& bytes = terminal.stdoutText;
    std::size_t const firstBlock = bytes.find("VPD/");
    ASSERT_NE(firstBlock, std::string::npos) << bytes;
    EXPECT_NE(bytes.substr(0, firstBlock).find("  1/2 machines done  "), std::string::npos)
        << "the second machine was not counted done while the first one ran: " << bytes;
}

// Partition 3 hangs until the time limit stops it; the others take 0.3 s.
constexpr unsigned int gc_HangLimit = 4;

std::string hangingConsole() {
    std::string scenario = "[lspartition *]\nstdout ";
    for (int id = 1; id <= 5; ++id) {
        scenario += std::to_string(id) + ",10.1.1.1" + std::to_string(id) + ",3,host" +
                    std::to_string(id) + ",Zeph,7.2;";
    }
    return scenario + "\n[runCmdOnPartition 3]\nchild-delay 3600\ndelay 3600\n"
                      "[runCmdOnPartition *]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
                      "delay 0.3\n"
                      "[getFileFromPartition *]\nstdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
                      "document-nolf <fetched/>\n";
}

std::string hangingSurvey(std::size_t columns) {
    return "stty cols " + std::to_string(columns) + "; exec " +
           surveyCommand({"-j", "2", "-t", std::to_string(gc_HangLimit)});
}

// Every progress line drawn: the text after each "\r\033[K" or "\n\r" up to
// the next control byte.
std::vector<std::string> drawnLines(std::string const& bytes) {
    std::vector<std::string> lines;
    std::regex const start("\r\033\\[K|\n\r");
    for (std::sregex_iterator match(bytes.begin(), bytes.end(), start), end; match != end;
         ++match) {
        auto const from = static_cast<std::size_t>(match->position() + match->length());
        std::string const line = bytes.substr(from, bytes.find_first_of("\r\n\033", from) - from);
        if (!line.empty()) {
            lines.push_back(line);
        }
    }
    return lines;
}

// The time left a line shows, in seconds; nullopt when it shows none.
std::optional<long> shownSecondsLeft(std::string const& line) {
    std::smatch match;
    if (!std::regex_search(line, match, std::regex("(?:~|up to )([0-9]+) (s|min) left"))) {
        return std::nullopt;
    }
    return std::stol(match[1].str()) * (match[2].str() == "min" ? 60 : 1);
}

class FleetOnTerminal : public ::testing::TestWithParam<std::size_t> {};

// The hang's remote action started after its partition did, so it may
// still run at least the limit less the partition's time shown.
TEST_P(FleetOnTerminal, EstimateIsNeverBelowWhatTheHangMayStillTake) {
    std::size_t const columns = GetParam();
    SimulatedConsole const console(hangingConsole());
    CommandResult const terminal = onTerminal(hangingSurvey(columns));
    EXPECT_EQ(terminal.exitStatus, 4) << terminal.stderrText;
    std::regex const hang("longest host3 ([0-9]+) s");
    std::size_t checked = 0;
    for (std::string const& line : drawnLines(terminal.stdoutText)) {
        EXPECT_LT(line.size(), columns) << line;
        std::smatch match;
        std::optional<long> const left = shownSecondsLeft(line);
        if (!left || !std::regex_search(line, match, hang)) {
            continue;
        }
        ++checked;
        EXPECT_GE(*left, static_cast<long>(gc_HangLimit) - std::stol(match[1].str())) << line;
    }
    EXPECT_GT(checked, 0U) << "no line showed the hang with an estimate: " << terminal.stdoutText;
}

TEST_P(FleetOnTerminal, RecapFollowsTheLastBlockOnRowsOfItsOwn) {
    std::size_t const columns = GetParam();
    SimulatedConsole const console(hangingConsole());
    CommandResult const terminal = onTerminal(hangingSurvey(columns));
    FleetTest::TerminalScreen screen(columns);
    screen.write(terminal.stdoutText);
    std::vector<std::string> const rows = screen.rows();
    ASSERT_GE(rows.size(), 8U) << terminal.stdoutText;
    std::vector<std::string> const last(rows.end() - 8, rows.end());
    EXPECT_EQ(last[0], "quorvexPYLON_VPD_Survey_ClientPartition ReturnCode:");
    EXPECT_EQ(last[1], "4") << "the recap does not start on a row of its own";
    EXPECT_TRUE(std::regex_match(last[2], std::regex("quorvex-survey: 5 partitions of 1 machine in "
                                                     "00:00:0[0-9]")))
        << last[2];
    EXPECT_EQ(last[3], "  4 surveyed, 1 timed out");
    EXPECT_EQ(last[4], "  failed, by reason:");
    EXPECT_EQ(last[5], "    1 timed out: runCmdOnPartition stopped by the time limit");
    EXPECT_EQ(last[6], "      host3");
    EXPECT_TRUE(
        std::regex_match(last[7], std::regex("  longest: host3 [4-9] s, host[1245] [0-9]+ s, "
                                             "host[1245] [0-9]+ s")))
        << last[7];
}

// Ctrl-C typed on the terminal, once the hang has started: the terminal
// sends SIGINT to the survey.
TEST_P(FleetOnTerminal, CtrlCGivesARecapThatSaysInterruptedBySigint) {
    std::size_t const columns = GetParam();
    SimulatedConsole const console(hangingConsole());
    QuorvexTest::clearFolder(QuorvexTest::gc_VPD_Folder);
    QuorvexTest::clearFolder(QuorvexTest::gc_TraceFolder);
    std::string const typing = "(until grep -q 'PartitionId::3::' '" + console.logPath() +
                               "'; do sleep 0.1; done; sleep 0.5; printf '\\003'; sleep 0.2)";
    std::string const survey =
        "stty cols " + std::to_string(columns) + "; exec " + surveyCommand({"-j", "2", "-t", "0"});
    CommandResult const terminal =
        QuorvexTest::runShell(typing + " | script -qfec " + quoted({survey}) + " /dev/null");
    EXPECT_EQ(terminal.exitStatus, 130) << terminal.stderrText;
    FleetTest::TerminalScreen screen(columns);
    screen.write(terminal.stdoutText);
    std::vector<std::string> const rows = screen.rows();
    auto const headline = std::find_if(rows.begin(), rows.end(), [](std::string const& row) {
        return row.rfind("quorvex-survey: 5 partitions of 1 machine in ", 0) == 0;
    });
    ASSERT_NE(headline, rows.end()) << terminal.stdoutText;
    ASSERT_NE(headline + 1, rows.end());
    EXPECT_TRUE(
        std::regex_match(*(headline + 1), std::regex("  interrupted by SIGINT after [0-9] s")))
        << *(headline + 1);
    // A quick partition may have been in flight beside the hang.
    std::regex const stopped(
        "    [12] interrupted: runCmdOnPartition stopped when the run was interrupted");
    auto const group = std::find_if(rows.begin(), rows.end(), [&](std::string const& row) {
        return std::regex_match(row, stopped);
    });
    ASSERT_NE(group, rows.end()) << terminal.stdoutText;
    ASSERT_NE(group + 1, rows.end());
    EXPECT_EQ((group + 1)->rfind("      host3", 0), 0U) << *(group + 1);
}

INSTANTIATE_TEST_SUITE_P(Widths, FleetOnTerminal, ::testing::Values(80, 200),
                         [](::testing::TestParamInfo<std::size_t> const& info) {
                             return std::to_string(info.param) + "Columns";
                         });

// Where a script reads standard error, --recap still gives the recap, after
// the last block's code on a line of its own.
TEST(FleetProgress, RecapGoesToStandardErrorWhenAskedFor) {
    SimulatedConsole const console(slowConsole());
    CommandResult const run = QuorvexTest::runShell(surveyCommand({"-j", "2", "--recap"}));
    EXPECT_EQ(run.exitStatus, 4);
    std::string const& text = run.stderrText;
    std::size_t const recap =
        text.find("ReturnCode: \n4\nquorvex-survey: 6 partitions of 1 machine");
    EXPECT_NE(recap, std::string::npos) << text;
    EXPECT_NE(text.find("\n  5 surveyed, 1 channel failure\n"), std::string::npos) << text;
    EXPECT_EQ(text.find('\033'), std::string::npos) << text;
}

} // namespace
