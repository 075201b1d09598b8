#include "relay/RELAY_Utility.h"

#include "relay/FileInfo.h"

#include <charconv>
#include <iterator>

namespace Quorvex::RELAY {

namespace {

// Every transferred file gets the same owner and permission; only the
// group tells the console's files from the partition's.
constexpr char gc_FileOwner[] = "quorvex";
constexpr char gc_FilePermission[] = "660";
constexpr char gc_PYLON_FileGroup[] = "pylon";
constexpr char gc_Client_FileGroup[] = "system";

void _u_set_Default_FileInfo(FileInfo& info, std::string const& group) {
    info.set_FileOwner(gc_FileOwner);
    info.set_FileGroup(group);
    info.set_FilePermission(gc_FilePermission);
}

} // namespace

// Quoted but not escaped. Kept for the remote action tool: see
// docs/compatibility.md#no-escaping-command-line
std::string RELAY_Utility::create_Parameter(std::string const& name, std::string const& value) {
    std::string parameter;
    append_Parameter(parameter, name, value);
    return parameter;
}

std::string RELAY_Utility::create_Parameter(std::string const& name, long const& value) {
    std::string parameter;
    append_Parameter(parameter, name, value);
    return parameter;
}

void RELAY_Utility::append_Parameter(std::string& text, std::string_view name,
                                     std::string_view value) {
    text.reserve(text.size() + name.size() + value.size() + 4);
    text.append(name).append("::\"").append(value).push_back('"');
}

void RELAY_Utility::append_Parameter(std::string& text, std::string_view name, long value) {
    // Formatted on the stack: no allocation of its own.
    char digits[24];
    auto const end = std::to_chars(std::begin(digits), std::end(digits), value).ptr;
    text.append(name).append("::").append(digits, static_cast<std::size_t>(end - digits));
}

void RELAY_Utility::set_Default_PYLON_FileInfo(FileInfo& info) {
    _u_set_Default_FileInfo(info, gc_PYLON_FileGroup);
}

void RELAY_Utility::set_Default_Client_FileInfo(FileInfo& info) {
    _u_set_Default_FileInfo(info, gc_Client_FileGroup);
}

} // namespace Quorvex::RELAY
