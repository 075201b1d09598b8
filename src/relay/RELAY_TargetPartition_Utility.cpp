#include "relay/RELAY_TargetPartition_Utility.h"

#include "relay/RELAY_Utility.h"
#include "utility/StringUtility.h"

namespace Quorvex::RELAY {

std::string RELAY_TargetPartition_Utility::_u_get_MachineType_Model(
    Quorvex::System::Partition const& partition) {
    return RELAY_Utility::create_Parameter("CecMT", partition.get_MTMS().get_MachineType_Model());
}

std::string
RELAY_TargetPartition_Utility::_u_get_Machine_Serial(Quorvex::System::Partition const& partition) {
    return RELAY_Utility::create_Parameter("CecMS", partition.get_MTMS().get_Serial());
}

std::string
RELAY_TargetPartition_Utility::_u_get_PartitionID(Quorvex::System::Partition const& partition) {
    return RELAY_Utility::create_Parameter("PartitionId", partition.get_PartitionID());
}

std::string
RELAY_TargetPartition_Utility::_u_get_PartitionArray(Quorvex::System::Partition const& partition) {
    // An array of one identifier: the quoted value sits inside braces.
    return StringUtility::concatenate({"PartitionArray::{\"", partition.get_PartitionID(), "\"}"});
}

} // namespace Quorvex::RELAY
