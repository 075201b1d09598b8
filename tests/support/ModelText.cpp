#include "ModelText.h"

#include "transform/XML_Element_2_OStream.h"
#include "vpd/ResourceList.h"

#include <algorithm>
#include <sstream>

namespace QuorvexTest {

std::string elementText(XML::Element const& element) {
    std::ostringstream out;
    Transform::XML_Element_2_OStream(out, 0)(element, true, 0);
    return out.str();
}

std::string propertiesText(Quorvex::VPD::ListOf_Properties const& properties) {
    std::string text = "{";
    for (auto const& entry : properties) {
        text += entry.first + "=" + static_cast<std::string const&>(entry.second.get_Value()) + ";";
    }
    return text + "}";
}

std::string resourceText(Quorvex::VPD::Resource const& resource) {
    std::string text = "(" + resource.get_DisplayName() + "|" + resource.get_UniqueID() + "|" +
                       resource.get_References() + ")" +
                       propertiesText(resource.get_ListOf_Properties());
    for (auto const& group : resource.get_ListOf_PropertyGroups()) {
        text += "<" + group.first + propertiesText(group.second) + ">";
    }
    for (auto const& list : resource.get_ListOf_ResourceLists()) {
        text += "[" + list.first + "/" + list.second.get_DisplayName() + ":";
        for (auto const& member : list.second) {
            text += resourceText(member.second);
        }
        text += "]";
    }
    return text;
}

std::vector<std::string> describe(Quorvex::PYLON::ListOf_Machines const& machines) {
    std::vector<std::string> described(machines.size());
    std::transform(machines.begin(), machines.end(), described.begin(),
                   [](Quorvex::PYLON::Machine const& machine) {
                       return std::to_string(machine.get_ObjectType()) + "|" +
                              machine.get_MTMS().get_MachineType_Model() + "|" +
                              machine.get_MTMS().get_Serial();
                   });
    return described;
}

std::vector<std::string> describe(Quorvex::PYLON::ListOf_Partitions const& partitions) {
    std::vector<std::string> described(partitions.size());
    std::transform(partitions.begin(), partitions.end(), described.begin(),
                   [](Quorvex::System::Partition const& partition) {
                       return std::string(partition.get_MTMS()) + "|" +
                              partition.get_PartitionID() + "|" + partition.get_IP() + "|" +
                              partition.get_ActiveStatus() + "|" + partition.get_HostName() + "|" +
                              partition.get_OperatingSystem_Name() + "|" +
                              partition.get_OperatingSystem_Version();
                   });
    return described;
}

} // namespace QuorvexTest
