#include "inventory/Keyword.h"

#include <tuple>

namespace inventory {

bool operator==(Keyword const& a, Keyword const& b) {
    return std::tie(a.name, a.displayName, a.value, a.group) ==
           std::tie(b.name, b.displayName, b.value, b.group);
}

} // namespace inventory
