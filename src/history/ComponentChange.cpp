#include "history/ComponentChange.h"

#include <map>
#include <tuple>
#include <utility>

namespace history {

namespace {

// The keyword that holds a component's serial number.
constexpr char gc_SerialNumberKeyword[] = "SN";

using ComponentIdentity = std::pair<char, std::string>;
// A property's place in its component: keyword, group and occurrence, so
// that a keyword given twice compares one by one.
using PropertyPlace = std::tuple<std::string, std::string, unsigned>;

ComponentIdentity identityOf(StoredComponent const& component) {
    return {component.keyKind, component.key};
}

std::vector<std::pair<PropertyPlace, std::string const*>>
placesOf(StoredComponent const& component) {
    std::map<std::pair<std::string, std::string>, unsigned> seen;
    std::vector<std::pair<PropertyPlace, std::string const*>> places;
    for (StoredComponent::Property const& property : component.properties) {
        unsigned const occurrence = ++seen[{property.keyword, property.group}];
        places.push_back({{property.keyword, property.group, occurrence}, &property.value});
    }
    return places;
}

ComponentChange changeOf(std::string kind, StoredComponent const& component) {
    return {std::move(kind), component.key, component.displayName, {}, {}, {}};
}

void addPropertyChanges(StoredComponent const& before, StoredComponent const& after,
                        std::vector<ComponentChange>& changes) {
    std::map<PropertyPlace, std::string const*> old;
    for (auto const& place : placesOf(before)) {
        old.insert(place);
    }
    for (auto const& [place, value] : placesOf(after)) {
        auto const found = old.find(place);
        if (found == old.end() || *found->second != *value) {
            ComponentChange change = changeOf("property_changed", after);
            change.property = std::get<0>(place);
            if (found != old.end()) {
                change.oldValue = *found->second;
            }
            change.newValue = *value;
            changes.push_back(std::move(change));
        }
        if (found != old.end()) {
            old.erase(found);
        }
    }
    for (auto const& [place, value] : placesOf(before)) {
        if (old.count(place) != 0) {
            ComponentChange change = changeOf("property_changed", after);
            change.property = std::get<0>(place);
            change.oldValue = *value;
            changes.push_back(std::move(change));
        }
    }
}

void addChanges(StoredComponent const& before, StoredComponent const& after,
                std::vector<ComponentChange>& changes) {
    std::string const oldSerial = before.valueOf(gc_SerialNumberKeyword);
    std::string const newSerial = after.valueOf(gc_SerialNumberKeyword);
    if (!oldSerial.empty() && !newSerial.empty() && oldSerial != newSerial) {
        ComponentChange change = changeOf("replaced", after);
        change.oldValue = oldSerial;
        change.newValue = newSerial;
        changes.push_back(std::move(change));
        return;
    }
    addPropertyChanges(before, after, changes);
}

} // namespace

bool operator==(ComponentChange const& a, ComponentChange const& b) {
    return std::tie(a.kind, a.key, a.displayName, a.property, a.oldValue, a.newValue) ==
           std::tie(b.kind, b.key, b.displayName, b.property, b.oldValue, b.newValue);
}

std::vector<ComponentChange> compareComponents(std::vector<StoredComponent> const& before,
                                               std::vector<StoredComponent> const& after) {
    std::map<ComponentIdentity, StoredComponent const*> old;
    for (StoredComponent const& component : before) {
        old.emplace(identityOf(component), &component);
    }
    std::vector<ComponentChange> changes;
    for (StoredComponent const& component : after) {
        auto const found = old.find(identityOf(component));
        if (found == old.end()) {
            changes.push_back(changeOf("added", component));
            continue;
        }
        addChanges(*found->second, component, changes);
        old.erase(found);
    }
    for (StoredComponent const& component : before) {
        if (old.count(identityOf(component)) != 0) {
            changes.push_back(changeOf("removed", component));
        }
    }
    return changes;
}

} // namespace history
