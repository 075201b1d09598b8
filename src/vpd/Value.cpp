#include "vpd/Value.h"

#include <cassert>

namespace Quorvex::VPD {

namespace {

// Type names by code. Constant data, so it is ready before any start-up code
// of another unit makes a value.
constexpr unsigned int gc_NumberOf_ValueTypes = 6;
constexpr const char* gcString_ValueType[gc_NumberOf_ValueTypes] = {"string", "string[]", "integer",
                                                                    "float",  "boolean",  "hex"};

} // namespace

Value::Value() : _ValueType(0) {}

Value::Value(std::string const& text, unsigned int const& valueType)
    : std::string(text), _ValueType(valueType) {}

unsigned int Value::get_ValueType() const {
    return _ValueType;
}

void Value::set_ValueType(unsigned int const& valueType) {
    _ValueType = valueType;
}

std::string Value::get_String_ValueType() const {
    assert(_ValueType < gc_NumberOf_ValueTypes);
    return gcString_ValueType[_ValueType];
}

} // namespace Quorvex::VPD
