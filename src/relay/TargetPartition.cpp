#include "relay/TargetPartition.h"

#include "relay/RELAY_TargetPartition_Utility.h"

#include <sstream>

namespace Quorvex::RELAY {

TargetPartition::TargetPartition() : _Partition(), _UsePartitionArray(false) {}

TargetPartition::TargetPartition(Quorvex::System::Partition const& partition)
    : _Partition(partition), _UsePartitionArray(false) {}

Quorvex::System::Partition const& TargetPartition::get_Partition() const {
    return _Partition;
}

void TargetPartition::use_PartitionArray() {
    _UsePartitionArray = true;
}

void TargetPartition::use_PartitionID() {
    _UsePartitionArray = false;
}

std::string TargetPartition::createString_Target() const {
    std::ostringstream target;
    target << RELAY_TargetPartition_Utility::_u_get_MachineType_Model(_Partition)
           << "::" << RELAY_TargetPartition_Utility::_u_get_Machine_Serial(_Partition) << "::";
    if (_UsePartitionArray) {
        target << RELAY_TargetPartition_Utility::_u_get_PartitionArray(_Partition);
    } else {
        target << RELAY_TargetPartition_Utility::_u_get_PartitionID(_Partition);
    }
    return target.str();
}

} // namespace Quorvex::RELAY
