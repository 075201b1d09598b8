#include "relay/PutFileToPartition.h"

#include "relay/FileInfo.h"
#include "relay/RELAY_Utility.h"

#include <sstream>

namespace Quorvex::RELAY {

PutFileToPartition::PutFileToPartition(TargetPartition const& target) : Base(target) {}

PutFileToPartition::~PutFileToPartition() = default;

int PutFileToPartition::putFileToPartition(std::string const& fileName) {
    set_Action("putFileToPartition");
    // Kept for the remote action tool: see docs/compatibility.md#put-by-array
    get_TargetPartition().use_PartitionArray();
    return execute(createString_PutFileParameters(fileName));
}

std::string PutFileToPartition::createString_PutFileParameters(std::string const& fileName) {
    // The file keeps its path: the same name on the console and on the partition.
    FileInfo const local(fileName, "", "", "");
    FileInfo remote(fileName, "", "", "");
    RELAY_Utility::set_Default_Client_FileInfo(remote);
    std::ostringstream parameters;
    parameters << RELAY_Utility::create_Parameter("LocalFN", local.get_FileName())
               << "::" << RELAY_Utility::create_Parameter("RemoteFN", remote.get_FileName()) << "::"
               << RELAY_Utility::create_Parameter("RemoteFileInfo", remote.get_FileInfoString());
    return parameters.str();
}

} // namespace Quorvex::RELAY
