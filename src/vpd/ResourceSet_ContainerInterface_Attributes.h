#pragma once

#include <string>

namespace Quorvex::VPD {

// The document attributes of a resource set.
class ResourceSet_ContainerInterface_Attributes {
public:
    ResourceSet_ContainerInterface_Attributes();
    ResourceSet_ContainerInterface_Attributes(std::string const& classText, std::string const& type,
                                              std::string const& version,
                                              std::string const& timeStamp);

    std::string const& get_Class() const;
    std::string const& get_Type() const;
    std::string const& get_Version() const;
    std::string const& get_TimeStamp() const;
    void set_Class(std::string const& classText);
    void set_Type(std::string const& type);
    void set_Version(std::string const& version);
    void set_TimeStamp(std::string const& timeStamp);

private:
    std::string _Class;
    std::string _Type;
    std::string _Version;
    std::string _TimeStamp;
};

} // namespace Quorvex::VPD
