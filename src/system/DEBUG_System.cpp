#include "system/DEBUG_System.h"

#include <string>

namespace DEBUG::Quorvex::System {

// Host name before IP, unlike the other printer. Kept for the trace's readers: see
// docs/compatibility.md#partition-printers
void print_Partition(std::ostream& out, ::Quorvex::System::Partition const& partition,
                     unsigned int const& indent) {
    std::string const margin(indent, ' ');
    std::string const newLine = "\n";
    std::string text = margin + "Partition    : " + std::string(partition);
    text += newLine + margin + "MTMS         : " + std::string(partition.get_MTMS());
    text += newLine + margin + "Partition ID : " + partition.get_PartitionID();
    text += newLine + margin + "HostName     : " + partition.get_HostName();
    text += newLine + margin + "IP           : " + partition.get_IP();
    text += newLine + margin + "ActiveStatus : " + partition.get_ActiveStatus();
    text += newLine + margin + "OS Name      : " + partition.get_OperatingSystem_Name();
    text += newLine + margin + "OS Version   : " + partition.get_OperatingSystem_Version();
    out << text << std::endl;
}

} // namespace DEBUG::Quorvex::System
