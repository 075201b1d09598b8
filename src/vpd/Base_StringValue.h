#pragma once

#include <string>

namespace Quorvex::VPD {

// Gives a model object the text under which keyed lists store it.
// Objects are never deleted through this class, so it has no virtual
// destructor; the protected one keeps anybody from trying.
class Base_StringValue {
public:
    virtual std::string const& __StringValue() const = 0;

    // A copy of the key text.
    operator std::string() const;

protected:
    Base_StringValue() = default;
    Base_StringValue(Base_StringValue const& other) = default;
    Base_StringValue& operator=(Base_StringValue const& other) = default;
    ~Base_StringValue() = default;
};

} // namespace Quorvex::VPD
