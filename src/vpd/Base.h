#pragma once

#include <string>

namespace Quorvex::VPD {

// The display name that every model object carries.
class Base {
public:
    Base();
    // cppcheck-suppress noExplicitConstructor ; converting, as declared: a display name stands
    // wherever a model base is expected
    Base(std::string const& displayName);

    std::string const& get_DisplayName() const;
    void set_DisplayName(std::string const& displayName);

private:
    std::string _DisplayName;
};

} // namespace Quorvex::VPD
