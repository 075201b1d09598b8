#pragma once

#include <string>

namespace Quorvex::VPD {

// A resource's identity (its key in a resource list) and its references.
class Resource_ContainerInterface_Attributes {
public:
    Resource_ContainerInterface_Attributes();
    Resource_ContainerInterface_Attributes(std::string const& uniqueID,
                                           std::string const& references);

    std::string const& get_UniqueID() const;
    std::string const& get_References() const;
    void set_UniqueID(std::string const& uniqueID);
    void set_References(std::string const& references);

private:
    std::string _UniqueID;
    std::string _References;
};

} // namespace Quorvex::VPD
