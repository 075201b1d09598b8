// The progress line as a person meets it: quorvex-survey run on a
// pseudo-terminal (util-linux script) shows one line redrawn in place and
// erased before every output line, so that the final screen holds exactly
// the output lines; when standard error is not a terminal, or with --quiet,
// not one byte of it appears.

#include "FleetTools.h"
#include "Lines.h"
#include "QuorvexTest.h"
#include "TerminalScreen.h"

#include <gtest/gtest.h>

namespace {

using QuorvexTest::CommandResult;
using QuorvexTest::SimulatedConsole;

constexpr char gc_Identity[] = "1234-ABC_10ABCDE";
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
    CommandResult const terminal = onTerminal(surveyCommand({"-j", "2"}));
    EXPECT_EQ(terminal.exitStatus, 4) << terminal.stderrText;
    std::string const& bytes = terminal.stdoutText;
    EXPECT_NE(bytes.find("\r\033[Kmachines 0/1  partitions "), std::string::npos)
        << "no progress line drawn: " << bytes;
    EXPECT_NE(bytes.find(" elapsed, ~"), std::string::npos) << bytes;
    EXPECT_NE(bytes.find("  longest: 1234-ABC_10ABCDE-"), std::string::npos) << bytes;

    FleetTest::TerminalScreen screen(gc_Width);
    screen.write(bytes);
    EXPECT_EQ(screen.unknownSequences(), std::vector<std::string>{});
    EXPECT_EQ(screen.rows(), expected) << "the final screen holds exactly the output lines";
}

TEST(FleetProgress, WideLineIsErasedOnANarrowTerminalToo) {
    SimulatedConsole const console(slowConsole());
    std::vector<std::string> const expected = outputLines(surveyCommand({"-j", "2"}));
    CommandResult const terminal = onTerminal("stty cols 80; " + surveyCommand({"-j", "2"}));
    FleetTest::TerminalScreen screen(80);
    screen.write(terminal.stdoutText);
    EXPECT_EQ(screen.rows(), expected) << "what an 80-column terminal shows at the end";
}

// One machine's block ends with its code and no line end; the next machine's
// first line follows on the same row, as with the one-machine tool.
TEST(FleetProgress, FinalScreenOfSeveralMachinesHoldsExactlyTheOutputLines) {
    SimulatedConsole const console(slowConsole());
    std::string const command = surveyCommand({"-j", "3"}, {gc_Identity, gc_SecondIdentity});
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
    std::string const command = surveyCommand({"-j", "2"}, {gc_Identity, gc_SecondIdentity});
    std::vector<std::string> const expected = outputLines(command);
    CommandResult const terminal = onTerminal(command);
    EXPECT_EQ(terminal.exitStatus, 0) << terminal.stderrText;
    std::string const& bytes = terminal.stdoutText;
    std::size_t const firstCode = bytes.find("ReturnCode: \r\n0");
    ASSERT_NE(firstCode, std::string::npos) << bytes;
    EXPECT_NE(bytes.find("\n\rmachines 1/2  partitions 1 ok 0 failed 1 running /2  ", firstCode),
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

} // namespace
