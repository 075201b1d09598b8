#pragma once

#include "vpd/ListOf_Properties.h"

#include <cstddef>
#include <string>

namespace Quorvex::VPD {

// Gives a resource its properties, keyed by keyword.
class Resource_ContainerInterface_ListOf_Properties {
public:
    bool has_Property(std::string const& keyword) const;
    std::size_t get_NumberOf_Properties() const;
    ListOf_Properties const& get_ListOf_Properties() const;
    ListOf_Properties& get_ListOf_Properties();
    // A keyword present already keeps its first property.
    void insert_Property(Property const& property);

private:
    ListOf_Properties _ListOf_Properties;
};

} // namespace Quorvex::VPD
