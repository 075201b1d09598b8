#pragma once

#include <nlohmann/json.hpp>

#include <string>

namespace report {

// Summary values as the pages carry them.

// The text of a value, escaped for HTML; "" for null.
std::string htmlText(nlohmann::ordered_json const& value);

// A summary's time as people read it (readableTime()); the text as it is,
// escaped, when it is no time the page knows how to read.
std::string timeText(nlohmann::ordered_json const& value);

// The time in a <time> element that keeps the summary's text for programs.
std::string timeElement(nlohmann::ordered_json const& value);

} // namespace report
