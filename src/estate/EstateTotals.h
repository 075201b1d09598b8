#pragma once

#include "estate/ConsoleRun.h"

#include <nlohmann/json.hpp>

#include <map>
#include <optional>
#include <string>

namespace estate {

// The totals over an estate, counted console by console: consoles per
// record, machines (those whose listing failed among them), partitions and
// partitions per outcome.
class EstateTotals {
public:
    void add(ConsoleRun const& console, std::optional<nlohmann::ordered_json> const& summary);

    // The totals as estate.json and the page carry them: consoles, records
    // (consoles per record), machines, machines_listing_failed, partitions
    // and outcomes (partitions per outcome), every record and outcome
    // present, 0 when none counted.
    nlohmann::ordered_json document() const;

private:
    std::size_t _consoles = 0;
    std::map<std::string, long long> _records;
    std::map<std::string, long long> _outcomes;
    long long _machines = 0;
    long long _machinesListingFailed = 0;
    long long _partitions = 0;
};

} // namespace estate
