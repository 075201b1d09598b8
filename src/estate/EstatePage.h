#pragma once

#include "estate/Estate.h"

#include <nlohmann/json.hpp>

#include <optional>
#include <string>

namespace estate {

// index.html of an estate: one self-contained page (style, script and data
// inline, nothing fetched). Without script it reads as the totals, the
// consoles that could not be collected with their reasons (first), every
// console with its record and outcome bar, and links to each console's own
// report; the script adds the list of every partition, drawn only as far as
// it is in view, with sorting and filters. Every console text is escaped.
// Written console by console, as each console's summary is read.
class EstatePage {
public:
    void add(ConsoleRun const& console, std::optional<nlohmann::ordered_json> const& summary);

    // The page, with the totals over the estate and the partitions' data
    // (EstateRows::scriptText()).
    std::string text(Estate const& estate, nlohmann::ordered_json const& totals,
                     std::string const& rowData) const;

private:
    std::string _consoleRows;
};

} // namespace estate
