#include "TextDifference.h"

#include <algorithm>
#include <cstdio>

namespace QuorvexTest {

namespace {

constexpr std::size_t gc_ShownBytes = 120;

std::string escaped(std::string const& text) {
    std::string shown;
    for (char const c : text) {
        auto const byte = static_cast<unsigned char>(c);
        if (c == '\n') {
            shown += "\\n";
        } else if (c == '\t') {
            shown += "\\t";
        } else if (c == '\\') {
            shown += "\\\\";
        } else if (byte < 0x20 || byte >= 0x7f) {
            char hex[8];
            std::snprintf(hex, sizeof hex, "\\x%02x", byte);
            shown += hex;
        } else {
            shown += c;
        }
    }
    return shown;
}

std::string excerpt(std::string const& text, std::size_t offset) {
    if (offset >= text.size()) {
        return "(end of text)";
    }
    return "\"" + escaped(text.substr(offset, gc_ShownBytes)) + "\"";
}

} // namespace

std::string firstDifference(std::string const& expected, std::string const& actual) {
    if (expected == actual) {
        return "";
    }
    auto const parting = std::mismatch(
        expected.begin(),
        expected.begin() + static_cast<long>(std::min(expected.size(), actual.size())),
        actual.begin());
    auto const offset = static_cast<std::size_t>(parting.first - expected.begin());
    auto const lineStart = expected.rfind('\n', offset == 0 ? 0 : offset - 1);
    std::size_t const line =
        1 + static_cast<std::size_t>(std::count(expected.begin(), parting.first, '\n'));
    std::size_t const column =
        lineStart == std::string::npos || offset == 0 ? offset + 1 : offset - lineStart;
    return "first differing byte at offset " + std::to_string(offset) + " (line " +
           std::to_string(line) + ", column " + std::to_string(column) + "): expected " +
           excerpt(expected, offset) + ", got " + excerpt(actual, offset);
}

} // namespace QuorvexTest
