#include "vpd/ListOf_Properties.h"

namespace Quorvex::VPD {

ListOf_Properties::ListOf_Properties() = default;

ListOf_Properties::ListOf_Properties(ListOf_Properties const& other) = default;

ListOf_Properties& ListOf_Properties::operator=(ListOf_Properties const& other) = default;

ListOf_Properties::~ListOf_Properties() = default;

} // namespace Quorvex::VPD
