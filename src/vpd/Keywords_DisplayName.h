#pragma once

#include <cstddef>
#include <map>
#include <string>

namespace Quorvex::VPD {

// The fixed dictionary from two-character VPD keyword to the human-readable
// name that goes with every property into the VPD documents.
class Keywords_DisplayName {
public:
    using const_iterator = std::map<std::string, std::string>::const_iterator;

    // Fills the whole built-in table.
    Keywords_DisplayName();

    // The display name of keyword; a keyword the table does not know is its
    // own display name, and the reference is then to the argument itself:
    // copy the result when the argument is a temporary. Never inserts.
    std::string const& operator[](std::string const& keyword) const;

    // In byte order of the keywords.
    const_iterator begin() const;
    const_iterator end() const;
    std::size_t size() const;

    // Adds one row; an entry already present is kept. Open to callers so
    // that a table with rows of its own (wildcard rows, say) can be built;
    // the shared table of the properties is const and never changes.
    void _insert(std::string const& keyword, std::string const& displayName);

private:
    // Tries keyword with one character, at position 0 and then 1, turned
    // into "*"; returns end() when no such row exists.
    const_iterator _find_Wildcard(std::string const& keyword) const;

    std::map<std::string, std::string> _Table;
};

} // namespace Quorvex::VPD
