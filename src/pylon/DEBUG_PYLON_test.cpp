#include "pylon/DEBUG_PYLON.h"

#include <gtest/gtest.h>

#include <iostream>
#include <sstream>
#include <string>

using Quorvex::PYLON::ListOf_Partitions;
using Quorvex::System::MTMS;
using Quorvex::System::Partition;

namespace {

// Collects what is written to standard output while it lives.
class CapturedStdout {
public:
    CapturedStdout() : _previous(std::cout.rdbuf(_text.rdbuf())) {}
    ~CapturedStdout() { std::cout.rdbuf(_previous); }
    CapturedStdout(CapturedStdout const&) = delete;
    CapturedStdout& operator=(CapturedStdout const&) = delete;
    std::string str() const { return _text.str(); }

private:
    std::ostringstream _text;
    std::streambuf* _previous;
};

Partition record(std::string const& id, std::string const& host) {
    Partition partition(MTMS("1234-ABC", "10ABCDE"), id, host);
    partition.set_IP("10.1.1.1" + id);
    partition.set_ActiveStatus("1");
    partition.set_OperatingSystem_Name("Zeph");
    partition.set_OperatingSystem_Version("5.3");
    return partition;
}

std::string printedRecord(std::string const& id, std::string const& host) {
    std::string text = "----------------------------------------\n";
    text += " MTMS                    : 1234-ABC_10ABCDE\n";
    text += " PartitionID             : " + id + "\n";
    text += " IP                      : 10.1.1.1" + id + "\n";
    text += " ActiveStatus            : 1\n";
    text += " HostName                : " + host + "\n";
    text += " OperatingSystem_Name    : Zeph\n";
    text += " OperatingSystem_Version : 5.3\n";
    return text;
}

} // namespace

TEST(DEBUG_PYLON, PrintPartitionWritesRuleAndSevenLabelledLines) {
    CapturedStdout captured;
    ::Quorvex::PYLON::DEBUG::print_Partition(record("3", "host3"));
    EXPECT_EQ(captured.str(), printedRecord("3", "host3"));
}

TEST(DEBUG_PYLON, PrintPartitionOfThreeArgumentRecordKeepsLabelsOfEmptyFields) {
    CapturedStdout captured;
    ::Quorvex::PYLON::DEBUG::print_Partition(Partition(MTMS("1234-ABC", "10ABCDE"), "3", "h3"));
    EXPECT_EQ(captured.str(), "----------------------------------------\n"
                              " MTMS                    : 1234-ABC_10ABCDE\n"
                              " PartitionID             : 3\n"
                              " IP                      : \n"
                              " ActiveStatus            : \n"
                              " HostName                : h3\n"
                              " OperatingSystem_Name    : \n"
                              " OperatingSystem_Version : \n");
}

TEST(DEBUG_PYLON, PrintListOfPartitionsPrintsEveryRecordInListOrder) {
    ListOf_Partitions partitions;
    partitions.push_back(record("9", "host9"));
    partitions.push_back(record("10", "host10"));
    CapturedStdout captured;
    ::Quorvex::PYLON::DEBUG::print_ListOf_Partitions(partitions);
    EXPECT_EQ(captured.str(), printedRecord("9", "host9") + printedRecord("10", "host10"));
}

TEST(DEBUG_PYLON, EmptyPartitionListPrintsNothing) {
    CapturedStdout captured;
    ::Quorvex::PYLON::DEBUG::print_ListOf_Partitions(ListOf_Partitions());
    EXPECT_EQ(captured.str(), "");
}
