#include "relay/GetFileFromPartition.h"

#include "relay/FileInfo.h"
#include "relay/RELAY_Utility.h"
#include "utility/StringUtility.h"

namespace Quorvex::RELAY {

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
    return StringUtility::concatenate(
        {RELAY_Utility::create_Parameter("RemoteFN", remote.get_FileName()),
         "::", RELAY_Utility::create_Parameter("LocalFN", local.get_FileName()),
         "::", RELAY_Utility::create_Parameter("LocalFileInfo", local.get_FileInfoString())});
}

} // namespace Quorvex::RELAY
