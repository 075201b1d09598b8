#include "xml/Element.h"

#include <algorithm>
#include <cstddef>
#include <iterator>

namespace XML {

Element::Element() : _Tag(Tag::Type_BeginTag) {}

Element::Element(std::string const& name, unsigned long const& type) : _Tag(type), _Name(name) {}

Element::Element(Element const& other) = default;

// The target keeps its namespace. Kept for the class's callers: see
// docs/compatibility.md#element-assignment-namespace
Element& Element::operator=(Element const& other) {
    if (this != &other) {
        _Tag = other._Tag;
        _Name = other._Name;
        _Attribute = other._Attribute;
        _Content = other._Content;
    }
    return *this;
}

Element::~Element() = default;

Tag const& Element::get_Tag() const {
    return _Tag;
}

std::string const& Element::get_Namespace() const {
    return _Namespace;
}

std::string const& Element::get_Name() const {
    return _Name;
}

Element::Attributes const& Element::get_Attribute() const {
    return _Attribute;
}

std::vector<Element> const& Element::get_Content() const {
    return _Content;
}

std::vector<Element>& Element::get_Content() {
    return _Content;
}

unsigned long Element::get_NumberOfAttribute() const {
    return _Attribute.size();
}

unsigned long Element::get_NumberOfContent() const {
    return _Content.size();
}

void Element::set_Tag(unsigned long const& type) {
    _Tag.set_Type(type);
}

void Element::set_Tag(Tag const& tag) {
    _Tag = tag;
}

void Element::set_Namespace(std::string const& nameSpace) {
    _Namespace = nameSpace;
}

void Element::set_Name(std::string const& name) {
    _Name = name;
}

std::string Element::get_AttributeValue(std::string const& name) const {
    auto const hit = _Attribute.find(name);
    return hit == _Attribute.end() ? std::string() : hit->second;
}

bool Element::has_Attribute(std::string const& name) const {
    return _Attribute.count(name) != 0;
}

// Sorted by name, first value kept. Kept for the inventory importers: see
// docs/compatibility.md#attributes-sorted
unsigned long Element::insert_Attribute(std::string const& name, std::string const& value) {
    if (!_Attribute.emplace(name, value).second) {
        return 0;
    }
    return _Attribute.size();
}

unsigned long Element::insert_Content(Element const& child) {
    unsigned long const before = _Content.size();
    _Content.push_back(child);
    return _Content.size() == before + 1 ? _Content.size() : 0;
}

unsigned long Element::insert_Content(std::vector<Element> const& children) {
    unsigned long const before = _Content.size();
    // The children may be this element's own content: with the room made
    // first, appending never moves the elements still to be read.
    std::size_t const count = children.size();
    _Content.reserve(before + count);
    std::copy_n(children.begin(), count, std::back_inserter(_Content));
    return _Content.size() > before ? _Content.size() : 0;
}

} // namespace XML
