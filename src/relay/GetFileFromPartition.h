#pragma once

#include "relay/Base.h"

#include <string>

namespace Quorvex::RELAY {

// Copies a file from the partition to the console.
class GetFileFromPartition : public virtual Base {
public:
    // cppcheck-suppress noExplicitConstructor ; converting, as declared: a target stands wherever
    // the operation is expected
    GetFileFromPartition(TargetPartition const& target);
    ~GetFileFromPartition();

    // Addresses the partition by identifier; returns the tool's exit code.
    int getFileFromPartition(std::string const& remoteFileName, std::string const& localFileName);
    // The same name on the partition and on the console.
    int getFileFromPartition(std::string const& fileName);

    // RemoteFN::"<remote>"::LocalFN::"<local>"::LocalFileInfo::"<console attributes>"
    static std::string createString_GetFileParameters(std::string const& remoteFileName,
                                                      std::string const& localFileName);
};

} // namespace Quorvex::RELAY
