#include "utility/StringUtility.h"

namespace StringUtility {

int splitString(std::string const& text, std::string const& delimiter,
                std::vector<std::string>& pieces) {
    // Checked before clearing: the caller's pieces stay as they were.
    if (text.empty() || delimiter.empty()) {
        return 0;
    }
    std::string rest = text;
    std::string::size_type const delimiterLength = delimiter.size();
    pieces.clear();
    std::string::size_type position = rest.find(delimiter);
    while (position != std::string::npos) {
        pieces.push_back(rest.substr(0, position));
        rest.erase(0, position + delimiterLength);
        position = rest.find(delimiter);
    }
    // A trailing delimiter leaves nothing behind and adds no empty piece.
    if (!rest.empty()) {
        pieces.push_back(rest);
    }
    return static_cast<int>(pieces.size());
}

} // namespace StringUtility
