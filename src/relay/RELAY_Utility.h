#pragma once

#include <string>
#include <string_view>

namespace Quorvex::RELAY {

class FileInfo;

// Formats the name::value parameters of the remote action command and fills
// in the file attributes that transferred files get.
class RELAY_Utility {
public:
    // name::"value"; the value is written as it is, without escaping.
    static std::string create_Parameter(std::string const& name, std::string const& value);
    // name::value in decimal, without quotes.
    static std::string create_Parameter(std::string const& name, long const& value);

    // The same texts appended to text: a command's parameters are joined in
    // one string without a temporary per parameter.
    static void append_Parameter(std::string& text, std::string_view name, std::string_view value);
    static void append_Parameter(std::string& text, std::string_view name, long value);

    // Attributes of a file that lands on the console; the file name is kept.
    static void set_Default_PYLON_FileInfo(FileInfo& info);
    // Attributes of a file that lands on the partition; the file name is kept.
    static void set_Default_Client_FileInfo(FileInfo& info);
};

} // namespace Quorvex::RELAY
