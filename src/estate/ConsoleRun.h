#pragma once

#include "estate/ConsoleChanges.h"
#include "estate/ConsoleRecord.h"

#include <nlohmann/json.hpp>

#include <optional>
#include <string>

namespace estate {

// One console of the estate: its record and, when its bundle could be read,
// what the bundle holds (docs/estate.md).
struct ConsoleRun {
    ConsoleRecord record;
    // From bundle.json: the console's own host name, how the run was had
    // ("run" or "collect") and when it started; empty or nullopt without one.
    std::string consoleHost;
    std::string mode;
    std::optional<std::string> runStarted;
    // The bundle's summary.json, a JSON object by its syntax; empty when the
    // console has no summary that reads.
    std::string summaryFile;
    // The bundle's folder of status files and VPD documents; empty without
    // a bundle.
    std::string vpdFolder;
    // What the history says of the run, set while the estate is written;
    // nullopt when the run is not recorded (--no-history, or a console
    // neither collected nor stale).
    std::optional<ConsoleChanges> changes;

    bool hasSummary() const { return !summaryFile.empty(); }
};

// The console's run as its record and bundle tell it. A bundle that cannot
// be read (missing, not a folder, a bundle.json or summary.json that is not
// what it should be, a path outside the collect folder) turns the record into
// tool_error with the message "bundle unreadable: <reason>"; a collected
// console without a bundle likewise. Never throws for the bundle's content.
ConsoleRun readConsoleRun(std::string const& collectFolder, ConsoleRecord const& record);

// The console's summary document, read when it is needed, so that only one
// console's summary is held at a time; nothing for a console without one, or
// one whose file no longer reads.
std::optional<nlohmann::ordered_json> readSummary(ConsoleRun const& console);

} // namespace estate
