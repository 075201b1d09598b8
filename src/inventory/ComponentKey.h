#pragma once

#include <string>

namespace inventory {

// What identifies a component from one run to the next (docs/inventory.md):
// its hardware location code, else its unique ID, else its display name; the
// occurrence numbers components that share the same text in one document,
// in document order, from 1.
struct ComponentKey {
    enum class Kind { LocationCode, UniqueId, DisplayName };

    Kind kind = Kind::DisplayName;
    std::string text;
    unsigned occurrence = 1;

    // The key as one text: the text alone for the first occurrence, then
    // "<text> #<occurrence>" for the later ones.
    std::string identity() const;
};

bool operator==(ComponentKey const& a, ComponentKey const& b);

} // namespace inventory
