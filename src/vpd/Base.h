#pragma once

#include <string>

namespace Quorvex {
namespace VPD {

// The display name that every model object carries.
class Base {
public:
    Base();
    Base(std::string const& displayName);

    std::string const& get_DisplayName() const;
    void set_DisplayName(std::string const& displayName);

private:
    std::string _DisplayName;
};

} // namespace VPD
} // namespace Quorvex
