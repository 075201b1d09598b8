#include "transform/XML_Element_2_VPD_Value.h"

#include <exception>

namespace Transform {

namespace {

constexpr unsigned int gc_ValueType_String = 0;

} // namespace

XML_Element_2_VPD_Value::XML_Element_2_VPD_Value(Quorvex::VPD::Value& target) : _Target(target) {}

Quorvex::VPD::Value& XML_Element_2_VPD_Value::operator()(XML::Element const& element) {
    try {
        if (!_isValueElement(element)) {
            throw Error_ElementIsNotValue();
        }
        // Always of the string type. Kept for the class's callers: see
        // docs/compatibility.md#value-type
        _Target =
            Quorvex::VPD::Value(element.get_Content().front().get_Name(), gc_ValueType_String);
        return _Target;
    } catch (Error_ElementIsNotValue const&) {
        throw;
    } catch (...) {
        std::terminate();
    }
}

bool XML_Element_2_VPD_Value::_isValueElement(XML::Element const& element) {
    return element.get_Tag() == XML::Tag::Type_BeginTag && element.get_Name() == "Value" &&
           element.get_NumberOfContent() == 1 &&
           element.get_Content().front().get_Tag() == XML::Tag::Type_String;
}

} // namespace Transform
