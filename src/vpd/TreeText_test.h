#pragma once

#include "vpd/Resource.h"
#include "vpd/ResourceList.h"

#include <string>

namespace TreeText_test {

// One line of text for a whole resource tree, so that tests can compare
// trees at a glance: name|id|references, {properties}, <groups>, [lists].
inline std::string u_properties(Quorvex::VPD::ListOf_Properties const& properties) {
    std::string text = "{";
    for (auto const& entry : properties) {
        text += entry.first + "=" + static_cast<std::string const&>(entry.second.get_Value()) + ";";
    }
    return text + "}";
}

inline std::string u_resource(Quorvex::VPD::Resource const& resource) {
    std::string text = "(" + resource.get_DisplayName() + "|" + resource.get_UniqueID() + "|" +
                       resource.get_References() + ")" +
                       u_properties(resource.get_ListOf_Properties());
    for (auto const& group : resource.get_ListOf_PropertyGroups()) {
        text += "<" + group.first + u_properties(group.second) + ">";
    }
    for (auto const& list : resource.get_ListOf_ResourceLists()) {
        text += "[" + list.first + "/" + list.second.get_DisplayName() + ":";
        for (auto const& member : list.second) {
            text += u_resource(member.second);
        }
        text += "]";
    }
    return text;
}

} // namespace TreeText_test
