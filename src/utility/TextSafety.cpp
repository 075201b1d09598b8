#include "utility/TextSafety.h"

#include <cstddef>

namespace util {

namespace {

constexpr char gc_ReplacementCharacter[] = "\xEF\xBF\xBD";

// Length of the well-formed UTF-8 sequence starting at text[at], 0 when the
// bytes there do not form one (overlong forms, surrogates and code points
// past U+10FFFF included).
std::size_t sequenceLength(std::string const& text, std::size_t at) {
    auto const byte = [&](std::size_t offset) {
        return static_cast<unsigned char>(text[at + offset]);
    };
    auto const isContinuation = [&](std::size_t offset) {
        return at + offset < text.size() && (byte(offset) & 0xC0U) == 0x80U;
    };
    unsigned char const lead = byte(0);
    if (lead < 0x80U) {
        return 1;
    }
    if (lead >= 0xC2U && lead <= 0xDFU) {
        return isContinuation(1) ? 2 : 0;
    }
    if (lead >= 0xE0U && lead <= 0xEFU) {
        if (!isContinuation(1) || !isContinuation(2)) {
            return 0;
        }
        bool const overlong = lead == 0xE0U && byte(1) < 0xA0U;
        bool const surrogate = lead == 0xEDU && byte(1) >= 0xA0U;
        return overlong || surrogate ? 0 : 3;
    }
    if (lead >= 0xF0U && lead <= 0xF4U) {
        if (!isContinuation(1) || !isContinuation(2) || !isContinuation(3)) {
            return 0;
        }
        bool const overlong = lead == 0xF0U && byte(1) < 0x90U;
        bool const tooHigh = lead == 0xF4U && byte(1) >= 0x90U;
        return overlong || tooHigh ? 0 : 4;
    }
    return 0;
}

} // namespace

std::string_view htmlEntityOf(char c) {
    switch (c) {
    case '&':
        return "&amp;";
    case '<':
        return "&lt;";
    case '>':
        return "&gt;";
    case '"':
        return "&quot;";
    case '\'':
        return "&#39;";
    default:
        return {};
    }
}

std::string validUtf8(std::string const& bytes) {
    std::string text;
    text.reserve(bytes.size());
    std::size_t at = 0;
    while (at < bytes.size()) {
        std::size_t const length = sequenceLength(bytes, at);
        if (length == 0) {
            text += gc_ReplacementCharacter;
            ++at;
            continue;
        }
        text.append(bytes, at, length);
        at += length;
    }
    return text;
}

std::string escapeHtml(std::string const& text) {
    std::string const valid = validUtf8(text);
    std::string escaped;
    escaped.reserve(valid.size());
    for (char const c : valid) {
        std::string_view const entity = htmlEntityOf(c);
        if (entity.empty()) {
            escaped += c;
        } else {
            escaped += entity;
        }
    }
    return escaped;
}

} // namespace util
