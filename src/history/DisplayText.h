#pragma once

#include <cstddef>
#include <optional>
#include <string>

namespace history {

// Texts of the history command as a terminal shows them: one column per
// UTF-8 character (the names and reasons it shows are not wide characters).

// The columns text takes.
std::size_t displayWidth(std::string const& text);

// text when it fits in width columns, else its first width - 1 characters
// and "…", so that a cut value says it was cut.
std::string cutToWidth(std::string const& text, std::size_t width);

// text on one line: every control character (a reason's line end, a tab)
// becomes a space, so that a value never breaks a table's row.
std::string oneLine(std::string text);

} // namespace history

namespace history {

// A recorded time ("2026-11-20T02:00:03+01:00") as the tables show it, to
// the minute in the run's own zone without the offset: "2026-11-20 02:00".
std::string shownTime(std::string const& isoTime);

// A run's length: "42s", "3m 05s", "2h 01m"; "?" when unknown.
std::string durationText(std::optional<long long> seconds);

} // namespace history
