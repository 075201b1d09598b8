#pragma once

#include "inventory/ComponentKey.h"
#include "inventory/Keyword.h"

#include <optional>
#include <string>
#include <vector>

namespace inventory {

// One resource of a VPD document (the machine, a partition, an adapter, a
// memory module, ...): its key, where it sits, and its keywords in document
// order.
struct Component {
    ComponentKey key;
    std::string displayName;
    std::string uniqueId;
    // The display name of the resource list that holds it ("Partitions",
    // "Adapters", ...); empty for the document's top resource.
    std::string list;
    // The index in the document's components of the resource that holds it.
    std::optional<std::size_t> parent;
    std::vector<Keyword> keywords;

    // The value of the first keyword called name, when there is one.
    std::optional<std::string> valueOf(std::string const& name) const;
};

} // namespace inventory
