#include "utility/Print.h"

#include <iomanip>

namespace DEBUG::STL {

Print::Print(::std::ostream& out) : _out(out) {}

void Print::print_Vector_Of_String(::std::vector<::std::string> const& v, bool const& withIndex) {
    unsigned int const width = get_IndexWidth_Vector(v);
    unsigned int index = 0;
    for (::std::string const& element : v) {
        if (withIndex) {
            _out << "[" << ::std::setw(static_cast<int>(width)) << index << "] = ";
        }
        _out << element << ::std::endl;
        ++index;
    }
}

void Print::operator()(::std::vector<::std::string> const& v, bool const& withIndex) {
    print_Vector_Of_String(v, withIndex);
}

void Print::print_Map_Of_String_String(::std::map<::std::string, ::std::string> const& m) {
    unsigned int const width = get_IndexWidth_Map(m);
    for (auto const& entry : m) {
        _out << "[" << ::std::setw(static_cast<int>(width)) << entry.first << "] = " << entry.second
             << ::std::endl;
    }
}

void Print::operator()(::std::map<::std::string, ::std::string> const& m) {
    print_Map_Of_String_String(m);
}

} // namespace DEBUG::STL
