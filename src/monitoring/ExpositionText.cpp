#include "monitoring/ExpositionText.h"

#include "utility/TextSafety.h"

namespace monitoring {

namespace {

std::string escaped(std::string const& text, bool inQuotes) {
    std::string result;
    for (char const c : util::validUtf8(text)) {
        if (c == '\\') {
            result += "\\\\";
        } else if (c == '\n') {
            result += "\\n";
        } else if (c == '"' && inQuotes) {
            result += "\\\"";
        } else {
            result += c;
        }
    }
    return result;
}

} // namespace

std::string labelValue(std::string const& text) {
    return escaped(text, true);
}

std::string helpText(std::string const& text) {
    return escaped(text, false);
}

} // namespace monitoring
