#include "inventory/ComponentKeys.h"

#include <map>
#include <utility>

namespace inventory {

namespace {

std::string firstLocationCode(Component const& component) {
    for (Keyword const& keyword : component.keywords) {
        if (keyword.name == gc_LocationCodeKeyword && !keyword.value.empty()) {
            return keyword.value;
        }
    }
    return {};
}

ComponentKey keyWithoutOccurrence(Component const& component) {
    std::string locationCode = firstLocationCode(component);
    if (!locationCode.empty()) {
        return {ComponentKey::Kind::LocationCode, std::move(locationCode)};
    }
    if (!component.uniqueId.empty()) {
        return {ComponentKey::Kind::UniqueId, component.uniqueId};
    }
    return {ComponentKey::Kind::DisplayName, component.displayName};
}

} // namespace

void assignComponentKeys(std::vector<Component>& components) {
    std::map<std::pair<ComponentKey::Kind, std::string>, unsigned> seen;
    for (Component& component : components) {
        component.key = keyWithoutOccurrence(component);
        component.key.occurrence = ++seen[{component.key.kind, component.key.text}];
    }
}

} // namespace inventory
