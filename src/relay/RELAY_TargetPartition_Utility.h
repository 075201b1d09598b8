#pragma once

#include "system/Partition.h"

#include <string>

namespace Quorvex::RELAY {

// The target parameters of a remote action, taken from a partition record.
class RELAY_TargetPartition_Utility {
public:
    static std::string _u_get_MachineType_Model(Quorvex::System::Partition const& partition);
    static std::string _u_get_Machine_Serial(Quorvex::System::Partition const& partition);
    static std::string _u_get_PartitionID(Quorvex::System::Partition const& partition);
    // PartitionArray::{"<id>"}: braces around the quoted identifier.
    static std::string _u_get_PartitionArray(Quorvex::System::Partition const& partition);
};

} // namespace Quorvex::RELAY
