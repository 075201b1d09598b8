#include "vpd/Resource_ContainerInterface_ListOf_Properties.h"

namespace Quorvex::VPD {

bool Resource_ContainerInterface_ListOf_Properties::has_Property(std::string const& keyword) const {
    return _ListOf_Properties.contains(keyword);
}

std::size_t Resource_ContainerInterface_ListOf_Properties::get_NumberOf_Properties() const {
    return _ListOf_Properties.size();
}

ListOf_Properties const&
Resource_ContainerInterface_ListOf_Properties::get_ListOf_Properties() const {
    return _ListOf_Properties;
}

ListOf_Properties& Resource_ContainerInterface_ListOf_Properties::get_ListOf_Properties() {
    return _ListOf_Properties;
}

void Resource_ContainerInterface_ListOf_Properties::insert_Property(Property const& property) {
    _ListOf_Properties.insert(property);
}

} // namespace Quorvex::VPD
