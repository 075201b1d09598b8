#include "history/DisplayText.h"

#include <algorithm>

namespace history {

namespace {

constexpr char gc_Ellipsis[] = "\u2026";

// A byte that continues a UTF-8 character rather than starting one.
bool isContinuationByte(char byte) {
    return (static_cast<unsigned char>(byte) & 0xC0U) == 0x80U;
}

} // namespace

std::size_t displayWidth(std::string const& text) {
    return static_cast<std::size_t>(std::count_if(
        text.begin(), text.end(), [](char byte) { return !isContinuationByte(byte); }));
}

std::string cutToWidth(std::string const& text, std::size_t width) {
    if (displayWidth(text) <= width) {
        return text;
    }
    if (width == 0) {
        return "";
    }
    std::size_t kept = 0;
    std::size_t end = 0;
    for (; end < text.size(); ++end) {
        if (!isContinuationByte(text[end]) && kept++ == width - 1) {
            break;
        }
    }
    return text.substr(0, end) + gc_Ellipsis;
}

std::string oneLine(std::string text) {
    std::replace_if(
        text.begin(), text.end(),
        [](char byte) { return static_cast<unsigned char>(byte) < 0x20U || byte == 0x7F; }, ' ');
    return text;
}

} // namespace history

namespace history {

namespace {

std::string twoDigits(long long number) {
    return (number < 10 ? "0" : "") + std::to_string(number);
}

} // namespace

std::string shownTime(std::string const& isoTime) {
    std::string shown = isoTime.substr(0, 16);
    if (shown.size() > 10 && shown[10] == 'T') {
        shown[10] = ' ';
    }
    return shown;
}

std::string durationText(std::optional<long long> seconds) {
    if (!seconds || *seconds < 0) {
        return "?";
    }
    if (*seconds < 60) {
        return std::to_string(*seconds) + "s";
    }
    if (*seconds < 3600) {
        return std::to_string(*seconds / 60) + "m " + twoDigits(*seconds % 60) + "s";
    }
    return std::to_string(*seconds / 3600) + "h " + twoDigits(*seconds / 60 % 60) + "m";
}

} // namespace history
