#pragma once

#include <string>

namespace Quorvex::VPD {

// A property's value: its text, readable wherever a string is, and a type
// code naming how the text is to be read (0 "string" ... 5 "hex").
class Value : public std::string {
public:
    Value();
    Value(std::string const& text, unsigned int const& valueType);

    unsigned int get_ValueType() const;
    void set_ValueType(unsigned int const& valueType);

    // The name of the type code; only codes 0 to 5 have one.
    std::string get_String_ValueType() const;

private:
    unsigned int _ValueType;
};

} // namespace Quorvex::VPD
