#pragma once

#include <string>

namespace Quorvex::RELAY {

// A transferred file's path and the owner, group and permission it gets.
class FileInfo {
public:
    FileInfo();
    FileInfo(std::string const& name, std::string const& owner, std::string const& group,
             std::string const& permission);

    std::string const& get_FileName() const;
    std::string const& get_FileOwner() const;
    std::string const& get_FileGroup() const;
    std::string const& get_FilePermission() const;

    void set_FileName(std::string const& name);
    void set_FileOwner(std::string const& owner);
    void set_FileGroup(std::string const& group);
    void set_FilePermission(std::string const& permission);

    // "FILE_PERM=<permission>;FILE_OWNER=<owner>;FILE_GROUP=<group>"; the file
    // name is not part of it.
    std::string get_FileInfoString() const;

private:
    std::string _FileName;
    std::string _FileOwner;
    std::string _FileGroup;
    std::string _FilePermission;
};

} // namespace Quorvex::RELAY
