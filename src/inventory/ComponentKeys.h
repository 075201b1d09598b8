#pragma once

#include "inventory/Component.h"

#include <vector>

namespace inventory {

// The keyword that holds a component's hardware location code.
inline constexpr char gc_LocationCodeKeyword[] = "YL";

// Gives every component its key (docs/inventory.md): its location code (the
// first non-empty "YL" value), else its unique ID, else its display name,
// numbered by occurrence where components of one document share it.
void assignComponentKeys(std::vector<Component>& components);

} // namespace inventory
