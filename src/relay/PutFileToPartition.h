#pragma once

#include "relay/Base.h"

#include <string>

namespace Quorvex::RELAY {

// Copies a file from the console to the same path on the partition.
class PutFileToPartition : public virtual Base {
public:
    // cppcheck-suppress noExplicitConstructor ; converting, as declared: a target stands wherever
    // the operation is expected
    PutFileToPartition(TargetPartition const& target);
    ~PutFileToPartition();

    // Addresses the partition by array; returns the tool's exit code.
    int putFileToPartition(std::string const& fileName);

    // LocalFN::"<name>"::RemoteFN::"<name>"::RemoteFileInfo::"<client attributes>"
    static std::string createString_PutFileParameters(std::string const& fileName);
};

} // namespace Quorvex::RELAY
