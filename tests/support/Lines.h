#pragma once
// A text cut into its lines.

#include <string>
#include <vector>

namespace QuorvexTest {

// Each line without its line feed; a last line without one counts too.
std::vector<std::string> linesOf(std::string const& text);

// Whether one of the lines is exactly line.
bool contains(std::vector<std::string> const& lines, std::string const& line);

} // namespace QuorvexTest
