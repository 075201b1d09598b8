#pragma once

#include <optional>
#include <string>

namespace history {

// The moment a date of --since or --before names, in seconds since the
// epoch: "2026-11-01" is that day's midnight in local time;
// "2026-11-01T14:05", "2026-11-01T14:05:09" (or with a space for the T) the
// local time; with "Z", "+01:00" or "+0100" after it the time at that
// offset. nullopt for any other text, or a day or time that does not exist.
std::optional<long long> momentOfDate(std::string const& text);

} // namespace history
