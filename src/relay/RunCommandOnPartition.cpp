#include "relay/RunCommandOnPartition.h"

#include "quorvex/Version.h"
#include "relay/RELAY_Utility.h"

#include <cstddef>

namespace Quorvex::RELAY {

namespace {

// The client survey is command 0 on the partition.
constexpr long gc_ClientQuorvex_CommandID = 0;
// Room for the parameters' names, quotes, separators and the command number.
constexpr std::size_t gc_ParameterOverhead = 96;

} // namespace

RunCommandOnPartition::RunCommandOnPartition(TargetPartition const& target) : Base(target) {}

RunCommandOnPartition::~RunCommandOnPartition() = default;

int RunCommandOnPartition::runCommandOnPartition(long const& commandID, std::string const& options,
                                                 FileInfo const& remoteFile) {
    set_Action("runCmdOnPartition");
    get_TargetPartition().use_PartitionID();
    return execute(createString_RunCommandParameters(commandID, options, remoteFile));
}

int RunCommandOnPartition::execute_PartitionQuorvex(std::string const& options,
                                                    std::string const& remoteFileName) {
    FileInfo remoteFile(remoteFileName, "", "", "");
    RELAY_Utility::set_Default_Client_FileInfo(remoteFile);
    std::string completedOptions = options;
    _initialize_ClientQuorvexParameters(completedOptions);
    return runCommandOnPartition(gc_ClientQuorvex_CommandID, completedOptions, remoteFile);
}

std::string RunCommandOnPartition::createString_RunCommandParameters(long const& commandID,
                                                                     std::string const& options,
                                                                     FileInfo const& remoteFile) {
    // Joined in one string that is sized for all of them.
    std::string const fileInfo = remoteFile.get_FileInfoString();
    std::string parameters;
    parameters.reserve(gc_ParameterOverhead + options.size() + remoteFile.get_FileName().size() +
                       fileInfo.size());
    RELAY_Utility::append_Parameter(parameters, "CmdID", commandID);
    parameters.append("::");
    RELAY_Utility::append_Parameter(parameters, "CmdOpts", options);
    parameters.append("::");
    RELAY_Utility::append_Parameter(parameters, "RemoteFN", remoteFile.get_FileName());
    parameters.append("::");
    RELAY_Utility::append_Parameter(parameters, "RemoteFileInfo", fileInfo);
    return parameters;
}

void RunCommandOnPartition::_initialize_ClientQuorvexParameters(std::string& options) {
    // Plain substring checks: options that mention "-c" anywhere, even inside
    // another word, already name the machine. Kept for the partition's
    // client: see docs/compatibility.md#client-options
    if (options.find("-c") == std::string::npos) {
        options.append(" -c ").append(
            get_TargetPartition().get_Partition().get_MTMS().__StringValue());
    }
    if (options.find("-pylonv") == std::string::npos) {
        options.append(" -pylonv ").append(::Quorvex::gc_ClientVersion);
    }
}

} // namespace Quorvex::RELAY
