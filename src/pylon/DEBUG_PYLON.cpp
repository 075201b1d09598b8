#include "pylon/DEBUG_PYLON.h"

#include <iostream>
#include <string>

namespace Quorvex::PYLON::DEBUG {

// IP before host name, unlike the trace's printer. Kept for the trace's readers: see
// docs/compatibility.md#partition-printers
void print_Partition(::Quorvex::System::Partition const& partition) {
    std::cout << "----------------------------------------\n";
    std::cout << " MTMS                    : " << std::string(partition.get_MTMS()) << std::endl;
    std::cout << " PartitionID             : " << partition.get_PartitionID() << std::endl;
    std::cout << " IP                      : " << partition.get_IP() << std::endl;
    std::cout << " ActiveStatus            : " << partition.get_ActiveStatus() << std::endl;
    std::cout << " HostName                : " << partition.get_HostName() << std::endl;
    std::cout << " OperatingSystem_Name    : " << partition.get_OperatingSystem_Name() << std::endl;
    std::cout << " OperatingSystem_Version : " << partition.get_OperatingSystem_Version()
              << std::endl;
}

void print_ListOf_Partitions(::Quorvex::PYLON::ListOf_Partitions const& partitions) {
    for (auto const& partition : partitions) {
        ::Quorvex::PYLON::DEBUG::print_Partition(partition);
    }
}

} // namespace Quorvex::PYLON::DEBUG
