#include "survey/System_Partition_2_VPD_Resource.h"

#include "vpd/Property.h"

#include <string>

namespace Transform {

Quorvex::VPD::Resource&
System_Partition_2_VPD_Resource::operator()(Quorvex::System::Partition const& partition,
                                            Quorvex::VPD::Resource& resource) const {
    // Kept for the inventory importers: see docs/compatibility.md#default-document
    std::string const identity = partition.to_String("-", "-", "-");
    std::string const& hostName = partition.get_HostName();
    resource.set_DisplayName(hostName.empty() ? identity : hostName);
    resource.set_UniqueID(identity);
    resource.insert_Property(Quorvex::VPD::Property("HN", hostName));
    resource.insert_Property(
        Quorvex::VPD::Property("OS", partition.get_OperatingSystem_Name() + " " +
                                         partition.get_OperatingSystem_Version()));
    resource.insert_Property(Quorvex::VPD::Property("PT", partition.get_PartitionID()));
    resource.insert_Property(Quorvex::VPD::Property("SE", partition.get_MTMS().get_Serial()));
    resource.insert_Property(
        Quorvex::VPD::Property("TM", partition.get_MTMS().get_MachineType_Model()));
    return resource;
}

} // namespace Transform
