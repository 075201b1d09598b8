#pragma once

#include <string>

namespace inventory {

// One property of a component as its document holds it: the keyword ("SN",
// "PN", "CL", ...), the display name the keyword table gives it, the value,
// and the display name of the property group it sits in (empty outside one).
struct Keyword {
    std::string name;
    std::string displayName;
    std::string value;
    std::string group;
};

bool operator==(Keyword const& a, Keyword const& b);

} // namespace inventory
