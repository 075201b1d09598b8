#pragma once

#include <nlohmann/json.hpp>

#include <string>

namespace report {

// The marks pages give outcomes: totals, stacked bars and keys, each coloured
// by the outcome's class and always with the outcome's name beside it. The
// run's report and the estate's page share them.

// A count of a summary's counts object; 0 when it is missing or no whole number.
long long countOf(nlohmann::ordered_json const& counts, char const* name);

// One <li> per outcome with its count; the page's script finds them by
// data-outcome, and their class gives them the outcome's colour.
void appendOutcomeTotals(std::string& page, nlohmann::ordered_json const& totals);

// A stacked bar of counts' outcomes, and the counts below it: one item per
// outcome present, kept whole on its line ("1 channel failure").
std::string outcomeBar(nlohmann::ordered_json const& counts);

// The outcomes' keys, and the mark of a machine whose listing failed.
void appendOutcomeKeys(std::string& page);

} // namespace report
