#pragma once

#include "transform/XML_Element_2_OStream.h"
#include "xml/Element.h"

#include <sstream>
#include <string>

namespace ElementText_test {

// The text the writer makes of an element standing alone at the top level.
inline std::string u_text(XML::Element const& element) {
    std::ostringstream out;
    Transform::XML_Element_2_OStream(out, 0)(element, true, 0);
    return out.str();
}

} // namespace ElementText_test
