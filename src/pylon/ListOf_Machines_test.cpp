// Runs inside the sandbox: /opt/lsvtc/bin/lsvtc is the simulated console.

#include "pylon/ListOf_Machines.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <vector>

using Quorvex::PYLON::ListOf_Machines;
using QuorvexTest::describe;
using QuorvexTest::SimulatedConsole;
using Strings = std::vector<std::string>;

namespace {

// The machines as the console of the scenario lists them.
Strings machinesWith(std::string const& scenario) {
    SimulatedConsole const console(scenario);
    return describe(ListOf_Machines());
}

// The machines parsed from one listing line printed by the console.
Strings machinesFromLine(std::string const& line) {
    return machinesWith("[lsvtc]\nstdout " + line + "\n");
}

} // namespace

TEST(ListOf_Machines, RunsTheListingToolOnceWithOptionT0) {
    SimulatedConsole const console("[lsvtc]\nstdout 0:1234-ABC_10ABCDE;\n");
    ListOf_Machines const machines;
    EXPECT_EQ(console.invocations(), (std::vector<QuorvexTest::Invocation>{{"lsvtc", "-t0"}}));
}

TEST(ListOf_Machines, CommandLineIsExactlyTheListingToolWithT0) {
    SimulatedConsole const console("[lsvtc]\nstdout 0:1234-ABC_10ABCDE;\n");
    Strings const commandLines =
        QuorvexTest::tracedCommandLines("machines.Trace", [] { ListOf_Machines const machines; });
    EXPECT_EQ(commandLines, Strings{"/opt/lsvtc/bin/lsvtc -t0 > /tmp/ShellCommand.XXXXXX"
                                    " 2> /tmp/ShellCommand.XXXXXX"});
}

TEST(ListOf_Machines, ExampleLineYieldsEveryMachineInPrintedOrder) {
    EXPECT_EQ(machinesFromLine("0:1234-ABC_10ABCDE;0:5678-DEF_65XYZ12;2:4321-XYZ_10QRSTU;"),
              (Strings{"0|1234-ABC|10ABCDE", "0|5678-DEF|65XYZ12", "2|4321-XYZ|10QRSTU"}));
}

TEST(ListOf_Machines, OneEntryYieldsOneMachine) {
    EXPECT_EQ(machinesFromLine("0:1234-ABC_10ABCDE;"), Strings{"0|1234-ABC|10ABCDE"});
}

TEST(ListOf_Machines, EmptyMiddleEntryIsSkippedAndNameWithoutUnderscoreFillsBothParts) {
    EXPECT_EQ(machinesFromLine("0:1234-ABC_10ABCDE;;3:X"),
              (Strings{"0|1234-ABC|10ABCDE", "3|X|X"}));
}

TEST(ListOf_Machines, NonNumericObjectTypeIsSkipped) {
    EXPECT_EQ(machinesFromLine("abc:1234-ABC_10ABCDE"), Strings{});
}

TEST(ListOf_Machines, ObjectTypeSkipsLeadingBlankAndIgnoresTrailingLetters) {
    EXPECT_EQ(machinesFromLine(" 7xyz:A_B"), Strings{"7|A|B"});
}

TEST(ListOf_Machines, EntryWithoutColonIsSkipped) {
    EXPECT_EQ(machinesFromLine("0"), Strings{});
}

TEST(ListOf_Machines, FieldsAfterTheMachineNameAreIgnored) {
    EXPECT_EQ(machinesFromLine("0:A_B:extra"), Strings{"0|A|B"});
}

TEST(ListOf_Machines, MachineNameSplitsAtLastUnderscore) {
    EXPECT_EQ(machinesFromLine("0:A_B_C"), Strings{"0|A_B|C"});
}

TEST(ListOf_Machines, SortingOrdersByObjectTypeThenIdentity) {
    SimulatedConsole const console("[lsvtc]\nstdout 1:B_1;0:Z_9;0:A_2\n");
    ListOf_Machines machines;
    EXPECT_EQ(describe(machines), (Strings{"1|B|1", "0|Z|9", "0|A|2"}));
    std::sort(machines.begin(), machines.end());
    EXPECT_EQ(describe(machines), (Strings{"0|A|2", "0|Z|9", "1|B|1"}));
}

TEST(ListOf_Machines, ConsolePrefixIsCleanedFromBothParts) {
    EXPECT_EQ(machinesFromLine("0:ZOR*1234-ABC_ZOR*0210ABCDE"), Strings{"0|1234-ABC|10ABCDE"});
}

TEST(ListOf_Machines, TypeModelWithoutDashIsNotMarked) {
    EXPECT_EQ(machinesFromLine("0:1234ABC_10ABCDE"), Strings{"0|1234ABC|10ABCDE"});
}

TEST(ListOf_Machines, MachinePrintedTwiceIsListedTwice) {
    EXPECT_EQ(machinesFromLine("0:A-1_S;0:A-1_S"), (Strings{"0|A-1|S", "0|A-1|S"}));
}

TEST(ListOf_Machines, OnlyTheFirstLineIsRead) {
    EXPECT_EQ(machinesWith("[lsvtc]\nstdout <<END\n0:A-1_S1;\n0:B-2_S2;\nEND\n"),
              Strings{"0|A-1|S1"});
}

TEST(ListOf_Machines, ToolThatPrintsNothingGivesEmptyList) {
    SimulatedConsole const console("[lsvtc]\n");
    ListOf_Machines const machines;
    EXPECT_TRUE(machines.empty());
    EXPECT_EQ(console.invocations().size(), 1U);
}

TEST(ListOf_Machines, EmptyFirstLineGivesEmptyList) {
    EXPECT_EQ(machinesWith("[lsvtc]\nstdout <<END\n\n0:A-1_S1;\nEND\n"), Strings{});
}

TEST(ListOf_Machines, ExitCodeAndStandardErrorAreIgnored) {
    EXPECT_EQ(machinesWith("[lsvtc]\nstdout 0:1234-ABC_10ABCDE;\nstderr 9:ERR-1_X;\nexit 3\n"),
              Strings{"0|1234-ABC|10ABCDE"});
}

TEST(ListOf_Machines, FailingToolWithoutOutputGivesEmptyList) {
    EXPECT_EQ(machinesWith("[lsvtc]\nstderr lsvtc: console not ready\nexit 1\n"), Strings{});
}

TEST(ListOf_Machines, CommandThatCannotRunGivesEmptyList) {
    SimulatedConsole const console("[lsvtc]\nstdout 0:1234-ABC_10ABCDE;\n");
    EXPECT_EQ(QuorvexTest::checkWithReadOnlyTmp([] { return ListOf_Machines().empty(); }),
              QuorvexTest::gc_CheckHeld);
    // The same console answers once /tmp is writable.
    EXPECT_EQ(describe(ListOf_Machines()), Strings{"0|1234-ABC|10ABCDE"});
}

TEST(ListOf_Machines, LastLineWithoutLineEndIsRead) {
    EXPECT_EQ(machinesWith("[lsvtc]\nstdout-nolf 0:A-1_S1\n"), Strings{"0|A-1|S1"});
}

TEST(ListOf_Machines, ObjectTypeBeyond32BitsWrapsToZero) {
    EXPECT_EQ(machinesFromLine("4294967296:A-1_S"), Strings{"0|A-1|S"});
}

TEST(ListOf_Machines, ObjectTypeMinusOneGivesLargest32BitValue) {
    EXPECT_EQ(machinesFromLine("-1:A-1_S"), Strings{"4294967295|A-1|S"});
}

TEST(ListOf_Machines, ObjectTypeBeyond64BitsIsSkipped) {
    EXPECT_EQ(machinesFromLine("99999999999999999999:A-1_S;1:B-2_T"), Strings{"1|B-2|T"});
}

TEST(ListOf_Machines, OddEntriesAreSkippedOrTakenAsFarAsTheyGo) {
    EXPECT_EQ(machinesFromLine(";;:;0:;:A-1_S;garbage;+5:;+6:_;0x1F:x_y;  \t8 :a-b_c"),
              (Strings{"6||", "0|x|y", "8|a-b|c"}));
}

TEST(ListOf_Machines, LineWithoutSeparatorsIsSkipped) {
    EXPECT_EQ(machinesFromLine("nothing-useful-here"), Strings{});
}

TEST(ListOf_Machines, HugeLineYieldsEveryEntry) {
    std::string line;
    for (int i = 0; i < 3000; ++i) {
        line += std::to_string(i % 3) + ":1234-ABC_S" + std::to_string(10000 + i) + ";";
    }
    Strings const machines = machinesFromLine(line);
    ASSERT_EQ(machines.size(), 3000U);
    EXPECT_EQ(machines.front(), "0|1234-ABC|S10000");
    EXPECT_EQ(machines.back(), "2|1234-ABC|S12999");
}

TEST(ListOf_Machines, OverlongLineIsTakenAsFarAsTheReaderKeepsIt) {
    // Sixteen characters an entry; the reader keeps 65533 characters of a
    // line, that is 4095 whole entries and the start "0:1234-ABC_40" of the next.
    std::string line;
    for (int i = 0; i < 5000; ++i) {
        line += "0:1234-ABC_" + std::to_string(1000 + i) + ";";
    }
    Strings const machines = machinesFromLine(line);
    ASSERT_EQ(machines.size(), 4096U);
    EXPECT_EQ(machines[4094], "0|1234-ABC|5094");
    EXPECT_EQ(machines.back(), "0|1234-ABC|50");
}

TEST(ListOf_Machines, HugeLineWithoutSeparatorsIsSkipped) {
    EXPECT_EQ(machinesFromLine(std::string(200000, 'x')), Strings{});
}

TEST(ListOf_Machines, CopyKeepsTheMachines) {
    SimulatedConsole const console("[lsvtc]\nstdout 0:A-1_S;2:B-2_T\n");
    ListOf_Machines const original;
    // NOLINTNEXTLINE(performance-unnecessary-copy-initialization): the copy is under test
    ListOf_Machines const copy(original);
    EXPECT_EQ(describe(copy), (Strings{"0|A-1|S", "2|B-2|T"}));
    EXPECT_EQ(console.invocations().size(), 1U);
}
