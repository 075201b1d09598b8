#include "report/PageText.h"

#include "report/ReadableTime.h"
#include "utility/TextSafety.h"

#include <optional>

namespace report {

using util::escapeHtml;

using Json = nlohmann::ordered_json;

// Numbers and other values are written as JSON writes them.
std::string htmlText(Json const& value) {
    if (value.is_null()) {
        return "";
    }
    if (value.is_string()) {
        return escapeHtml(value.get<std::string>());
    }
    return escapeHtml(value.dump());
}

std::string timeText(Json const& value) {
    std::optional<std::string> const readable =
        value.is_string() ? readableTime(value.get<std::string>()) : std::nullopt;
    return readable ? *readable : htmlText(value);
}

// The time in an element that keeps the summary's text for programs.
std::string timeElement(Json const& value) {
    if (!value.is_string()) {
        return htmlText(value);
    }
    return "<time datetime=\"" + htmlText(value) + "\">" + timeText(value) + "</time>";
}

} // namespace report
