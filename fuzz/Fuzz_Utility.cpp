#include "Fuzz_Utility.h"

#include <cstdio>
#include <cstdlib>
#include <limits>

namespace Fuzz_Utility {

namespace {

constexpr char gc_ConsolePrefix[] = "ZOR";
constexpr char gc_NameDelimiter = '_';
// How much of the offending text a failure shows.
constexpr std::string::size_type gc_ShownLength = 200;

bool _u_is_Space(char c) {
    return c == ' ' || c == '\t' || c == '\n' || c == '\v' || c == '\f' || c == '\r';
}

std::string _u_before_Nul(std::string const& text) {
    return text.substr(0, text.find('\0'));
}

} // namespace

void u_fail(char const* what, std::string const& detail) {
    std::fprintf(stderr, "\nbroken invariant: %s\n", what);
    if (!detail.empty()) {
        std::fprintf(stderr, "  at (%zu bytes): ", detail.size());
        for (char const c : detail.substr(0, gc_ShownLength)) {
            auto const byte = static_cast<unsigned char>(c);
            if (byte >= 0x20 && byte < 0x7F) {
                std::fputc(byte, stderr);
            } else {
                std::fprintf(stderr, "\\x%02X", byte);
            }
        }
        std::fputc('\n', stderr);
    }
    std::abort();
}

void u_require(bool condition, char const* what, std::string const& detail) {
    if (!condition) {
        u_fail(what, detail);
    }
}

std::vector<std::string> u_expected_Lines(std::string const& contents) {
    std::vector<std::string> lines;
    std::string::size_type start = 0;
    for (;;) {
        std::string::size_type const end = contents.find('\n', start);
        std::string::size_type const length =
            (end == std::string::npos ? contents.size() : end) - start;
        if (length > gc_MaximumLineLength) {
            lines.push_back(_u_before_Nul(contents.substr(start, gc_MaximumLineLength)));
            return lines;
        }
        lines.push_back(_u_before_Nul(contents.substr(start, length)));
        if (end == std::string::npos) {
            return lines;
        }
        start = end + 1;
    }
}

std::vector<std::string> u_expected_Pieces(std::string const& text, std::string const& delimiter) {
    std::vector<std::string> pieces;
    std::string::size_type start = 0;
    while (start < text.size()) {
        std::string::size_type const found = text.find(delimiter, start);
        if (found == std::string::npos) {
            pieces.push_back(text.substr(start));
            break;
        }
        pieces.push_back(text.substr(start, found - start));
        start = found + delimiter.size();
    }
    return pieces;
}

void u_expected_TM_SE(std::string const& name, std::string& typeModel, std::string& serial) {
    std::string::size_type const last = name.rfind(gc_NameDelimiter);
    if (last == std::string::npos) {
        typeModel = name;
        serial = name;
        return;
    }
    typeModel = name.substr(0, last);
    serial = name.substr(last + 1);
}

std::string u_without_ConsolePrefix(std::string const& text, std::string::size_type length) {
    if (text.compare(0, sizeof gc_ConsolePrefix - 1, gc_ConsolePrefix) != 0) {
        return text;
    }
    return length >= text.size() ? std::string() : text.substr(length);
}

unsigned long long u_expected_Unsigned(std::string const& text, bool& overflow, bool& hasDigits) {
    constexpr unsigned long long largest = std::numeric_limits<unsigned long long>::max();
    std::string::size_type i = 0;
    while (i < text.size() && _u_is_Space(text[i])) {
        ++i;
    }
    bool const negative = i < text.size() && text[i] == '-';
    if (i < text.size() && (text[i] == '-' || text[i] == '+')) {
        ++i;
    }
    overflow = false;
    hasDigits = false;
    unsigned long long value = 0;
    for (; i < text.size() && text[i] >= '0' && text[i] <= '9'; ++i) {
        hasDigits = true;
        auto const digit = static_cast<unsigned long long>(text[i] - '0');
        if (value > (largest - digit) / 10) {
            overflow = true;
        }
        value = overflow ? largest : value * 10 + digit;
    }
    if (overflow) {
        return largest;
    }
    return negative ? 0 - value : value;
}

} // namespace Fuzz_Utility
