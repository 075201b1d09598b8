#include "inventory/ComponentKeys.h"

#include <algorithm>
#include <map>
#include <utility>

namespace inventory {

namespace {

std::string firstLocationCode(Component const& component) {
    auto const found = std::find_if(
        component.keywords.begin(), component.keywords.end(), [](Keyword const& keyword) {
            return keyword.name == gc_LocationCodeKeyword && !keyword.value.empty();
        });
    return found == component.keywords.end() ? std::string() : found->value;
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
