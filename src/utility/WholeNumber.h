#pragma once

#include <optional>
#include <string>

namespace util {

// The number text spells when it is a whole number from lowest to highest:
// decimal digits only, no sign, space or anything after them; nothing else.
std::optional<unsigned long long>
wholeNumberWithin(std::string const& text, unsigned long long lowest, unsigned long long highest);

} // namespace util
