#pragma once

#include "history/StoredComponent.h"

#include <optional>
#include <string>
#include <vector>

namespace history {

// One change of a partition's inventory between two readable documents
// (docs/history.md, "Changes"): kind is added, removed, replaced (same key,
// new serial number) or property_changed (one per keyword).
struct ComponentChange {
    std::string kind;
    std::string key;
    std::string displayName;
    std::optional<std::string> property;
    std::optional<std::string> oldValue;
    std::optional<std::string> newValue;
};

bool operator==(ComponentChange const& a, ComponentChange const& b);

// The changes from before to after: for each component of after in its
// order, added, replaced or its property changes; then each component of
// before that after lacks, removed. A replaced component brings that one
// change only: its other values are the new part's.
[[nodiscard]] std::vector<ComponentChange>
compareComponents(std::vector<StoredComponent> const& before,
                  std::vector<StoredComponent> const& after);

} // namespace history
