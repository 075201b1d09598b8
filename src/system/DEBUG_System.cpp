#include "system/DEBUG_System.h"

#include "utility/StringUtility.h"

#include <string>

namespace DEBUG::Quorvex::System {

// Host name before IP, unlike the other printer. Kept for the trace's readers: see
// docs/compatibility.md#partition-printers
void print_Partition(std::ostream& out, ::Quorvex::System::Partition const& partition,
                     unsigned int const& indent) {
    std::string const margin(indent, ' ');
    std::string const line = "\n" + margin;
    std::string const text = ::StringUtility::concatenate(
        {margin, "Partition    : ", std::string(partition),               //
         line,   "MTMS         : ", std::string(partition.get_MTMS()),    //
         line,   "Partition ID : ", partition.get_PartitionID(),          //
         line,   "HostName     : ", partition.get_HostName(),             //
         line,   "IP           : ", partition.get_IP(),                   //
         line,   "ActiveStatus : ", partition.get_ActiveStatus(),         //
         line,   "OS Name      : ", partition.get_OperatingSystem_Name(), //
         line,   "OS Version   : ", partition.get_OperatingSystem_Version()});
    out << text << std::endl;
}

} // namespace DEBUG::Quorvex::System
