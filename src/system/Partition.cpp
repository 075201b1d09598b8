#include "system/Partition.h"

#include "utility/StringUtility.h"

namespace Quorvex::System {

namespace {

constexpr char gc_ID_Delimiter[] = "-";
// Stands in for a separator the caller leaves out.
constexpr char gc_Default_Separator[] = "-";

namespace System_Partition_Utility {

const char* _u_orDefault(const char* separator) {
    return separator != nullptr ? separator : gc_Default_Separator;
}

} // namespace System_Partition_Utility
} // namespace

Partition::Partition() = default;

Partition::Partition(MTMS const& mtms, std::string const& partitionID, std::string const& hostName)
    : _MTMS(mtms), _PartitionID(partitionID), _HostName(hostName) {}

MTMS const& Partition::get_MTMS() const {
    return _MTMS;
}

std::string const& Partition::get_PartitionID() const {
    return _PartitionID;
}

std::string const& Partition::get_HostName() const {
    return _HostName;
}

std::string const& Partition::get_IP() const {
    return _IP;
}

std::string const& Partition::get_ActiveStatus() const {
    return _ActiveStatus;
}

std::string const& Partition::get_OperatingSystem_Name() const {
    return _OperatingSystem_Name;
}

std::string const& Partition::get_OperatingSystem_Version() const {
    return _OperatingSystem_Version;
}

void Partition::set_MTMS(MTMS const& mtms) {
    _MTMS = mtms;
}

void Partition::set_PartitionID(std::string const& partitionID) {
    _PartitionID = partitionID;
}

void Partition::set_HostName(std::string const& hostName) {
    _HostName = hostName;
}

void Partition::set_IP(std::string const& ip) {
    _IP = ip;
}

void Partition::set_ActiveStatus(std::string const& activeStatus) {
    _ActiveStatus = activeStatus;
}

void Partition::set_OperatingSystem_Name(std::string const& operatingSystem_Name) {
    _OperatingSystem_Name = operatingSystem_Name;
}

void Partition::set_OperatingSystem_Version(std::string const& operatingSystem_Version) {
    _OperatingSystem_Version = operatingSystem_Version;
}

std::string Partition::__StringValue() const {
    return StringUtility::concatenate({std::string(_MTMS), gc_ID_Delimiter, _PartitionID});
}

Partition::operator std::string() const {
    return __StringValue();
}

std::string Partition::to_String(const char* dashReplacement, const char* separator,
                                 const char* idSeparator) const {
    using System_Partition_Utility::_u_orDefault;
    return _MTMS.to_String(_u_orDefault(dashReplacement), _u_orDefault(separator)) +
           _u_orDefault(idSeparator) + _PartitionID;
}

bool operator<(Partition const& a, Partition const& b) {
    if (a.get_MTMS() != b.get_MTMS()) {
        return a.get_MTMS() < b.get_MTMS();
    }
    // As text: 10 sorts before 2. Kept for the console's readers: see
    // docs/compatibility.md#partition-order
    if (a.get_PartitionID() != b.get_PartitionID()) {
        return a.get_PartitionID() < b.get_PartitionID();
    }
    return a.get_HostName() < b.get_HostName();
}

} // namespace Quorvex::System
