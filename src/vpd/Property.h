#pragma once

#include "vpd/Base.h"
#include "vpd/Base_StringValue.h"
#include "vpd/Keywords_DisplayName.h"
#include "vpd/Value.h"

#include <string>

namespace Quorvex::VPD {

// One piece of VPD: a keyword, its typed value and the keyword's display
// name. Keyed by its keyword.
class Property : public Base, public Base_StringValue {
public:
    // The one shared keyword table. It is built on first use, so a property
    // made by start-up code of another unit still finds it complete.
    static Keywords_DisplayName const& ms_Keywords_DisplayName;

    Property();
    // The value is of the "string" type.
    Property(std::string const& keyword, std::string const& valueText);
    Property(std::string const& keyword, Value const& value);

    std::string const& get_Keyword() const;
    Value const& get_Value() const;

    // A display name other than the keyword stays as it is.
    void set_Keyword(std::string const& keyword);
    // Resets the type to "string".
    void set_Value(std::string const& valueText);
    void set_Value(Value const& value);

    // Merging keeps this property as it is: in a keyed list the first
    // property of a keyword wins.
    Property& operator+=(Property const& other);

    std::string const& __StringValue() const override;

private:
    static Keywords_DisplayName const& _get_Keywords_DisplayName();

    // Takes the table's name when the display name is empty or still the
    // bare keyword.
    void _lookUp_DisplayName();

    std::string _Keyword;
    Value _Value;
};

// Keywords and value texts are compared; type codes are not.
bool operator==(Property const& a, Property const& b);
bool operator!=(Property const& a, Property const& b);

} // namespace Quorvex::VPD
