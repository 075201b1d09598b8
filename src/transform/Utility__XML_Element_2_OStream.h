#pragma once

#include "xml/Element.h"

namespace Transform {

// Support for the element writer.
class Utility__XML_Element_2_OStream {
public:
    // Whether an element could be written in the short empty-element form.
    // The writer itself always writes a childless begin-tag element as a
    // begin tag followed by its end tag.
    static bool _u_usingEmptyElementTag(XML::Element const& element);
};

} // namespace Transform
