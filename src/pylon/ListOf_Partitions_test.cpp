// Runs inside the sandbox: /opt/vtc/bin/lspartition is the simulated console.

#include "pylon/ListOf_Partitions.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

using Quorvex::PYLON::ListOf_Partitions;
using Quorvex::PYLON::Machine;
using Quorvex::System::MTMS;
using QuorvexTest::describe;
using QuorvexTest::SimulatedConsole;
using Strings = std::vector<std::string>;

namespace {

Machine machine() {
    return Machine(0U, MTMS("1234-ABC", "10ABCDE"));
}

// The partitions of machine() as the console of the scenario lists them.
Strings partitionsWith(std::string const& scenario) {
    SimulatedConsole const console(scenario);
    ListOf_Partitions partitions;
    partitions.getPartitions_FromMachine(machine());
    return describe(partitions);
}

// The partitions parsed from one listing line printed for machine().
Strings partitionsFromLine(std::string const& line) {
    return partitionsWith("[lspartition 1234-ABC_10ABCDE]\nstdout " + line + "\n");
}

} // namespace

TEST(ListOf_Partitions, DefaultConstructorGivesEmptyListAndRunsNothing) {
    SimulatedConsole const console("[lspartition *]\nstdout 1,a;\n");
    ListOf_Partitions const partitions;
    EXPECT_TRUE(partitions.empty());
    EXPECT_TRUE(console.invocations().empty());
}

TEST(ListOf_Partitions, MachineOfObjectType2CausesNoRunOfThePartitionTool) {
    SimulatedConsole const console("[lspartition *]\nstdout 1,10.1.1.11,1,host1,Zeph,5.3;\n");
    ListOf_Partitions partitions;
    partitions.getPartitions_FromMachine(Machine(2U, MTMS("1234-ABC", "10ABCDE")));
    EXPECT_TRUE(partitions.empty());
    EXPECT_TRUE(console.invocations().empty());
    EXPECT_EQ(console.logText(), "");
}

TEST(ListOf_Partitions, RunsThePartitionToolForTheMachineIdentity) {
    SimulatedConsole const console("[lspartition *]\n");
    ListOf_Partitions partitions;
    partitions.getPartitions_FromMachine(machine());
    EXPECT_EQ(console.invocations(), (std::vector<QuorvexTest::Invocation>{
                                         {"lspartition", "-ix", "-c", "1234-ABC_10ABCDE"}}));
}

// The identity is not quoted: the shell splits it at the blank.
TEST(ListOf_Partitions, IdentityWithABlankReachesTheShellAsTwoWords) {
    SimulatedConsole const console("[lspartition *]\n");
    ListOf_Partitions partitions;
    partitions.getPartitions_FromMachine(Machine(0U, MTMS("1234-ABC", "10 ABCDE")));
    EXPECT_EQ(console.invocations(), (std::vector<QuorvexTest::Invocation>{
                                         {"lspartition", "-ix", "-c", "1234-ABC_10", "ABCDE"}}));
}

TEST(ListOf_Partitions, CommandLineIsExactlyThePartitionToolWithTheMachineIdentity) {
    SimulatedConsole const console("[lspartition *]\n");
    Strings const commandLines = QuorvexTest::tracedCommandLines("partitions.Trace", [] {
        ListOf_Partitions partitions;
        partitions.getPartitions_FromMachine(machine());
    });
    EXPECT_EQ(commandLines, Strings{"/opt/vtc/bin/lspartition -ix -c 1234-ABC_10ABCDE"
                                    " > /tmp/ShellCommand.XXXXXX 2> /tmp/ShellCommand.XXXXXX"});
}

TEST(ListOf_Partitions, ExampleLineYieldsEveryRecordInPrintedOrder) {
    EXPECT_EQ(partitionsFromLine("1,10.1.1.11,1,host1,Zeph,5.3;2,10.1.1.12,0,host2,Linux,2.6;"),
              (Strings{"1234-ABC_10ABCDE|1|10.1.1.11|1|host1|Zeph|5.3",
                       "1234-ABC_10ABCDE|2|10.1.1.12|0|host2|Linux|2.6"}));
}

TEST(ListOf_Partitions, PartitionIDAloneKeepsDefaultsInEveryOtherField) {
    EXPECT_EQ(partitionsFromLine("7"), Strings{"1234-ABC_10ABCDE|7|||||"});
}

TEST(ListOf_Partitions, EmptyFieldIsKeptAsEmptyText) {
    EXPECT_EQ(partitionsFromLine("7,,1"), Strings{"1234-ABC_10ABCDE|7||1|||"});
}

TEST(ListOf_Partitions, FieldsAfterTheSixthAreIgnored) {
    EXPECT_EQ(partitionsFromLine("1,a,b,c,d,e,f,g"), Strings{"1234-ABC_10ABCDE|1|a|b|c|d|e"});
}

TEST(ListOf_Partitions, EmptyMiddleRecordIsSkipped) {
    EXPECT_EQ(partitionsFromLine("1,x;;2,y"),
              (Strings{"1234-ABC_10ABCDE|1|x||||", "1234-ABC_10ABCDE|2|y||||"}));
}

TEST(ListOf_Partitions, FieldsAreNotTrimmed) {
    EXPECT_EQ(partitionsFromLine(" 7, 10.1.1.1 ,1 ,host "),
              Strings{"1234-ABC_10ABCDE| 7| 10.1.1.1 |1 |host ||"});
}

TEST(ListOf_Partitions, IdentityComesFromTheMachineNotFromTheRecord) {
    EXPECT_EQ(partitionsFromLine("5678-DEF_65XYZ12-3,10.1.1.13"),
              Strings{"1234-ABC_10ABCDE|5678-DEF_65XYZ12-3|10.1.1.13||||"});
}

TEST(ListOf_Partitions, RecordsAreNotSorted) {
    EXPECT_EQ(partitionsFromLine("9,a;10,b;2,c"),
              (Strings{"1234-ABC_10ABCDE|9|a||||", "1234-ABC_10ABCDE|10|b||||",
                       "1234-ABC_10ABCDE|2|c||||"}));
}

TEST(ListOf_Partitions, DuplicateRecordsAreKept) {
    EXPECT_EQ(partitionsFromLine("3,a;3,a"),
              (Strings{"1234-ABC_10ABCDE|3|a||||", "1234-ABC_10ABCDE|3|a||||"}));
}

TEST(ListOf_Partitions, PartitionsOfAMachineAreAppendedToTheList) {
    SimulatedConsole const console("[lspartition 1234-ABC_10ABCDE]\nstdout 1,a\n"
                                   "[lspartition 5678-DEF_65XYZ12]\nstdout 2,b\n");
    ListOf_Partitions partitions;
    partitions.getPartitions_FromMachine(machine());
    partitions.getPartitions_FromMachine(Machine(0U, MTMS("5678-DEF", "65XYZ12")));
    EXPECT_EQ(describe(partitions),
              (Strings{"1234-ABC_10ABCDE|1|a||||", "5678-DEF_65XYZ12|2|b||||"}));
}

TEST(ListOf_Partitions, OnlyTheFirstLineIsRead) {
    EXPECT_EQ(partitionsWith("[lspartition *]\nstdout <<END\n1,a;\n2,b;\nEND\n"),
              Strings{"1234-ABC_10ABCDE|1|a||||"});
}

TEST(ListOf_Partitions, ToolThatPrintsNothingAppendsNothing) {
    SimulatedConsole const console("[lspartition *]\n");
    ListOf_Partitions partitions;
    partitions.getPartitions_FromMachine(machine());
    EXPECT_TRUE(partitions.empty());
    EXPECT_EQ(console.invocations().size(), 1U);
}

TEST(ListOf_Partitions, ExitCodeAndStandardErrorAreIgnored) {
    EXPECT_EQ(partitionsWith("[lspartition *]\nstdout 1,a;\nstderr 2,b;\nexit 4\n"),
              Strings{"1234-ABC_10ABCDE|1|a||||"});
}

TEST(ListOf_Partitions, FailingToolWithoutOutputAppendsNothing) {
    EXPECT_EQ(partitionsWith("[lspartition *]\nstderr no such machine\nexit 1\n"), Strings{});
}

TEST(ListOf_Partitions, CommandThatCannotRunAppendsNothing) {
    SimulatedConsole const console("[lspartition *]\nstdout 1,a;\n");
    EXPECT_EQ(QuorvexTest::checkWithReadOnlyTmp([] {
                  ListOf_Partitions partitions;
                  partitions.getPartitions_FromMachine(machine());
                  return partitions.empty();
              }),
              QuorvexTest::gc_CheckHeld);
    // The same console answers once /tmp is writable.
    ListOf_Partitions partitions;
    partitions.getPartitions_FromMachine(machine());
    EXPECT_EQ(describe(partitions), Strings{"1234-ABC_10ABCDE|1|a||||"});
}

TEST(ListOf_Partitions, OddRecordsAreTakenAsFarAsTheyGo) {
    EXPECT_EQ(partitionsFromLine(";;,;,,,;x;;,a"),
              (Strings{"1234-ABC_10ABCDE||||||", "1234-ABC_10ABCDE||||||",
                       "1234-ABC_10ABCDE|x|||||", "1234-ABC_10ABCDE||a||||"}));
}

TEST(ListOf_Partitions, LineWithoutSeparatorsIsOnePartitionID) {
    EXPECT_EQ(partitionsFromLine("no separators at all"),
              Strings{"1234-ABC_10ABCDE|no separators at all|||||"});
}

TEST(ListOf_Partitions, HugeLineYieldsEveryRecord) {
    // About 60000 characters: within what the reader keeps of one line.
    std::string line;
    for (int i = 0; i < 2000; ++i) {
        line += std::to_string(i) + ",10.0.0.1,1,h" + std::to_string(i) + ",Zeph,5.3;";
    }
    Strings const partitions = partitionsFromLine(line);
    ASSERT_EQ(partitions.size(), 2000U);
    EXPECT_EQ(partitions.back(), "1234-ABC_10ABCDE|1999|10.0.0.1|1|h1999|Zeph|5.3");
}

TEST(ListOf_Partitions, HugeLineWithoutSeparatorsIsOnePartitionIDAsFarAsTheReaderKeepsIt) {
    EXPECT_EQ(partitionsFromLine(std::string(200000, 'x')),
              Strings{"1234-ABC_10ABCDE|" + std::string(65533, 'x') + "|||||"});
}

TEST(ListOf_Partitions, CopyKeepsTheRecords) {
    ListOf_Partitions original;
    original.push_back(::Quorvex::System::Partition(MTMS("1234-ABC", "10ABCDE"), "3", "h3"));
    ListOf_Partitions const copy(original);
    EXPECT_EQ(describe(copy), Strings{"1234-ABC_10ABCDE|3|||h3||"});
}
