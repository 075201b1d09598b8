#include "relay/TargetPartition.h"

#include "relay/RELAY_TargetPartition_Utility.h"
#include "utility/StringUtility.h"

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
    return _get_TargetText();
}

std::string const& TargetPartition::_get_TargetText() const {
    if (_TargetText.empty() || _TargetTextIsArray != _UsePartitionArray) {
        _TargetText = _build_Target();
        _TargetTextIsArray = _UsePartitionArray;
    }
    return _TargetText;
}

std::string TargetPartition::_build_Target() const {
    std::string const partition =
        _UsePartitionArray ? RELAY_TargetPartition_Utility::_u_get_PartitionArray(_Partition)
                           : RELAY_TargetPartition_Utility::_u_get_PartitionID(_Partition);
    return StringUtility::concatenate(
        {RELAY_TargetPartition_Utility::_u_get_MachineType_Model(_Partition),
         "::", RELAY_TargetPartition_Utility::_u_get_Machine_Serial(_Partition), "::", partition});
}

} // namespace Quorvex::RELAY
