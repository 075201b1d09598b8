#pragma once

#include "transform/Utility__XML_Element_2_OStream.h"
#include "xml/Element.h"

#include <ostream>

namespace Transform {

// Writes an element tree as indented text: three spaces per indentation
// level, every line break flushed, names, values and text exactly as stored
// (nothing is escaped). Nothing is written after the last end tag.
class XML_Element_2_OStream {
public:
    XML_Element_2_OStream(std::ostream& out, unsigned long const& indentationLevel);

    // At depth 0 nothing precedes the element; deeper, newLine puts it on a
    // line of its own at this writer's indentation.
    std::ostream& operator()(XML::Element const& element, bool const& newLine,
                             unsigned int const& depth);

private:
    void _print_BeginTag(XML::Element const& element);
    void _print_Name(XML::Element const& element);
    void _print_Attribute(XML::Element const& element);
    // Writes the attributes of an "xml" declaration with "version" first;
    // false, having written nothing, for any other element.
    bool _printSpecial_Declaration_Attribute(XML::Element const& element);
    void _print_Content(XML::Element const& element);
    void _print_EndTag(XML::Element const& element);
    void _print_String(XML::Element const& element);
    void _insert_NewLine();
    void _insert_Indent();

    void _print_OneAttribute(std::string const& name, std::string const& value);

    unsigned long _IndentationLevel;
    std::ostream& _OStream;
    unsigned int _Depth{0};
};

} // namespace Transform
