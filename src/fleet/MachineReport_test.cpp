#include "fleet/MachineReport.h"

#include <gtest/gtest.h>

#include <iostream>
#include <sstream>

namespace {

using fleet::MachineRecord;
using fleet::machineReturnCodes;
using fleet::machineStatusText;
using fleet::machineTraceText;
using fleet::PartitionRecord;
using fleet::printMachineBlock;

// Standard output and standard error into one buffer for as long as it
// lives, as when both streams of the tool go to one file.
class BothStreamsCaptured {
public:
    BothStreamsCaptured()
        : _out(std::cout.rdbuf(_buffer.rdbuf())), _err(std::cerr.rdbuf(_buffer.rdbuf())) {}
    ~BothStreamsCaptured() {
        std::cout.rdbuf(_out);
        std::cerr.rdbuf(_err);
    }
    BothStreamsCaptured(BothStreamsCaptured const&) = delete;
    BothStreamsCaptured& operator=(BothStreamsCaptured const&) = delete;
    std::string text() const { return _buffer.str(); }

private:
    std::ostringstream _buffer;
    std::streambuf* _out;
    std::streambuf* _err;
};

PartitionRecord record(std::string const& host, std::string const& fileName,
                       std::string const& code, std::string const& status) {
    PartitionRecord entry;
    entry.partition.set_HostName(host);
    entry.partition.set_IP("10.0.0." + host.substr(0, 1));
    entry.result.fileName = fileName;
    entry.result.returnCode = code;
    entry.result.statusText = status;
    return entry;
}

MachineRecord mixedMachine() {
    MachineRecord machine;
    machine.identity = "9119-MHE_21ABCDE";
    machine.listed = true;
    machine.partitions = {record("1a", "VPD/one.VPD.xml", "0", "Ok"),
                          record("2b", "", "8", "Failed - Active Status < 3"),
                          record("3c", "VPD/three.VPD.xml", "8", "RELAY Failed, rc = 4")};
    return machine;
}

TEST(MachineReport, NamesAndCodesInterleaveThenTheOverallCodeEndsTheBlock) {
    BothStreamsCaptured const captured;
    printMachineBlock(mixedMachine());
    EXPECT_EQ(captured.text(), "VPD/one.VPD.xml\n0\nVPD/three.VPD.xml\n8\n"
                               "\nquorvexPYLON_VPD_Survey_ClientPartition ReturnCode: \n4");
}

TEST(MachineReport, MachineWithoutPartitionsPrintsOnlyTheOverallCodeEight) {
    MachineRecord machine;
    machine.listed = true;
    BothStreamsCaptured const captured;
    printMachineBlock(machine);
    EXPECT_EQ(captured.text(), "\nquorvexPYLON_VPD_Survey_ClientPartition ReturnCode: \n8");
}

TEST(MachineReport, StatusFileHasOneLinePerListedPartition) {
    EXPECT_EQ(machineStatusText(mixedMachine()),
              "1a [10.0.0.1] - VPD Survey - Ok\n"
              "2b [10.0.0.2] - VPD Survey - Failed - Active Status < 3\n"
              "3c [10.0.0.3] - VPD Survey - RELAY Failed, rc = 4\n");
}

TEST(MachineReport, StatusFileOfAMachineWithoutPartitionsSaysSo) {
    EXPECT_EQ(machineStatusText(MachineRecord{}), "No ACTIVE Partition Found.\n");
}

TEST(MachineReport, ReturnCodesFollowListingOrder) {
    EXPECT_EQ(machineReturnCodes(mixedMachine()), (std::vector<std::string>{"0", "8", "8"}));
}

TEST(MachineReport, TraceJoinsTheListingAndThePartitionBlocksInListingOrder) {
    MachineRecord machine = mixedMachine();
    machine.listingTrace = "listing\n";
    machine.partitions[2].trace = "third\n";
    machine.partitions[0].trace = "first\n";
    EXPECT_EQ(machineTraceText(machine), std::optional<std::string>("listing\nfirst\nthird\n"));
}

TEST(MachineReport, TraceOfPartitionsAloneKeepsTheirBlocks) {
    MachineRecord machine = mixedMachine();
    machine.partitions[1].trace = "";
    machine.partitions[2].trace = "third\n";
    EXPECT_EQ(machineTraceText(machine), std::optional<std::string>("third\n"));
}

TEST(MachineReport, NoTraceWhenNoUnitWroteOne) {
    EXPECT_EQ(machineTraceText(mixedMachine()), std::nullopt);
}

} // namespace
