#include "vpd/ResourceSet_ContainerInterface_Attributes.h"

namespace Quorvex::VPD {

ResourceSet_ContainerInterface_Attributes::ResourceSet_ContainerInterface_Attributes() = default;

ResourceSet_ContainerInterface_Attributes::ResourceSet_ContainerInterface_Attributes(
    std::string const& classText, std::string const& type, std::string const& version,
    std::string const& timeStamp)
    : _Class(classText), _Type(type), _Version(version), _TimeStamp(timeStamp) {}

std::string const& ResourceSet_ContainerInterface_Attributes::get_Class() const {
    return _Class;
}

std::string const& ResourceSet_ContainerInterface_Attributes::get_Type() const {
    return _Type;
}

std::string const& ResourceSet_ContainerInterface_Attributes::get_Version() const {
    return _Version;
}

std::string const& ResourceSet_ContainerInterface_Attributes::get_TimeStamp() const {
    return _TimeStamp;
}

void ResourceSet_ContainerInterface_Attributes::set_Class(std::string const& classText) {
    _Class = classText;
}

void ResourceSet_ContainerInterface_Attributes::set_Type(std::string const& type) {
    _Type = type;
}

void ResourceSet_ContainerInterface_Attributes::set_Version(std::string const& version) {
    _Version = version;
}

void ResourceSet_ContainerInterface_Attributes::set_TimeStamp(std::string const& timeStamp) {
    _TimeStamp = timeStamp;
}

} // namespace Quorvex::VPD
