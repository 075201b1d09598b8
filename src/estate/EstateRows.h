#pragma once

#include "estate/ConsoleRun.h"

#include <nlohmann/json.hpp>

#include <map>
#include <optional>
#include <string>
#include <unordered_map>

namespace estate {

// The estate page's partitions as the page's script reads them: one JSON
// object of columns, each an array with one entry per row, and tables that
// rows point into (consoles, machines, texts, outcomes), so that 200,000
// rows stay a few bytes each and no text is written twice. docs/estate.md
// describes the members.
class EstateRows {
public:
    EstateRows();
    void add(ConsoleRun const& console, std::optional<nlohmann::ordered_json> const& summary);
    // The data as the page's <script type="application/json"> holds it:
    // every "<" written as \u003c, so that no text ends the element.
    std::string scriptText() const;

private:
    void _addMachine(nlohmann::ordered_json const& machine);
    void _addPartition(nlohmann::ordered_json const& partition);
    void _addListingFailure(nlohmann::ordered_json const& failure);
    void _append(std::string const& member, nlohmann::json const& value);
    long long _textIndex(std::string const& text);

    // Each member's array as JSON text so far, without its closing
    // bracket, by member name: 200,000 rows held as values of a JSON
    // document would take several times the memory of their text.
    std::map<std::string, std::string> _members;
    std::unordered_map<std::string, long long> _textIndices;
    std::size_t _consoleCount = 0;
    std::size_t _machineCount = 0;
};

} // namespace estate
