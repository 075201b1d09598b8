// Console tools that print huge output: one line of 10 MiB, or 500,000 lines.
// The shell command runner keeps at most 65533 characters of a line and then
// stops reading that output, so a 10 MiB line must act exactly as its first
// 65533 characters would, at no more memory. Every line of a long output is
// kept (and traced), so memory grows with the number of lines, within the
// bound given below, and the run still ends with every partition's status
// line.
//
// Each huge run is compared, byte for byte, with a reference run whose
// console prints what the runner is specified to keep. The console tool that
// prints the huge output is a shell script, so that only the survey tool
// itself, and no console tool, holds much memory.

#include "FaultRun.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

namespace {

constexpr char gc_Identity[] = "1234-ABC_10ABCDE";
constexpr char gc_Listing[] = "/opt/vtc/bin/lspartition";
constexpr char gc_RemoteAction[] = "/usr/bin/runact-api";
constexpr char gc_Prefix[] = "VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE";
constexpr char gc_StatusFile[] = "quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE.status";
using QuorvexTest::gc_ReturnCodeHeading;

constexpr long gc_KiB = 1024;
constexpr long gc_TenMiB = 10 * gc_KiB * gc_KiB;
// The characters of one line that the shell command runner keeps.
constexpr long gc_KeptCharacters = 65533;
constexpr long gc_ManyLines = 500000;
// Page-level noise between two runs doing the same work.
constexpr long gc_SlackKiB = 4 * gc_KiB;
// Sanitizer builds pad and quarantine heap blocks by design, which makes
// their footprint no measure of the tool's.
constexpr bool gc_MeasuresMemory = !QUORVEX_SANITIZED;

// Partition 1 active, partition 2 inactive.
constexpr char gc_ListingRecords[] = "1,10.1.1.11,3,host1,Zeph,7.2;2,10.1.1.12,1,host2,Zeph,7.2;";
constexpr char gc_Success[] = "Rc::0::RcCmd::0::RetStr1::done::RetStr2::";
constexpr char gc_SurveyedConsole[] = "[runCmdOnPartition *]\n"
                                      "stdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
                                      "[getFileFromPartition *]\n"
                                      "stdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
                                      "document-nolf <fetched/>\n";

// Partition 1 surveyed, partition 2 inactive.
constexpr char gc_OneSurveyedStdout[] =
    "VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE-1.VPD.xml\n";
constexpr char gc_OneSurveyedStderr[] =
    "0\n\nquorvexPYLON_VPD_Survey_ClientPartition ReturnCode: \n4";
constexpr char gc_OneSurveyedStatus[] =
    "host1 [10.1.1.11] - VPD Survey - Ok\n"
    "host2 [10.1.1.12] - VPD Survey - Failed - Active Status < 3\n";

std::string u_script(std::string const& body) {
    return "#!/bin/sh\n" + body;
}

// Shell text printing the text as it is, then count copies of c.
std::string u_print_Padded(std::string const& text, long count, char c) {
    return "printf '%s' '" + text + "'\nhead -c " + std::to_string(count) +
           " /dev/zero | tr '\\0' " + c + "\n";
}

// A line of length characters that starts with text: with a line end for
// the huge run, cut to the kept characters without line end for the
// reference.
std::string u_print_Line(std::string const& text, long length, char c) {
    long const size = static_cast<long>(text.size());
    return length > gc_KeptCharacters ? u_print_Padded(text, length - size, c) + "echo\n"
                                      : u_print_Padded(text, gc_KeptCharacters - size, c);
}

// The remote action tool: the client run on partition 1 succeeds, on
// partition 2 it fails with RcCmd 7, every fetch fails with Rc 4 and exit 1;
// each answer one line of the given length.
std::string u_remoteAction_Script(long length) {
    return u_script("case \"$*\" in\n"
                    "*runCmdOnPartition*PartitionId::2::*)\n" +
                    u_print_Line("Rc::0::RcCmd::7::RetStr1::", length, 'y') +
                    ";;\n"
                    "*runCmdOnPartition*)\n" +
                    u_print_Line(gc_Success, length, 'x') +
                    ";;\n"
                    "*)\n" +
                    u_print_Line("Rc::4::RcCmd::0::RetStr1::", length, 'z') +
                    "exit 1\n"
                    ";;\n"
                    "esac\n");
}

// Shell text printing the first line, then lines - 1 further lines.
std::string u_print_Lines(std::string const& first, long lines, std::string const& further) {
    return "printf '%s\\n' '" + first + "'\nyes '" + further + "' | head -n " +
           std::to_string(lines - 1) + "\n";
}

// The remote action tool: the client run answers success on a first line
// followed by lines - 1 further lines, the fetch succeeds.
std::string u_longRemoteAction_Script(long lines) {
    return u_script("case \"$*\" in\n"
                    "*runCmdOnPartition*)\n" +
                    u_print_Lines(gc_Success, lines, "more") +
                    ";;\n"
                    "*)\n"
                    "echo '" +
                    gc_Success +
                    "'\n"
                    ";;\n"
                    "esac\n");
}

std::string u_further_Lines(std::string const& line) {
    std::string further;
    for (long i = 1; i < gc_ManyLines; ++i) {
        further += line + "\n";
    }
    return further;
}

std::string u_replace_First(std::string text, std::string const& from, std::string const& to) {
    std::size_t const at = text.find(from);
    return at == std::string::npos ? text : text.replace(at, from.size(), to);
}

class HugeConsoleOutput : public ::testing::Test {
protected:
    // Surveys the machine twice against the console, with the console tool
    // at toolPath being the huge script in one run and the reference script
    // in the other. False when no sandbox can be made: the test is skipped.
    bool runBoth(std::string const& console, std::string const& toolPath,
                 std::string const& hugeScript, std::string const& referenceScript) {
        _huge = std::make_unique<FaultRun>(console);
        _reference = std::make_unique<FaultRun>(console);
        _huge->replaceTool(toolPath, hugeScript);
        _reference->replaceTool(toolPath, referenceScript);
        _huge->measurePeakMemory();
        _reference->measurePeakMemory();
        _hugeResult = _huge->run(gc_Identity);
        _referenceResult = _reference->run(gc_Identity);
        return FaultRun::ranInSandbox(_hugeResult);
    }

    // The huge run ends as specified, and as the reference run, whose trace
    // may differ.
    void expectOutcome(std::string const& stdoutText, std::string const& stderrText,
                       std::string const& status) const {
        EXPECT_NE(_hugeResult.exitStatus, FaultRun::gc_TimedOut)
            << "the run did not end within " << FaultRun::gc_TimeLimit << " s";
        EXPECT_EQ(_hugeResult.exitStatus, 2);
        EXPECT_EQ(_hugeResult.stdoutText, stdoutText);
        EXPECT_EQ(_hugeResult.stderrText, stderrText);
        EXPECT_EQ(_huge->vpdFile(gc_StatusFile), status);
        EXPECT_EQ(_referenceResult.exitStatus, 2);
        EXPECT_EQ(_referenceResult.stdoutText, stdoutText);
        EXPECT_EQ(_referenceResult.stderrText, stderrText);
        std::vector<std::string> const files = _huge->vpdFiles();
        ASSERT_EQ(files, _reference->vpdFiles());
        for (std::string const& name : files) {
            EXPECT_EQ(_huge->vpdFile(name), _reference->vpdFile(name)) << name;
        }
        EXPECT_EQ(_huge->calls(), _reference->calls());
        EXPECT_EQ(_huge->leftInTmp(), std::vector<std::string>{});
    }

    // The trace of the reference run with the further lines placed after
    // the first line of the long output.
    void expectTraceWithFurtherLines(std::string const& firstLine,
                                     std::string const& furtherLine) const {
        std::string const first = "\n" + firstLine + "\n";
        EXPECT_TRUE(_huge->trace() == u_replace_First(_reference->trace(), first,
                                                      first + u_further_Lines(furtherLine)))
            << "the trace is not the reference trace with the further lines";
    }

    void expectPeakMemoryWithin(long extraKiB) {
        if (!gc_MeasuresMemory) {
            return;
        }
        long const peak = _huge->peakMemoryKiB();
        long const referencePeak = _reference->peakMemoryKiB();
        ASSERT_GT(referencePeak, 0);
        RecordProperty("PeakKiB", std::to_string(peak));
        RecordProperty("ReferencePeakKiB", std::to_string(referencePeak));
        EXPECT_LE(peak, referencePeak + extraKiB + gc_SlackKiB)
            << "reference run: " << referencePeak << " KiB";
    }

    FaultRun const& huge() const { return *_huge; }
    FaultRun const& reference() const { return *_reference; }

private:
    std::unique_ptr<FaultRun> _huge;
    std::unique_ptr<FaultRun> _reference;
    QuorvexTest::CommandResult _hugeResult;
    QuorvexTest::CommandResult _referenceResult;
};

// The listing's tenth MiB is never read: the kept characters hold partition
// 1 (tried and surveyed), partition 2 (inactive) and a record made of the
// rest, a partition ID of x without any other field (inactive). Holding the
// whole line would take 10 MiB more than the reference run.
TEST_F(HugeConsoleOutput, ListingOfOneTenMiBLineActsAsItsFirst65533CharactersAtNoMoreMemory) {
    if (!runBoth(gc_SurveyedConsole, gc_Listing,
                 u_script(u_print_Line(gc_ListingRecords, gc_TenMiB, 'x')),
                 u_script(u_print_Line(gc_ListingRecords, gc_KeptCharacters, 'x')))) {
        return;
    }
    expectOutcome(gc_OneSurveyedStdout, gc_OneSurveyedStderr,
                  std::string(gc_OneSurveyedStatus) +
                      " [] - VPD Survey - Failed - Active Status < 3\n");
    EXPECT_EQ(huge().trace(), reference().trace());
    expectPeakMemoryWithin(0);
}

TEST_F(HugeConsoleOutput, RemoteActionLinesOfTenMiBActAsTheirFirst65533CharactersAtNoMoreMemory) {
    if (!runBoth("[lspartition 1234-ABC_10ABCDE]\n"
                 "stdout 1,10.1.1.11,3,host1,Zeph,7.2;2,10.1.1.12,3,host2,Zeph,7.2;\n",
                 gc_RemoteAction, u_remoteAction_Script(gc_TenMiB),
                 u_remoteAction_Script(gc_KeptCharacters))) {
        return;
    }
    expectOutcome(std::string(gc_Prefix) + "-1.VPD.xml\n" + gc_Prefix + "-2.VPD.xml\n",
                  std::string("8\n8\n") + gc_ReturnCodeHeading + "8",
                  "host1 [10.1.1.11] - VPD Survey - 4et result Failed, rc = \n"
                  "host2 [10.1.1.12] - VPD Survey - Partition Failed, RcCmd = 7\n");
    // The reason holds the client's RetStr1 as far as the line was kept.
    std::string const keptValue = "[RetStr1] = " + std::string(gc_KeptCharacters - 26, 'y') + "\n";
    EXPECT_NE(huge()
                  .vpdFile("quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE-2.VPD.xml")
                  .find(keptValue),
              std::string::npos);
    EXPECT_EQ(huge().trace(), reference().trace());
    expectPeakMemoryWithin(0);
}

// Only the first line of the listing counts; every further line is kept by
// the runner and traced. Each kept line is one string object of 32 bytes
// (short lines are stored inside it) in a vector that doubles its capacity,
// so up to three such objects per line while it moves: 96 bytes a line.
TEST_F(HugeConsoleOutput, ListingOf500000LinesUsesItsFirstLineAndKeepsMemoryLinearInLines) {
    if (!runBoth(gc_SurveyedConsole, gc_Listing,
                 u_script(u_print_Lines(gc_ListingRecords, gc_ManyLines, "not a record")),
                 u_script(u_print_Lines(gc_ListingRecords, 1, "")))) {
        return;
    }
    expectOutcome(gc_OneSurveyedStdout, gc_OneSurveyedStderr, gc_OneSurveyedStatus);
    expectTraceWithFurtherLines(gc_ListingRecords, "not a record");
    expectPeakMemoryWithin(gc_ManyLines * 96 / gc_KiB);
}

// Only the first line of the client run's output is its return code; every
// further line is kept by the runner, copied into the channel's output (the
// exit code is 0) and, being non-empty, parsed into a return code of its own
// holding one key. Per line: two string objects of 32 bytes, a return code
// object and one map node with two strings, about 250 bytes with the
// allocator's headers; vectors doubling their capacity while they move add
// half as much again: 512 bytes a line.
TEST_F(HugeConsoleOutput, RemoteActionOutputOf500000LinesUsesItsFirstLineAndKeepsMemoryLinear) {
    if (!runBoth("[lspartition 1234-ABC_10ABCDE]\n"
                 "stdout 1,10.1.1.11,3,host1,Zeph,7.2;2,10.1.1.12,1,host2,Zeph,7.2;\n",
                 gc_RemoteAction, u_longRemoteAction_Script(gc_ManyLines),
                 u_longRemoteAction_Script(1))) {
        return;
    }
    expectOutcome(gc_OneSurveyedStdout, gc_OneSurveyedStderr, gc_OneSurveyedStatus);
    expectTraceWithFurtherLines(gc_Success, "more");
    expectPeakMemoryWithin(gc_ManyLines * 512 / gc_KiB);
}

} // namespace
