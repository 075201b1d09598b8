#include "inventory/Component.h"

#include <algorithm>

namespace inventory {

std::optional<std::string> Component::valueOf(std::string const& name) const {
    auto const found =
        std::find_if(keywords.begin(), keywords.end(),
                     [&name](Keyword const& keyword) { return keyword.name == name; });
    if (found == keywords.end()) {
        return std::nullopt;
    }
    return found->value;
}

} // namespace inventory
