#include "xml/Tag.h"

#include <cassert>

namespace XML {

namespace {

struct DelimiterRow {
    const char* start;
    const char* end;
    // The row that supplies the end tag's delimiters; 0 for no end tag.
    unsigned long endTagType;
};

// One row per tag code. Constant data, so it is complete before any start-up
// code of another unit can write an element.
constexpr unsigned long gc_NumberOf_TagTypes = 8;
constexpr DelimiterRow gcDelimiterMatrix[gc_NumberOf_TagTypes] = {
    {"", "", 0},        // Type_Undefined
    {"<", ">", 3},      // Type_BeginTag
    {"<", "/>", 0},     // Type_EmptyElementTag
    {"</", ">", 0},     // Type_EndTag
    {"", "", 0},        // Type_String
    {">", "<", 0},      // Type_Content
    {"<!--", "-->", 0}, // Type_Comment
    {"<?", "?>", 0},    // Type_Declaration
};

DelimiterRow const& u_get_Row(unsigned long const& type) {
    assert(type < gc_NumberOf_TagTypes);
    return gcDelimiterMatrix[type];
}

} // namespace

Tag::Tag() : _Type(Type_Undefined) {}

Tag::Tag(unsigned long const& type) : _Type(type) {}

Tag& Tag::operator=(unsigned long const& type) {
    _Type = type;
    return *this;
}

unsigned long const& Tag::get_Type() const {
    return _Type;
}

void Tag::set_Type(unsigned long const& type) {
    _Type = type;
}

std::string Tag::get_BeginTag_StartDelimiter() const {
    return u_get_Row(_Type).start;
}

std::string Tag::get_BeginTag_EndDelimiter() const {
    return u_get_Row(_Type).end;
}

bool Tag::has_EndTag() const {
    return u_get_Row(_Type).endTagType != 0;
}

std::string Tag::get_EndTag_StartDelimiter() const {
    return u_get_Row(u_get_Row(_Type).endTagType).start;
}

std::string Tag::get_EndTag_EndDelimiter() const {
    return u_get_Row(u_get_Row(_Type).endTagType).end;
}

bool operator==(Tag const& a, Tag const& b) {
    return a.get_Type() == b.get_Type();
}

bool operator==(Tag const& tag, unsigned long const& type) {
    return tag.get_Type() == type;
}

bool operator!=(Tag const& tag, unsigned long const& type) {
    return !(tag == type);
}

} // namespace XML
