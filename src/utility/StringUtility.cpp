#include "utility/StringUtility.h"

#include <algorithm>
#include <numeric>

namespace StringUtility {

namespace {

// An upper bound of the pieces: one more than the delimiters.
std::size_t u_count_Pieces(std::string_view text, std::string_view delimiter) {
    std::size_t count = 1;
    for (std::string_view::size_type position = text.find(delimiter);
         position != std::string_view::npos;
         position = text.find(delimiter, position + delimiter.size())) {
        ++count;
    }
    return count;
}

} // namespace

std::vector<std::string_view> splitView(std::string_view text, std::string_view delimiter) {
    std::vector<std::string_view> pieces;
    if (text.empty() || delimiter.empty()) {
        return pieces;
    }
    pieces.reserve(u_count_Pieces(text, delimiter));
    // The search moves along the text instead of cutting its front off, so a
    // line of many fields is split in linear time.
    std::string_view::size_type start = 0;
    std::string_view::size_type position = text.find(delimiter, start);
    while (position != std::string_view::npos) {
        pieces.push_back(text.substr(start, position - start));
        start = position + delimiter.size();
        position = text.find(delimiter, start);
    }
    // A trailing delimiter leaves nothing behind and adds no empty piece.
    if (start < text.size()) {
        pieces.push_back(text.substr(start));
    }
    return pieces;
}

int splitString(std::string const& text, std::string const& delimiter,
                std::vector<std::string>& pieces) {
    // Checked before clearing: the caller's pieces stay as they were.
    // Kept for the parsers of console output: see docs/compatibility.md#split-string
    if (text.empty() || delimiter.empty()) {
        return 0;
    }
    std::vector<std::string_view> const views = splitView(text, delimiter);
    pieces.assign(views.begin(), views.end());
    return static_cast<int>(pieces.size());
}

std::string concatenate(std::initializer_list<std::string_view> pieces) {
    // Sized once and filled by plain copies: no capacity check per piece.
    std::string text(std::accumulate(pieces.begin(), pieces.end(), std::string::size_type{0},
                                     [](std::string::size_type length, std::string_view piece) {
                                         return length + piece.size();
                                     }),
                     '\0');
    auto next = text.begin();
    for (std::string_view const piece : pieces) {
        next = std::copy(piece.begin(), piece.end(), next);
    }
    return text;
}

} // namespace StringUtility
