#include "xml/ListOf_Elements.h"

namespace XML {

ListOf_Elements::ListOf_Elements() = default;

ListOf_Elements::ListOf_Elements(ListOf_Elements const& other) = default;

ListOf_Elements& ListOf_Elements::operator=(ListOf_Elements const& other) {
    return this == &other ? *this : const_cast<ListOf_Elements&>(other);
}

ListOf_Elements::~ListOf_Elements() = default;

} // namespace XML
