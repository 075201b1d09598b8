#pragma once

#include <array>
#include <string_view>

namespace inventory {

// The names of the VPD document's elements and of the attribute that names
// a component, as the survey's document writer (src/transform) writes them:
// spelled once here for the document reader and the mending of stray markup.
inline constexpr std::string_view gc_RootElement = "com.zor.inventory";
inline constexpr std::string_view gc_ResourceSetElement = "ResourceSet";
inline constexpr std::string_view gc_ResourceElement = "Resource";
inline constexpr std::string_view gc_ResourceListElement = "ResourceList";
inline constexpr std::string_view gc_PropertyGroupElement = "PropertyGroup";
inline constexpr std::string_view gc_PropertyElement = "Property";
inline constexpr std::string_view gc_ValueElement = "Value";
inline constexpr std::string_view gc_DisplayNameAttribute = "displayName";

// Every element the writer writes.
inline constexpr std::array<std::string_view, 7> gc_ElementNames = {
    gc_RootElement,          gc_ResourceSetElement, gc_ResourceElement, gc_ResourceListElement,
    gc_PropertyGroupElement, gc_PropertyElement,    gc_ValueElement};

} // namespace inventory
