#include "utility/StringUtility.h"

namespace StringUtility {

int splitString(std::string const& text, std::string const& delimiter,
                std::vector<std::string>& pieces) {
    // Checked before clearing: the caller's pieces stay as they were.
    // Kept for the parsers of console output: see docs/compatibility.md#split-string
    if (text.empty() || delimiter.empty()) {
        return 0;
    }
    pieces.clear();
    // The search moves along the text instead of cutting its front off, so a
    // line of many fields is split in linear time.
    std::string::size_type start = 0;
    std::string::size_type position = text.find(delimiter, start);
    while (position != std::string::npos) {
        pieces.push_back(text.substr(start, position - start));
        start = position + delimiter.size();
        position = text.find(delimiter, start);
    }
    // A trailing delimiter leaves nothing behind and adds no empty piece.
    if (start < text.size()) {
        pieces.push_back(text.substr(start));
    }
    return static_cast<int>(pieces.size());
}

} // namespace StringUtility
