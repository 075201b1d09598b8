#pragma once

#include <string>
#include <vector>

namespace StringUtility {

// Cuts text at every occurrence of the whole delimiter and returns the number
// of pieces. Leading and inner empty fields are kept; a trailing delimiter
// gives no trailing empty piece. An empty text or delimiter returns 0 and
// leaves pieces as it was.
int splitString(std::string const& text, std::string const& delimiter,
                std::vector<std::string>& pieces);

} // namespace StringUtility
