#pragma once

#include "estate/ConsoleRun.h"
#include "report/SinceLastRun.h"

#include <nlohmann/json.hpp>

#include <optional>
#include <string>
#include <vector>

namespace estate {

// The estate's runs in the history database (--history, docs/history.md),
// so that what changed since a console's last run works across the estate.
// Each collected or stale console's run is recorded as the console's own run
// records itself: one transaction, its VPD documents read from the bundle.
// The console is known by its inventory name, as everywhere in the estate:
// unlike the host name a console reports of itself, the inventory never
// names two consoles alike. A run already recorded (the same console and
// start: a stale console collected again, an estate merged twice) is not
// recorded a second time.
class EstateHistory {
public:
    // file: the history database; empty for none (--no-history).
    explicit EstateHistory(std::string file);

    // Records the console's run unless it is recorded already, and returns
    // what changed since the console's previous run, or why that cannot be
    // told. nullopt without a history, or for a console whose record is
    // neither collected nor stale (its run, if any, did not end as a run
    // does). The summary's history member says, while the run is recorded,
    // where the history keeps it, and is put back as it was after, rather
    // than the estate copying a summary of thousands of partitions for one
    // member.
    std::optional<report::SinceLastRun> record(ConsoleRun const& console,
                                               nlohmann::ordered_json& summary);

    // One line per console whose run could not be recorded: "cannot record
    // console NAME's run in FILE: reason".
    std::vector<std::string> const& failures() const;

private:
    long long _recordOnce(ConsoleRun const& console, nlohmann::ordered_json& summary) const;

    std::string _file;
    std::vector<std::string> _failures;
};

} // namespace estate
