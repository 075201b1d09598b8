#pragma once

#include "relay/Base.h"
#include "relay/FileInfo.h"

#include <string>

namespace Quorvex::RELAY {

// Runs a command on the partition; the client survey is one such command.
class RunCommandOnPartition : public virtual Base {
public:
    // cppcheck-suppress noExplicitConstructor ; converting, as declared: a target stands wherever
    // the operation is expected
    RunCommandOnPartition(TargetPartition const& target);
    ~RunCommandOnPartition();

    // Addresses the partition by identifier; returns the tool's exit code.
    int runCommandOnPartition(long const& commandID, std::string const& options,
                              FileInfo const& remoteFile);
    // Runs the client survey (command 0) with the options completed by the
    // machine identity and the client version unless they already name them.
    int execute_PartitionQuorvex(std::string const& options, std::string const& remoteFileName);

    // CmdID::<id>::CmdOpts::"<options>"::RemoteFN::"<name>"::RemoteFileInfo::"<attributes>"
    static std::string createString_RunCommandParameters(long const& commandID,
                                                         std::string const& options,
                                                         FileInfo const& remoteFile);

    // Appends " -c <machine>" unless "-c" occurs anywhere, then
    // " -pylonv <version>" unless "-pylonv" occurs anywhere. Open to callers
    // so that the completed options can be checked without a remote run.
    void _initialize_ClientQuorvexParameters(std::string& options);
};

} // namespace Quorvex::RELAY
