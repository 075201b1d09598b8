#include "system/DEBUG_System.h"

#include <string>

namespace DEBUG {
namespace Quorvex {
namespace System {

void print_Partition(std::ostream& out, ::Quorvex::System::Partition const& partition,
                     unsigned int const& indent) {
    std::string const I(indent, ' ');
    std::string const N = "\n";
    std::string const text = I + "Partition    : " + std::string(partition) +
                             N + I + "MTMS         : " + std::string(partition.get_MTMS()) +
                             N + I + "Partition ID : " + partition.get_PartitionID() +
                             N + I + "HostName     : " + partition.get_HostName() +
                             N + I + "IP           : " + partition.get_IP() +
                             N + I + "ActiveStatus : " + partition.get_ActiveStatus() +
                             N + I + "OS Name      : " + partition.get_OperatingSystem_Name() +
                             N + I + "OS Version   : " + partition.get_OperatingSystem_Version();
    out << text << std::endl;
}

} // namespace System
} // namespace Quorvex
} // namespace DEBUG
