#pragma once
// A text cut into its lines.

#include <string>
#include <vector>

namespace QuorvexTest {

// Each line without its line feed; a last line without one counts too.
std::vector<std::string> linesOf(std::string const& text);

} // namespace QuorvexTest
