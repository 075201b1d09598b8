#pragma once

#include "estate/ConsoleRun.h"

#include <nlohmann/json.hpp>

#include <optional>
#include <string>

namespace estate {

// The version of estate.json's layout, docs/estate.schema.json.
inline constexpr int gc_EstateSchemaVersion = 1;

// estate.json, written console by console: when the collection ran, the
// totals over the estate, and each console in the estate's order with its
// record and its run's whole summary (docs/summary.schema.json), null when
// it has none. Compact, one line: at 200,000 partitions indentation would
// double its size, and its readers are programs.
class EstateDocument {
public:
    void add(ConsoleRun const& console, std::optional<nlohmann::ordered_json> const& summary);

    // The whole document, ending with a line end, made of the consoles'
    // text in place: at 200,000 partitions a copy would be 50 MB more.
    std::string text(std::string const& collected, nlohmann::ordered_json const& totals) &&;

private:
    std::string _consoles;
};

} // namespace estate
