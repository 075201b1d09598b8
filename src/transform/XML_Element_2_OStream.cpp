#include "transform/XML_Element_2_OStream.h"

#include <string>

namespace Transform {

namespace {

constexpr unsigned long gc_IndentWidth = 3;
constexpr char gc_DeclarationTarget[] = "xml";
constexpr char gc_VersionAttribute[] = "version";

} // namespace

XML_Element_2_OStream::XML_Element_2_OStream(std::ostream& out,
                                             unsigned long const& indentationLevel)
    : _IndentationLevel(indentationLevel), _OStream(out) {}

std::ostream& XML_Element_2_OStream::operator()(XML::Element const& element, bool const& newLine,
                                                unsigned int const& depth) {
    _Depth = depth;
    if (_Depth != 0 && newLine) {
        _insert_NewLine();
        _insert_Indent();
    }
    _print_BeginTag(element);
    if (element.get_NumberOfContent() != 0) {
        _print_Content(element);
    }
    _print_EndTag(element);
    return _OStream;
}

void XML_Element_2_OStream::_print_BeginTag(XML::Element const& element) {
    _OStream << element.get_Tag().get_BeginTag_StartDelimiter();
    _print_Name(element);
    _print_Attribute(element);
    _OStream << element.get_Tag().get_BeginTag_EndDelimiter();
}

// Names and text are written unescaped. Kept for the inventory importers: see
// docs/compatibility.md#xml-no-escaping
void XML_Element_2_OStream::_print_Name(XML::Element const& element) {
    if (!element.get_Namespace().empty()) {
        _OStream << element.get_Namespace() << ':';
    }
    _OStream << element.get_Name();
}

void XML_Element_2_OStream::_print_Attribute(XML::Element const& element) {
    if (element.get_NumberOfAttribute() == 0 || _printSpecial_Declaration_Attribute(element)) {
        return;
    }
    for (auto const& attribute : element.get_Attribute()) {
        _print_OneAttribute(attribute.first, attribute.second);
    }
}

bool XML_Element_2_OStream::_printSpecial_Declaration_Attribute(XML::Element const& element) {
    if (element.get_Tag() != XML::Tag::Type_Declaration ||
        element.get_Name() != gc_DeclarationTarget || !element.has_Attribute(gc_VersionAttribute)) {
        return false;
    }
    _print_OneAttribute(gc_VersionAttribute, element.get_AttributeValue(gc_VersionAttribute));
    for (auto const& attribute : element.get_Attribute()) {
        if (attribute.first != gc_VersionAttribute) {
            _print_OneAttribute(attribute.first, attribute.second);
        }
    }
    return true;
}

// A lone text child stays on the begin tag's line; every other child gets a
// line of its own, and the end tag then a line at the begin tag's indentation.
void XML_Element_2_OStream::_print_Content(XML::Element const& element) {
    bool const isDeclaration = element.get_Tag() == XML::Tag::Type_Declaration;
    XML_Element_2_OStream childWriter(_OStream, _IndentationLevel + (isDeclaration ? 0 : 1));
    bool const hasOneChild = element.get_NumberOfContent() == 1;
    bool isInline = false;
    for (XML::Element const& child : element.get_Content()) {
        if (hasOneChild && child.get_Tag() == XML::Tag::Type_String) {
            _print_String(child);
            isInline = true;
        } else {
            childWriter(child, !isInline, _Depth + 1);
            isInline = false;
        }
    }
    if (!isInline) {
        _insert_NewLine();
        _insert_Indent();
    }
}

// Every begin tag gets its end tag, never the short empty form.
// Kept for the inventory importers: see docs/compatibility.md#no-empty-element-tag
void XML_Element_2_OStream::_print_EndTag(XML::Element const& element) {
    XML::Tag const& tag = element.get_Tag();
    if (tag.has_EndTag()) {
        _OStream << tag.get_EndTag_StartDelimiter();
        _print_Name(element);
        _OStream << tag.get_EndTag_EndDelimiter();
    }
}

void XML_Element_2_OStream::_print_String(XML::Element const& element) {
    _print_Name(element);
}

void XML_Element_2_OStream::_insert_NewLine() {
    _OStream << std::endl;
}

void XML_Element_2_OStream::_insert_Indent() {
    _OStream << std::string(_IndentationLevel * gc_IndentWidth, ' ');
}

// Values are written unescaped. Kept for the inventory importers: see
// docs/compatibility.md#xml-no-escaping
void XML_Element_2_OStream::_print_OneAttribute(std::string const& name, std::string const& value) {
    _OStream << ' ' << name << "=\"" << value << '"';
}

} // namespace Transform
