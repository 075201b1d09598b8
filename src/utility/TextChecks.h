#pragma once

#include <string>

namespace util {

// Checks on plain byte texts: names of files, fields of status lines.

bool startsWith(std::string const& text, std::string const& prefix);
bool endsWith(std::string const& text, std::string const& suffix);
// True for a non-empty text of ASCII digits only.
bool isDigits(std::string const& text);

} // namespace util
