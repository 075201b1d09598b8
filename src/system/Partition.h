#pragma once

#include "system/MTMS.h"

#include <string>

namespace Quorvex::System {

// One logical partition of a managed machine as the console lists it.
class Partition {
public:
    Partition();
    Partition(MTMS const& mtms, std::string const& partitionID, std::string const& hostName);

    MTMS const& get_MTMS() const;
    std::string const& get_PartitionID() const;
    std::string const& get_HostName() const;
    std::string const& get_IP() const;
    std::string const& get_ActiveStatus() const;
    std::string const& get_OperatingSystem_Name() const;
    std::string const& get_OperatingSystem_Version() const;

    void set_MTMS(MTMS const& mtms);
    void set_PartitionID(std::string const& partitionID);
    void set_HostName(std::string const& hostName);
    void set_IP(std::string const& ip);
    void set_ActiveStatus(std::string const& activeStatus);
    void set_OperatingSystem_Name(std::string const& operatingSystem_Name);
    void set_OperatingSystem_Version(std::string const& operatingSystem_Version);

    // MTMS text + "-" + PartitionID
    std::string __StringValue() const;
    operator std::string() const;

    // File-name form: MTMS to_String(dashReplacement, separator) + idSeparator
    // + PartitionID; a null argument stands for "-".
    std::string to_String(const char* dashReplacement, const char* separator,
                          const char* idSeparator) const;

private:
    MTMS _MTMS;
    std::string _PartitionID;
    std::string _HostName;
    std::string _IP;
    std::string _ActiveStatus;
    std::string _OperatingSystem_Name;
    std::string _OperatingSystem_Version;
};

// By machine identity text, then partition ID as text ("10" before "9"), then host name.
bool operator<(Partition const& a, Partition const& b);

} // namespace Quorvex::System
