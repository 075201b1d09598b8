#pragma once

#include <optional>
#include <string>

namespace util {

// The local time of a moment in ISO 8601 with its offset
// ("2026-11-23T14:05:09+01:00"); empty when it cannot be formed.
std::string localTimeText(long long secondsSinceEpoch);

// The moment a text of that form names, in seconds since the epoch, whatever
// its offset; nullopt for any other text.
std::optional<long long> secondsOfTimeText(std::string const& text);

} // namespace util
