#include "vpd/Property.h"

namespace Quorvex::VPD {

namespace {

constexpr unsigned int gc_ValueType_String = 0;

} // namespace

Keywords_DisplayName const& Property::ms_Keywords_DisplayName =
    Property::_get_Keywords_DisplayName();

Keywords_DisplayName const& Property::_get_Keywords_DisplayName() {
    static Keywords_DisplayName const table;
    return table;
}

Property::Property() = default;

Property::Property(std::string const& keyword, std::string const& valueText)
    : _Keyword(keyword), _Value(valueText, gc_ValueType_String) {
    _lookUp_DisplayName();
}

Property::Property(std::string const& keyword, Value const& value)
    : _Keyword(keyword), _Value(value) {
    _lookUp_DisplayName();
}

std::string const& Property::get_Keyword() const {
    return _Keyword;
}

Value const& Property::get_Value() const {
    return _Value;
}

void Property::set_Keyword(std::string const& keyword) {
    _Keyword = keyword;
    _lookUp_DisplayName();
}

// Resets the type to string. Kept for the documents' readers: see docs/compatibility.md#value-type
void Property::set_Value(std::string const& valueText) {
    _Value = Value(valueText, gc_ValueType_String);
}

void Property::set_Value(Value const& value) {
    _Value = value;
}

// Changes nothing: the first property of a keyword wins.
// Kept for the documents' readers: see docs/compatibility.md#first-property-wins
Property& Property::operator+=(Property const&) {
    return *this;
}

std::string const& Property::__StringValue() const {
    return _Keyword;
}

void Property::_lookUp_DisplayName() {
    std::string const& displayName = get_DisplayName();
    if (displayName.empty() || displayName == _Keyword) {
        set_DisplayName(_get_Keywords_DisplayName()[_Keyword]);
    }
}

bool operator==(Property const& a, Property const& b) {
    return a.get_Keyword() == b.get_Keyword() && static_cast<std::string const&>(a.get_Value()) ==
                                                     static_cast<std::string const&>(b.get_Value());
}

bool operator!=(Property const& a, Property const& b) {
    return !(a == b);
}

} // namespace Quorvex::VPD
