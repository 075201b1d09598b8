#pragma once

#include "xml/Element.h"

#include <vector>

namespace XML {

// A sequence of elements, used wherever a vector of elements is expected.
//
// Assignment copies nothing: the target keeps its elements, and the result
// refers to the source. Fill a list in place and never assign, swap or sort
// one. No move operations are declared, so temporaries behave the same.
class ListOf_Elements : public std::vector<Element> {
public:
    ListOf_Elements();
    ListOf_Elements(ListOf_Elements const& other);
    ListOf_Elements& operator=(ListOf_Elements const& other);
    ~ListOf_Elements();
};

} // namespace XML
