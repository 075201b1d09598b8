#pragma once

#include <nlohmann/json.hpp>

#include <string>
#include <vector>

namespace report {

// The outcomes a partition can have, in the order the report shows them.
std::vector<std::string> const& outcomeNames();

// The counts object of a summary (partitions and one count per outcome) for
// a machine's partitions.
nlohmann::ordered_json countOutcomes(nlohmann::ordered_json const& partitions);

// The totals of a summary: the machines and the sum of their counts.
nlohmann::ordered_json totalCounts(nlohmann::ordered_json const& machines);

// The survey's overall code for counts: "0" all surveyed, "4" some, "8" none
// or none listed.
std::string overallCode(nlohmann::ordered_json const& counts);

} // namespace report
