#include "relay/ReturnCode.h"

#include "utility/StringUtility.h"

#include <algorithm>
#include <cstdint>
#include <cstdlib>

namespace Quorvex::RELAY {

// Constructed ahead of every ordinary start-up object, so that code run by
// another unit's start-up (or destroyed late at exit) still finds it whole.
[[gnu::init_priority(101)]] ReturnCode const cBlankReturnCode{};

ReturnCode::ReturnCode() = default;

ReturnCode::ReturnCode(std::string const& line) {
    std::vector<std::string_view> const tokens = StringUtility::splitView(line, "::");
    // The part that starts at "Rc" is added first, so its keys win over the
    // same keys in the leading part.
    // Kept for the remote action tool's replies: see docs/compatibility.md#reply-pairs
    auto const rc = std::find(tokens.cbegin(), tokens.cend(), "Rc");
    _convert_Vector_2_Map(rc, tokens.cend());
    _convert_Vector_2_Map(tokens.cbegin(), rc);
}

bool ReturnCode::contains(std::string const& key) const {
    return _Values.count(key) != 0;
}

std::string const& ReturnCode::get_ValueOf(std::string const& key) const {
    auto const found = _Values.find(key);
    return found == _Values.end() ? _Blank : found->second;
}

int ReturnCode::get_Rc() const {
    return _get_Number("Rc");
}

int ReturnCode::get_RcCmd() const {
    return _get_Number("RcCmd");
}

std::string const& ReturnCode::get_RetStr1() const {
    return get_ValueOf("RetStr1");
}

std::string const& ReturnCode::get_RetStr2() const {
    return get_ValueOf("RetStr2");
}

std::map<std::string, std::string> const& ReturnCode::get_Values() const {
    return _Values;
}

void ReturnCode::_convert_Vector_2_Map(Token_Iterator first, Token_Iterator last) {
    while (first != last) {
        std::string_view const key = *first++;
        std::string_view const value = first == last ? std::string_view() : *first++;
        _Values.try_emplace(std::string(key), value);
    }
}

int ReturnCode::_get_Number(std::string const& key) const {
    // Read as an unsigned number and narrowed to 32 bits, so "-1" stays -1,
    // text without digits gives 0 and nothing a tool prints can fail.
    // Kept for status-file scripts: see docs/compatibility.md#reply-numbers
    auto const found = _Values.find(key);
    char const* const text = found == _Values.end() ? "-1" : found->second.c_str();
    unsigned long long const value = std::strtoull(text, nullptr, 10);
    return static_cast<int>(static_cast<std::uint32_t>(value));
}

} // namespace Quorvex::RELAY
