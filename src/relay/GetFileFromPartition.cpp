#include "relay/GetFileFromPartition.h"

#include "relay/FileInfo.h"
#include "relay/RELAY_Utility.h"

#include <cstddef>

namespace Quorvex::RELAY {

namespace {

// Room for the parameters' names, quotes and separators.
constexpr std::size_t gc_ParameterOverhead = 64;

} // namespace

GetFileFromPartition::GetFileFromPartition(TargetPartition const& target) : Base(target) {}

GetFileFromPartition::~GetFileFromPartition() = default;

int GetFileFromPartition::getFileFromPartition(std::string const& remoteFileName,
                                               std::string const& localFileName) {
    set_Action("getFileFromPartition");
    get_TargetPartition().use_PartitionID();
    return execute(createString_GetFileParameters(remoteFileName, localFileName));
}

int GetFileFromPartition::getFileFromPartition(std::string const& fileName) {
    return getFileFromPartition(fileName, fileName);
}

std::string GetFileFromPartition::createString_GetFileParameters(std::string const& remoteFileName,
                                                                 std::string const& localFileName) {
    // The fetched file lands on the console and gets the console's attributes.
    FileInfo const remote(remoteFileName, "", "", "");
    FileInfo local(localFileName, "", "", "");
    RELAY_Utility::set_Default_PYLON_FileInfo(local);
    // Joined in one string that is sized for all of them.
    std::string const fileInfo = local.get_FileInfoString();
    std::string parameters;
    parameters.reserve(gc_ParameterOverhead + remote.get_FileName().size() +
                       local.get_FileName().size() + fileInfo.size());
    RELAY_Utility::append_Parameter(parameters, "RemoteFN", remote.get_FileName());
    parameters.append("::");
    RELAY_Utility::append_Parameter(parameters, "LocalFN", local.get_FileName());
    parameters.append("::");
    RELAY_Utility::append_Parameter(parameters, "LocalFileInfo", fileInfo);
    return parameters;
}

} // namespace Quorvex::RELAY
