#pragma once

#include <initializer_list>
#include <string>
#include <string_view>
#include <vector>

namespace StringUtility {

// Cuts text at every occurrence of the whole delimiter and returns the number
// of pieces. Leading and inner empty fields are kept; a trailing delimiter
// gives no trailing empty piece. An empty text or delimiter returns 0 and
// leaves pieces as it was.
int splitString(std::string const& text, std::string const& delimiter,
                std::vector<std::string>& pieces);

// The same pieces as splitString, as views into text (which must outlive
// them): parsers that only look at the pieces copy nothing. An empty text or
// delimiter gives no pieces.
std::vector<std::string_view> splitView(std::string_view text, std::string_view delimiter);

// The pieces one after the other, built with a single allocation: command
// lines and trace blocks are assembled from many short pieces.
std::string concatenate(std::initializer_list<std::string_view> pieces);

} // namespace StringUtility
