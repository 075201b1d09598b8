#include "utility/ShellCommand.h"

#include "utility/StringUtility.h"
#include "utility/Trace.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <chrono>
#include <csignal>
#include <iostream>
#include <regex>
#include <string>
#include <sys/wait.h>
#include <unistd.h>
#include <vector>

namespace {

using Lines = std::vector<std::string>;

constexpr unsigned int gc_LineLimit = 65533;

class ShellCommandTest : public ::testing::Test {
protected:
    void SetUp() override { _scratch = QuorvexTest::scratchDirectory(); }
    void TearDown() override { QuorvexTest::removeScratchDirectory(); }

    std::string path(std::string const& name) const { return _scratch + "/" + name; }

    // Lines read from a file holding exactly content.
    Lines readBack(std::string const& content, unsigned int* count = nullptr) const {
        QuorvexTest::writeFile(path("output"), content);
        Lines lines;
        unsigned int const result = Utility::ShellCommand::_readOutput(path("output"), lines);
        if (count != nullptr) {
            *count = result;
        }
        return lines;
    }

    std::string _scratch;
};

bool isTemporaryName(std::string const& name) {
    return std::regex_match(name, std::regex("/tmp/ShellCommand\\.[A-Za-z0-9]{6}"));
}

// --- runs ---

TEST_F(ShellCommandTest, NewCommandHasNotRunAndHoldsNoLines) {
    Utility::ShellCommand command("true");
    EXPECT_FALSE(command.wasExecuted());
    EXPECT_EQ(command.get_ReturnCode(), 0);
    EXPECT_TRUE(command.get_stdout().empty());
    EXPECT_TRUE(command.get_stderr().empty());
    EXPECT_EQ(command.stdout_begin(), command.stdout_end());
    EXPECT_EQ(command.stderr_begin(), command.stderr_end());
}

TEST_F(ShellCommandTest, OneWordWithLineEndGivesWordAndEmptyEntry) {
    Utility::ShellCommand command("echo word");
    EXPECT_EQ(command.execute(), 0);
    EXPECT_TRUE(command.wasExecuted());
    EXPECT_EQ(command.get_ReturnCode(), 0);
    EXPECT_EQ(command.get_stdout(), (Lines{"word", ""}));
    EXPECT_EQ(command.get_stderr(), (Lines{""}));
}

TEST_F(ShellCommandTest, CommandPrintingNothingGivesOneEmptyEntry) {
    Utility::ShellCommand command("true");
    EXPECT_EQ(command.execute(), 0);
    EXPECT_EQ(command.get_stdout(), (Lines{""}));
    EXPECT_EQ(command.get_stderr(), (Lines{""}));
}

TEST_F(ShellCommandTest, ExitStatusThreeThenSecondExecuteReturnsMinusOneAndKeepsThree) {
    Utility::ShellCommand command("exit 3");
    EXPECT_EQ(command.execute(), 3);
    EXPECT_EQ(command.get_ReturnCode(), 3);
    Lines const firstOutput = command.get_stdout();
    EXPECT_EQ(command.execute(), -1);
    EXPECT_EQ(command.get_ReturnCode(), 3);
    EXPECT_TRUE(command.wasExecuted());
    EXPECT_EQ(command.get_stdout(), firstOutput);
    EXPECT_EQ(command.get_stderr(), (Lines{""}));
}

TEST_F(ShellCommandTest, ExecuteOnlyOnceOffTwoRunsGiveFourEntries) {
    Utility::ShellCommand command("echo line");
    EXPECT_TRUE(command.set_ExecuteOnlyOnce(false));
    EXPECT_EQ(command.execute(), 0);
    EXPECT_EQ(command.execute(), 0);
    EXPECT_EQ(command.get_stdout(), (Lines{"line", "", "line", ""}));
    EXPECT_EQ(command.get_stderr(), (Lines{"", ""}));
}

TEST_F(ShellCommandTest, ExecuteOnlyOnceOffReplacesReturnCode) {
    std::string const marker = path("marker");
    Utility::ShellCommand command("test -e " + marker + " && exit 5; touch " + marker);
    command.set_ExecuteOnlyOnce(false);
    EXPECT_EQ(command.execute(), 0);
    EXPECT_EQ(command.execute(), 5);
    EXPECT_EQ(command.get_ReturnCode(), 5);
}

TEST_F(ShellCommandTest, SetExecuteOnlyOnceReturnsPreviousValue) {
    Utility::ShellCommand command("true");
    EXPECT_TRUE(command.set_ExecuteOnlyOnce(false));
    EXPECT_FALSE(command.set_ExecuteOnlyOnce(false));
    EXPECT_FALSE(command.set_ExecuteOnlyOnce(true));
    EXPECT_TRUE(command.set_ExecuteOnlyOnce(true));
}

TEST_F(ShellCommandTest, ExitStatus255IsKept) {
    Utility::ShellCommand command("exit 255");
    EXPECT_EQ(command.execute(), 255);
}

TEST_F(ShellCommandTest, CommandNotFoundGives127AndShellMessageOnStderr) {
    Utility::ShellCommand command("/nonexistent/quorvex-no-such-tool");
    EXPECT_EQ(command.execute(), 127);
    EXPECT_EQ(command.get_stdout(), (Lines{""}));
    ASSERT_EQ(command.get_stderr().size(), 2u);
    EXPECT_NE(command.get_stderr()[0].find("/nonexistent/quorvex-no-such-tool"), std::string::npos);
    EXPECT_NE(command.get_stderr()[0].find("not found"), std::string::npos);
    EXPECT_EQ(command.get_stderr()[1], "");
}

TEST_F(ShellCommandTest, StandardErrorIsCapturedSeparately) {
    Utility::ShellCommand command(R"(sh -c "printf 'out\n'; printf 'e1\ne2' >&2")");
    EXPECT_EQ(command.execute(), 0);
    EXPECT_EQ(command.get_stdout(), (Lines{"out", ""}));
    EXPECT_EQ(command.get_stderr(), (Lines{"e1", "e2"}));
}

TEST_F(ShellCommandTest, IteratorsWalkTheLineSequences) {
    Utility::ShellCommand command("sh -c \"echo a; echo b >&2\"");
    command.execute();
    EXPECT_EQ(Lines(command.stdout_begin(), command.stdout_end()), (Lines{"a", ""}));
    EXPECT_EQ(Lines(command.stderr_begin(), command.stderr_end()), (Lines{"b", ""}));
}

// A command killed by a signal has no exit status in the second byte: the
// shifted result reads 0.
TEST_F(ShellCommandTest, CommandKilledBySignalReadsAsZero) {
    Utility::ShellCommand command("kill -9 $$");
    EXPECT_EQ(command.execute(), 0);
    EXPECT_TRUE(command.wasExecuted());
}

TEST_F(ShellCommandTest, RedirectionsApplyToTheCommandTextAsGiven) {
    // Nothing is quoted or grouped: the redirections bind to the last simple
    // command of the text only.
    Utility::ShellCommand command("echo first > " + path("first") + "; echo second");
    EXPECT_EQ(command.execute(), 0);
    EXPECT_EQ(command.get_stdout(), (Lines{"second", ""}));
    EXPECT_EQ(QuorvexTest::readFile(path("first")), "first\n");
}

TEST_F(ShellCommandTest, AppendCommandAddsTextWithoutBlank) {
    Utility::ShellCommand command("echo ab");
    command.append_Command("cd");
    command.append_Command(" -t0");
    EXPECT_EQ(command.execute(), 0);
    EXPECT_EQ(command.get_stdout(), (Lines{"abcd -t0", ""}));
}

TEST_F(ShellCommandTest, TemporaryFilesOfRunAreInTmpAndRemovedAfterwards) {
    // readlink prints where its own standard output and error lead.
    Utility::ShellCommand command("readlink /proc/self/fd/1 /proc/self/fd/2");
    EXPECT_EQ(command.execute(), 0);
    Lines const& names = command.get_stdout();
    ASSERT_EQ(names.size(), 3u);
    EXPECT_TRUE(isTemporaryName(names[0])) << names[0];
    EXPECT_TRUE(isTemporaryName(names[1])) << names[1];
    EXPECT_NE(names[0], names[1]);
    EXPECT_FALSE(QuorvexTest::fileExists(names[0]));
    EXPECT_FALSE(QuorvexTest::fileExists(names[1]));
}

TEST_F(ShellCommandTest, TemporarySettersHaveNoEffect) {
    Utility::ShellCommand command("readlink /proc/self/fd/1 /proc/self/fd/2");
    command.set_Temporary_Directory(_scratch);
    command.set_Temporary_BaseFileName("Other");
    Utility::ShellCommand::set_Default_Directory(_scratch);
    Utility::ShellCommand::set_Default_BaseFileName("Other");
    EXPECT_EQ(std::string(Utility::ShellCommand::ms_Default_Directory), "/tmp");
    EXPECT_EQ(std::string(Utility::ShellCommand::ms_Default_BaseFileName), "ShellCommand");
    EXPECT_EQ(command.execute(), 0);
    ASSERT_EQ(command.get_stdout().size(), 3u);
    EXPECT_TRUE(isTemporaryName(command.get_stdout()[0])) << command.get_stdout()[0];
    EXPECT_TRUE(isTemporaryName(command.get_stdout()[1])) << command.get_stdout()[1];

    Utility::ShellCommand later("readlink /proc/self/fd/1");
    EXPECT_EQ(later.execute(), 0);
    EXPECT_TRUE(isTemporaryName(later.get_stdout()[0])) << later.get_stdout()[0];
}

TEST_F(ShellCommandTest, LineLongerThanLimitEndsReadingWithoutHanging) {
    // 200 KB on one line, then more lines the reader never gets to.
    Utility::ShellCommand command("sh -c \"head -c 200000 /dev/zero | tr '\\\\000' x; echo; "
                                  "echo after\"");
    auto const start = std::chrono::steady_clock::now();
    EXPECT_EQ(command.execute(), 0);
    auto const elapsed = std::chrono::steady_clock::now() - start;
    EXPECT_EQ(command.get_stdout(), (Lines{std::string(gc_LineLimit, 'x')}));
    EXPECT_LT(elapsed, std::chrono::seconds(30));
}

// A shell whose children are reaped automatically cannot report a status:
// system fails with -1, which the shift keeps.
TEST_F(ShellCommandTest, SystemFailureKeepsMinusOne) {
    QuorvexTest::runInFreshProcess([] {
        std::signal(SIGCHLD, SIG_IGN);
        Utility::ShellCommand command("true");
        int const result = command.execute();
        if (result != -1 || command.get_ReturnCode() != -1 || !command.wasExecuted()) {
            std::cerr << "execute " << result << ", code " << command.get_ReturnCode()
                      << ", executed " << command.wasExecuted() << "\n";
            return 1;
        }
        return 0;
    });
}

// --- reading output files ---

TEST_F(ShellCommandTest, ReadOutputTwoEndedLinesGiveTrailingEmptyEntry) {
    unsigned int count = 0;
    EXPECT_EQ(readBack("a\nb\n", &count), (Lines{"a", "b", ""}));
    EXPECT_EQ(count, 3u);
}

TEST_F(ShellCommandTest, ReadOutputEmptyFileGivesOneEmptyEntry) {
    unsigned int count = 0;
    EXPECT_EQ(readBack("", &count), (Lines{""}));
    EXPECT_EQ(count, 1u);
}

TEST_F(ShellCommandTest, ReadOutputLastLineWithoutLineEndIsKeptWhole) {
    unsigned int count = 0;
    EXPECT_EQ(readBack("a\nb", &count), (Lines{"a", "b"}));
    EXPECT_EQ(count, 2u);
}

TEST_F(ShellCommandTest, ReadOutputLoneLineEndGivesTwoEmptyEntries) {
    EXPECT_EQ(readBack("\n"), (Lines{"", ""}));
}

TEST_F(ShellCommandTest, ReadOutputNulByteEndsTheLineText) {
    EXPECT_EQ(readBack(std::string("a\0b\nc\n", 6)), (Lines{"a", "c", ""}));
}

TEST_F(ShellCommandTest, ReadOutputAppendsToExistingLines) {
    QuorvexTest::writeFile(path("output"), "a\n");
    Lines lines{"old"};
    EXPECT_EQ(Utility::ShellCommand::_readOutput(path("output"), lines), 3u);
    EXPECT_EQ(lines, (Lines{"old", "a", ""}));
}

TEST_F(ShellCommandTest, ReadOutputUnreadableFileReturnsZeroAndLeavesLines) {
    Lines lines{"old"};
    EXPECT_EQ(Utility::ShellCommand::_readOutput(path("missing"), lines), 0u);
    EXPECT_EQ(lines, (Lines{"old"}));
}

TEST_F(ShellCommandTest, ReadOutputLineOfExactlyLimitIsKept) {
    std::string const line(gc_LineLimit, 'x');
    EXPECT_EQ(readBack(line + "\nz\n"), (Lines{line, "z", ""}));
}

TEST_F(ShellCommandTest, ReadOutputLineOneOverLimitKeepsLimitAndStops) {
    EXPECT_EQ(readBack(std::string(gc_LineLimit + 1, 'x') + "\nz\n"),
              (Lines{std::string(gc_LineLimit, 'x')}));
}

TEST_F(ShellCommandTest, ReadOutputLinesBeforeLongLineAreUnaffected) {
    EXPECT_EQ(readBack("a\n\nb\n" + std::string(200000, 'y') + "\nafter\n"),
              (Lines{"a", "", "b", std::string(gc_LineLimit, 'y')}));
}

TEST_F(ShellCommandTest, ReadOutputLongLastLineWithoutLineEnd) {
    EXPECT_EQ(readBack(std::string(gc_LineLimit + 10, 'y')),
              (Lines{std::string(gc_LineLimit, 'y')}));
}

// The file is read in blocks; lines do not care where a block ends.
TEST_F(ShellCommandTest, ReadOutputLinesAcrossReadBlocksAreKeptWhole) {
    std::string const first(20000, 'a');
    std::string const second(8191, 'b');
    EXPECT_EQ(readBack(first + "\n" + second + "\nc"), (Lines{first, second, "c"}));
}

TEST_F(ShellCommandTest, ReadOutputNulByteInLaterBlockEndsTheLineText) {
    std::string const text(10000, 'a');
    EXPECT_EQ(readBack(text + std::string(1, '\0') + std::string(9000, 'b') + "\nc"),
              (Lines{text, "c"}));
}

// The limit counts the bytes read, not the text kept before a NUL byte.
TEST_F(ShellCommandTest, ReadOutputBytesAfterNulByteCountTowardTheLimit) {
    std::string const line = "a" + std::string(1, '\0') + std::string(gc_LineLimit - 1, 'b');
    EXPECT_EQ(readBack(line + "\nz\n"), (Lines{"a"}));
}

TEST_F(ShellCommandTest, ReadOutputLimitReachedInLaterBlockKeepsLimitAndStops) {
    std::string const line(gc_LineLimit, 'x');
    EXPECT_EQ(readBack("a\n" + line + "y\nz\n"), (Lines{"a", line}));
}

// A folder opens but gives nothing to read: the read that meets its end
// appends the one empty entry.
TEST_F(ShellCommandTest, ReadOutputOfFolderGivesOneEmptyEntry) {
    Lines lines;
    EXPECT_EQ(Utility::ShellCommand::_readOutput(_scratch, lines), 1u);
    EXPECT_EQ(lines, (Lines{""}));
}

// A survey may run in many processes at once, each with its own commands in
// the same /tmp.
TEST_F(ShellCommandTest, ManyProcessesRunningCommandsAtOnceEachReadTheirOwnOutput) {
    constexpr int gc_Processes = 8;
    constexpr int gc_RunsPerProcess = 25;
    std::vector<pid_t> children;
    for (int process = 0; process < gc_Processes; ++process) {
        pid_t const child = ::fork();
        ASSERT_GE(child, 0);
        if (child == 0) {
            int wrong = 0;
            for (int run = 0; run < gc_RunsPerProcess; ++run) {
                std::string const word =
                    "process" + std::to_string(process) + "-run" + std::to_string(run);
                Utility::ShellCommand command(
                    StringUtility::concatenate({"sh -c 'echo ", word, "; echo ", word, " >&2'"}));
                wrong += command.execute() != 0 || command.get_stdout() != Lines{word, ""} ||
                         command.get_stderr() != Lines{word, ""};
            }
            ::_exit(wrong == 0 ? 0 : 1);
        }
        children.push_back(child);
    }
    for (pid_t const child : children) {
        int status = -1;
        ASSERT_EQ(::waitpid(child, &status, 0), child);
        EXPECT_TRUE(WIFEXITED(status) && WEXITSTATUS(status) == 0) << "status " << status;
    }
}

} // namespace
