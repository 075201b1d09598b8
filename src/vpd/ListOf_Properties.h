#pragma once

#include "vpd/ListOf_.h"
#include "vpd/Property.h"

namespace Quorvex::VPD {

// Properties keyed by keyword; the first property of a keyword is kept.
class ListOf_Properties : public ListOf_<Property> {
public:
    ListOf_Properties();
    ListOf_Properties(ListOf_Properties const& other);
    ListOf_Properties& operator=(ListOf_Properties const& other);
    ~ListOf_Properties();
};

} // namespace Quorvex::VPD
