#include "relay/FileInfo.h"

#include "utility/StringUtility.h"

namespace Quorvex::RELAY {

FileInfo::FileInfo() = default;

FileInfo::FileInfo(std::string const& name, std::string const& owner, std::string const& group,
                   std::string const& permission)
    : _FileName(name), _FileOwner(owner), _FileGroup(group), _FilePermission(permission) {}

std::string const& FileInfo::get_FileName() const {
    return _FileName;
}
std::string const& FileInfo::get_FileOwner() const {
    return _FileOwner;
}
std::string const& FileInfo::get_FileGroup() const {
    return _FileGroup;
}
std::string const& FileInfo::get_FilePermission() const {
    return _FilePermission;
}

void FileInfo::set_FileName(std::string const& name) {
    _FileName = name;
}
void FileInfo::set_FileOwner(std::string const& owner) {
    _FileOwner = owner;
}
void FileInfo::set_FileGroup(std::string const& group) {
    _FileGroup = group;
}
void FileInfo::set_FilePermission(std::string const& permission) {
    _FilePermission = permission;
}

std::string FileInfo::get_FileInfoString() const {
    // The remote action tool reads the permission first.
    // Kept for the remote action tool: see docs/compatibility.md#file-attributes
    return StringUtility::concatenate(
        {"FILE_PERM=", _FilePermission, ";FILE_OWNER=", _FileOwner, ";FILE_GROUP=", _FileGroup});
}

} // namespace Quorvex::RELAY
