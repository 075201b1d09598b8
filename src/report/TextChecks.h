#pragma once

#include <string>

namespace report {

bool startsWith(std::string const& text, std::string const& prefix);
bool endsWith(std::string const& text, std::string const& suffix);
// True for a non-empty text of ASCII digits only.
bool isDigits(std::string const& text);

} // namespace report
