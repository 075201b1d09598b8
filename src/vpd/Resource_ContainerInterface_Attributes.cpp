#include "vpd/Resource_ContainerInterface_Attributes.h"

namespace Quorvex::VPD {

Resource_ContainerInterface_Attributes::Resource_ContainerInterface_Attributes() = default;

Resource_ContainerInterface_Attributes::Resource_ContainerInterface_Attributes(
    std::string const& uniqueID, std::string const& references)
    : _UniqueID(uniqueID), _References(references) {}

std::string const& Resource_ContainerInterface_Attributes::get_UniqueID() const {
    return _UniqueID;
}

std::string const& Resource_ContainerInterface_Attributes::get_References() const {
    return _References;
}

void Resource_ContainerInterface_Attributes::set_UniqueID(std::string const& uniqueID) {
    _UniqueID = uniqueID;
}

void Resource_ContainerInterface_Attributes::set_References(std::string const& references) {
    _References = references;
}

} // namespace Quorvex::VPD
