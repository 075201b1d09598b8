#pragma once

#include "inventory/Component.h"

#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace history {

// A component as the history keeps it (docs/history.md, "Inventory"): what
// identifies it from one run to the next, its display name, the resource
// list that holds it, and its keywords with their values in document order.
struct StoredComponent {
    struct Property {
        std::string keyword;
        std::string group;
        std::string value;
    };

    // What the key is (docs/inventory.md): 'L' a location code, 'U' a unique
    // ID, 'D' a display name; keys of different kinds never match.
    char keyKind = 'D';
    std::string key;
    std::string displayName;
    std::string list;
    std::vector<Property> properties;

    // The value of the first property with this keyword; empty when none.
    std::string valueOf(std::string_view keyword) const;
};

// The components of one document as the one text the documents table keeps:
// a line per component (key kind, key, display name, list) followed by a line per
// property (TAB, keyword, group, value), fields separated by TAB, with
// backslash, TAB, line feed and carriage return written \\ \t \n \r.
[[nodiscard]] std::string encodeComponents(std::vector<inventory::Component> const& components);
[[nodiscard]] std::vector<StoredComponent> decodeComponents(std::string_view text);

} // namespace history
