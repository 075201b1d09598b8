#include "system/DEBUG_System.h"

#include <gtest/gtest.h>

#include <sstream>
#include <string>

using Quorvex::System::MTMS;
using Quorvex::System::Partition;

namespace {

Partition fullRecord() {
    Partition partition(MTMS("1234-ABC", "10ABCDE"), "3", "host3");
    partition.set_IP("10.1.1.13");
    partition.set_ActiveStatus("1");
    partition.set_OperatingSystem_Name("Zeph");
    partition.set_OperatingSystem_Version("5.3");
    return partition;
}

std::string printed(Partition const& partition, unsigned int indent) {
    std::ostringstream out;
    ::DEBUG::Quorvex::System::print_Partition(out, partition, indent);
    return out.str();
}

} // namespace

TEST(DEBUG_System, PrintPartitionWithIndentZeroHasNoLeadingBlanks) {
    EXPECT_EQ(printed(fullRecord(), 0), "Partition    : 1234-ABC_10ABCDE-3\n"
                                        "MTMS         : 1234-ABC_10ABCDE\n"
                                        "Partition ID : 3\n"
                                        "HostName     : host3\n"
                                        "IP           : 10.1.1.13\n"
                                        "ActiveStatus : 1\n"
                                        "OS Name      : Zeph\n"
                                        "OS Version   : 5.3\n");
}

TEST(DEBUG_System, PrintPartitionWithIndentFourIndentsEveryLine) {
    EXPECT_EQ(printed(fullRecord(), 4), "    Partition    : 1234-ABC_10ABCDE-3\n"
                                        "    MTMS         : 1234-ABC_10ABCDE\n"
                                        "    Partition ID : 3\n"
                                        "    HostName     : host3\n"
                                        "    IP           : 10.1.1.13\n"
                                        "    ActiveStatus : 1\n"
                                        "    OS Name      : Zeph\n"
                                        "    OS Version   : 5.3\n");
}

TEST(DEBUG_System, PrintPartitionOfThreeArgumentRecordKeepsLabelsOfEmptyFields) {
    Partition const partition(MTMS("1234-ABC", "10ABCDE"), "3", "host3");
    EXPECT_EQ(printed(partition, 2), "  Partition    : 1234-ABC_10ABCDE-3\n"
                                     "  MTMS         : 1234-ABC_10ABCDE\n"
                                     "  Partition ID : 3\n"
                                     "  HostName     : host3\n"
                                     "  IP           : \n"
                                     "  ActiveStatus : \n"
                                     "  OS Name      : \n"
                                     "  OS Version   : \n");
}
