// Runs inside the sandbox: both console listing tools are the simulated console.

#include "pylon/Utility.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <vector>

using Quorvex::PYLON::ListOf_Partitions;
using Quorvex::PYLON::Utility::get_AllManagedPartitions;
using Quorvex::System::MTMS;
using Quorvex::System::Partition;
using QuorvexTest::describe;
using QuorvexTest::Invocation;
using QuorvexTest::SimulatedConsole;
using Strings = std::vector<std::string>;

namespace {

// Two partitioned machines printed out of order, and one other object.
constexpr char gc_Console[] =
    "[lsvtc]\n"
    "stdout 0:5678-DEF_65XYZ12;2:4321-XYZ_10QRSTU;0:1234-ABC_10ABCDE;\n"
    "[lspartition 1234-ABC_10ABCDE]\n"
    "stdout 9,10.1.1.19,1,host9,Zeph,5.3;10,10.1.1.20,0,host10,Linux,2.6;\n"
    "[lspartition 5678-DEF_65XYZ12]\n"
    "stdout 2,10.2.2.2,1,b,Zeph,7.1;1,10.2.2.1,1,a,Zeph,7.1;\n"
    "[lspartition 4321-XYZ_10QRSTU]\n"
    "stdout 1,10.3.3.1,1,never,Zeph,7.1;\n";

Invocation partitionListing(std::string const& identity) {
    return Invocation{"lspartition", "-ix", "-c", identity};
}

ListOf_Partitions stalePartitions() {
    ListOf_Partitions partitions;
    partitions.push_back(Partition(MTMS("9999-OLD", "STALE"), "1", "old"));
    return partitions;
}

} // namespace

TEST(PYLON_Utility, AllManagedPartitionsAreListedSortedAndCounted) {
    SimulatedConsole const console(gc_Console);
    ListOf_Partitions partitions;
    EXPECT_EQ(get_AllManagedPartitions(partitions), 4);
    EXPECT_EQ(describe(partitions), (Strings{"1234-ABC_10ABCDE|10|10.1.1.20|0|host10|Linux|2.6",
                                             "1234-ABC_10ABCDE|9|10.1.1.19|1|host9|Zeph|5.3",
                                             "5678-DEF_65XYZ12|1|10.2.2.1|1|a|Zeph|7.1",
                                             "5678-DEF_65XYZ12|2|10.2.2.2|1|b|Zeph|7.1"}));
}

TEST(PYLON_Utility, MachinesAreListedFirstThenPartitionedMachinesInSortedOrder) {
    SimulatedConsole const console(gc_Console);
    ListOf_Partitions partitions;
    get_AllManagedPartitions(partitions);
    EXPECT_EQ(console.invocations(),
              (std::vector<Invocation>{{"lsvtc", "-t0"},
                                       partitionListing("1234-ABC_10ABCDE"),
                                       partitionListing("5678-DEF_65XYZ12")}));
}

TEST(PYLON_Utility, CommandLinesAreExact) {
    SimulatedConsole const console(gc_Console);
    Strings const commandLines = QuorvexTest::tracedCommandLines("all.Trace", [] {
        ListOf_Partitions partitions;
        get_AllManagedPartitions(partitions);
    });
    std::string const redirections = " > /tmp/ShellCommand.XXXXXX 2> /tmp/ShellCommand.XXXXXX";
    EXPECT_EQ(commandLines,
              (Strings{"/opt/lsvtc/bin/lsvtc -t0" + redirections,
                       "/opt/vtc/bin/lspartition -ix -c 1234-ABC_10ABCDE" + redirections,
                       "/opt/vtc/bin/lspartition -ix -c 5678-DEF_65XYZ12" + redirections}));
}

TEST(PYLON_Utility, PreviousContentIsReplaced) {
    SimulatedConsole const console(gc_Console);
    ListOf_Partitions partitions = stalePartitions();
    EXPECT_EQ(get_AllManagedPartitions(partitions), 4);
    ASSERT_EQ(partitions.size(), 4U);
    EXPECT_EQ(std::string(partitions.front().get_MTMS()), "1234-ABC_10ABCDE");
}

TEST(PYLON_Utility, WithoutMachineOfObjectType0ReturnsZeroAndLeavesListEmpty) {
    SimulatedConsole const console("[lsvtc]\nstdout 2:4321-XYZ_10QRSTU;1:1234-ABC_10ABCDE;\n"
                                   "[lspartition *]\nstdout 1,10.3.3.1;\n");
    ListOf_Partitions partitions = stalePartitions();
    EXPECT_EQ(get_AllManagedPartitions(partitions), 0);
    EXPECT_TRUE(partitions.empty());
    EXPECT_EQ(console.invocations(), (std::vector<Invocation>{{"lsvtc", "-t0"}}));
}

TEST(PYLON_Utility, MachineToolThatPrintsNothingGivesEmptyList) {
    SimulatedConsole const console("[lsvtc]\n[lspartition *]\nstdout 1,10.3.3.1;\n");
    ListOf_Partitions partitions = stalePartitions();
    EXPECT_EQ(get_AllManagedPartitions(partitions), 0);
    EXPECT_TRUE(partitions.empty());
    EXPECT_EQ(console.invocations().size(), 1U);
}

TEST(PYLON_Utility, FailingMachineToolGivesEmptyList) {
    SimulatedConsole const console("[lsvtc]\nstderr console down\nexit 2\n");
    ListOf_Partitions partitions;
    EXPECT_EQ(get_AllManagedPartitions(partitions), 0);
    EXPECT_TRUE(partitions.empty());
}

TEST(PYLON_Utility, MachineWhosePartitionToolFailsContributesNothing) {
    SimulatedConsole const console("[lsvtc]\nstdout 0:1234-ABC_10ABCDE;0:5678-DEF_65XYZ12;\n"
                                   "[lspartition 1234-ABC_10ABCDE]\nexit 1\n"
                                   "[lspartition 5678-DEF_65XYZ12]\nstdout 4,10.2.2.4;\n");
    ListOf_Partitions partitions;
    EXPECT_EQ(get_AllManagedPartitions(partitions), 1);
    EXPECT_EQ(describe(partitions), Strings{"5678-DEF_65XYZ12|4|10.2.2.4||||"});
}

TEST(PYLON_Utility, ObjectTypeThatWrapsToZeroIsListedAndMinusOneIsNot) {
    SimulatedConsole const console(
        "[lsvtc]\nstdout 4294967296:1234-ABC_10ABCDE;-1:5678-DEF_65XYZ12\n"
        "[lspartition *]\nstdout 1,10.0.0.1;\n");
    ListOf_Partitions partitions;
    EXPECT_EQ(get_AllManagedPartitions(partitions), 1);
    EXPECT_EQ(console.invocations(),
              (std::vector<Invocation>{{"lsvtc", "-t0"}, partitionListing("1234-ABC_10ABCDE")}));
}

TEST(PYLON_Utility, MachinePrintedTwiceIsListedTwice) {
    SimulatedConsole const console("[lsvtc]\nstdout 0:1234-ABC_10ABCDE;0:1234-ABC_10ABCDE;\n"
                                   "[lspartition *]\nstdout 1,10.0.0.1;\n");
    ListOf_Partitions partitions;
    EXPECT_EQ(get_AllManagedPartitions(partitions), 2);
    EXPECT_EQ(console.invocations().size(), 3U);
}

TEST(PYLON_Utility, RecordsWithEqualKeysKeepThePrintedOrder) {
    SimulatedConsole const console(
        "[lsvtc]\nstdout 0:1234-ABC_10ABCDE;\n"
        "[lspartition *]\nstdout 2,ip-a,1,h;1,ip-b,1,h;2,ip-c,1,h;1,ip-d,1,h;2,ip-e,1,h\n");
    ListOf_Partitions partitions;
    EXPECT_EQ(get_AllManagedPartitions(partitions), 5);
    Strings addresses(partitions.size());
    std::transform(partitions.begin(), partitions.end(), addresses.begin(),
                   [](Partition const& partition) { return partition.get_IP(); });
    EXPECT_EQ(addresses, (Strings{"ip-b", "ip-d", "ip-a", "ip-c", "ip-e"}));
}
