#pragma once

#include <string>

namespace XML {

// The kind of an element's tag, as a code into the tag table from which the
// writer takes every delimiter it writes.
class Tag {
public:
    static constexpr unsigned long Type_Undefined = 0;
    static constexpr unsigned long Type_BeginTag = 1;
    static constexpr unsigned long Type_EmptyElementTag = 2;
    static constexpr unsigned long Type_EndTag = 3;
    static constexpr unsigned long Type_String = 4;
    static constexpr unsigned long Type_Content = 5;
    static constexpr unsigned long Type_Comment = 6;
    static constexpr unsigned long Type_Declaration = 7;

    Tag();
    // Not explicit: a code stands wherever a tag is expected.
    // cppcheck-suppress noExplicitConstructor ; converting, as declared
    Tag(unsigned long const& type);

    Tag& operator=(unsigned long const& type);

    unsigned long const& get_Type() const;
    void set_Type(unsigned long const& type);

    // Codes above Type_Declaration have no row: asking them is a caller's error.
    std::string get_BeginTag_StartDelimiter() const;
    std::string get_BeginTag_EndDelimiter() const;
    bool has_EndTag() const;
    // Empty for a kind that has no end tag.
    std::string get_EndTag_StartDelimiter() const;
    std::string get_EndTag_EndDelimiter() const;

private:
    unsigned long _Type;
};

bool operator==(Tag const& a, Tag const& b);
bool operator==(Tag const& tag, unsigned long const& type);
bool operator!=(Tag const& tag, unsigned long const& type);

// The same codes under their names in the namespace itself.
inline constexpr unsigned long Type_Undefined = Tag::Type_Undefined;
inline constexpr unsigned long Type_BeginTag = Tag::Type_BeginTag;
inline constexpr unsigned long Type_EmptyElementTag = Tag::Type_EmptyElementTag;
inline constexpr unsigned long Type_EndTag = Tag::Type_EndTag;
inline constexpr unsigned long Type_String = Tag::Type_String;
inline constexpr unsigned long Type_Content = Tag::Type_Content;
inline constexpr unsigned long Type_Comment = Tag::Type_Comment;
inline constexpr unsigned long Type_Declaration = Tag::Type_Declaration;

} // namespace XML
