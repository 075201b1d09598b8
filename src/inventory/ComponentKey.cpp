#include "inventory/ComponentKey.h"

#include <tuple>

namespace inventory {

std::string ComponentKey::identity() const {
    if (occurrence == 1) {
        return text;
    }
    return text + " #" + std::to_string(occurrence);
}

bool operator==(ComponentKey const& a, ComponentKey const& b) {
    return std::tie(a.kind, a.text, a.occurrence) == std::tie(b.kind, b.text, b.occurrence);
}

} // namespace inventory
