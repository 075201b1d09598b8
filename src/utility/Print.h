#pragma once

#include <map>
#include <ostream>
#include <sstream>
#include <string>
#include <vector>

namespace DEBUG::STL {

// Writes string containers for the trace, one element a line with a
// right-aligned index column. Only the width of the one padded item is set;
// the stream's other settings stay as they are.
class Print {
public:
    explicit Print(::std::ostream& out);

    // Each line: "[" + index padded with blanks on the left + "] = " + element
    // when withIndex is true, else the element alone.
    void print_Vector_Of_String(::std::vector<::std::string> const& v, bool const& withIndex);
    void operator()(::std::vector<::std::string> const& v, bool const& withIndex);

    // Each line: "[" + key padded with blanks on the left + "] = " + value.
    void print_Map_Of_String_String(::std::map<::std::string, ::std::string> const& m);
    void operator()(::std::map<::std::string, ::std::string> const& m);

    // The number of decimal digits of the vector's size.
    template <typename T> static unsigned int get_IndexWidth_Vector(::std::vector<T> const& v) {
        return static_cast<unsigned int>(::std::to_string(v.size()).size());
    }

    // The length of the longest key as written to a stream, 0 for an empty map.
    template <typename K, typename V>
    static unsigned int get_IndexWidth_Map(::std::map<K, V> const& m) {
        ::std::string::size_type width = 0;
        for (auto const& entry : m) {
            ::std::ostringstream key;
            key << entry.first;
            if (key.str().size() > width) {
                width = key.str().size();
            }
        }
        return static_cast<unsigned int>(width);
    }

private:
    ::std::ostream& _out;
};

} // namespace DEBUG::STL
