#pragma once

#include "xml/Tag.h"

#include <map>
#include <string>
#include <vector>

namespace XML {

// One node of a document being built for output. Text, comments and
// declarations are elements too, of their own tag kind, whose name is the
// text, the comment or the declaration's target. Children are held by value.
//
// Assignment keeps the target's own namespace. No move operations are
// declared, so assigning a temporary keeps it as well.
class Element {
public:
    using Attributes = std::map<std::string, std::string>;

    // A begin-tag element with no name.
    Element();
    Element(std::string const& name, unsigned long const& type);
    Element(Element const& other);
    Element& operator=(Element const& other);
    ~Element();

    Tag const& get_Tag() const;
    std::string const& get_Namespace() const;
    std::string const& get_Name() const;
    // Sorted by name, byte-wise.
    Attributes const& get_Attribute() const;
    std::vector<Element> const& get_Content() const;
    std::vector<Element>& get_Content();
    unsigned long get_NumberOfAttribute() const;
    unsigned long get_NumberOfContent() const;

    void set_Tag(unsigned long const& type);
    void set_Tag(Tag const& tag);
    void set_Namespace(std::string const& nameSpace);
    void set_Name(std::string const& name);

    // Empty when there is no such attribute.
    std::string get_AttributeValue(std::string const& name) const;
    bool has_Attribute(std::string const& name) const;
    // The new number of attributes; 0, and the first value kept, when the
    // name is present already.
    unsigned long insert_Attribute(std::string const& name, std::string const& value);

    // Append copies at the end; the new number of children, or 0 when the
    // content did not grow as asked.
    unsigned long insert_Content(Element const& child);
    unsigned long insert_Content(std::vector<Element> const& children);

private:
    Tag _Tag;
    std::string _Namespace;
    std::string _Name;
    Attributes _Attribute;
    std::vector<Element> _Content;
};

} // namespace XML

// Lists of elements go with elements: make ListOf_Elements complete for every
// unit that includes this header. It comes after Element, which it holds by
// value.
#include "xml/ListOf_Elements.h"
