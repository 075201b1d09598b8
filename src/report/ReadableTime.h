#pragma once

#include <optional>
#include <string>

namespace report {

// A summary's time ("2026-11-23T14:05:09+01:00", the run's local time with
// its offset from UTC) as people read it, in the same zone and named by its
// offset: "Mon 23 Nov 2026 14:05:09 UTC+01:00", or "... UTC" for the offset
// +00:00 (or Z). The page shows the run's zone, not the reader's, so that
// its times match those of the trace and the console's logs, with or
// without script. Nothing for a text that is not such a time.
std::optional<std::string> readableTime(std::string const& isoTime);

} // namespace report
