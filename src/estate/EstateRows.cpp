#include "estate/EstateRows.h"

#include "estate/Estate.h"
#include "report/JsonMember.h"
#include "report/ListingFailure.h"
#include "report/Outcome.h"

#include <nlohmann/json.hpp>

#include <algorithm>
#include <iterator>
#include <unordered_map>

namespace estate {

using Json = nlohmann::json;
using report::member;

namespace {

// A machine whose partitions the console could not list is one row of its
// own, with the outcome after the partitions' outcomes in the table.
std::size_t const gc_ListingFailedOutcome = report::gc_OutcomeCount;

std::string textOf(nlohmann::ordered_json const& value) {
    if (value.is_null()) {
        return "";
    }
    return value.is_string() ? value.get<std::string>() : value.dump();
}

Json outcomeTable() {
    Json outcomes = Json::array();
    std::transform(
        report::outcomeTable().begin(), report::outcomeTable().end(), std::back_inserter(outcomes),
        [](report::OutcomeText const& row) {
            return Json{row.name, row.label, row.pageClass, report::isFailure(row.outcome) ? 1 : 0};
        });
    outcomes.push_back(
        {report::gc_ListingFailedName, report::gc_ListingFailedLabel, "listing-failed", 1});
    return outcomes;
}

} // namespace

EstateRows::EstateRows() {
    for (char const* member : {"consoles", "machines", "texts", "machine", "id", "host", "ip",
                               "outcome", "status", "reason", "seconds"}) {
        _members[member];
    }
    for (Json const& outcome : outcomeTable()) {
        _append("outcomes", outcome);
    }
}

void EstateRows::_append(std::string const& member, Json const& value) {
    std::string& text = _members[member];
    text += text.empty() ? "[" : ",";
    std::string const valueText = value.dump(-1, ' ', false, Json::error_handler_t::replace);
    for (char const character : valueText) {
        if (character == '<') {
            text += "\\u003c";
        } else {
            text += character;
        }
    }
}

long long EstateRows::_textIndex(std::string const& text) {
    auto const [place, added] =
        _textIndices.try_emplace(text, static_cast<long long>(_textIndices.size()));
    if (added) {
        _append("texts", text);
    }
    return place->second;
}

void EstateRows::add(ConsoleRun const& console,
                     std::optional<nlohmann::ordered_json> const& summary) {
    std::optional<std::string> const report = consoleReportPath(console);
    _append("consoles",
            {{"name", console.record.console}, {"report", report ? Json(*report) : Json()}});
    ++_consoleCount;
    for (nlohmann::ordered_json const& machine :
         summary ? member(*summary, "machines") : nlohmann::ordered_json()) {
        _addMachine(machine);
    }
}

void EstateRows::_addMachine(nlohmann::ordered_json const& machine) {
    _append("machines", {_consoleCount - 1, textOf(member(machine, "identity")),
                         textOf(member(machine, "return_code"))});
    ++_machineCount;
    if (!member(machine, "listing_failure").is_null()) {
        _addListingFailure(member(machine, "listing_failure"));
    }
    for (nlohmann::ordered_json const& partition : member(machine, "partitions")) {
        _addPartition(partition);
    }
}

void EstateRows::_addPartition(nlohmann::ordered_json const& partition) {
    std::optional<report::Outcome> const outcome =
        report::outcomeNamed(textOf(member(partition, "outcome")));
    nlohmann::ordered_json const& reason = member(partition, "reason");
    nlohmann::ordered_json const& seconds = member(partition, "seconds");
    _append("machine", _machineCount - 1);
    _append("id", textOf(member(partition, "id")));
    _append("host", textOf(member(partition, "host")));
    _append("ip", textOf(member(partition, "ip")));
    _append("outcome", outcome ? static_cast<std::size_t>(*outcome) : gc_ListingFailedOutcome);
    _append("status", _textIndex(textOf(member(partition, "status_text"))));
    _append("reason", reason.is_null() ? -1 : _textIndex(textOf(reason)));
    _append("seconds", seconds.is_number() ? Json(seconds.get<double>()) : Json());
}

void EstateRows::_addListingFailure(nlohmann::ordered_json const& failure) {
    _append("machine", _machineCount - 1);
    for (char const* column : {"id", "host", "ip"}) {
        _append(column, "");
    }
    _append("outcome", gc_ListingFailedOutcome);
    _append("status", _textIndex(report::gc_ListingFailedLabel));
    _append("reason", _textIndex(report::listingFailureText(failure)));
    _append("seconds", nullptr);
}

// The members in name order, as the page's data has always listed them.
std::string EstateRows::scriptText() const {
    std::string text = "{";
    for (auto const& [name, values] : _members) {
        text += (text.size() > 1 ? ",\"" : "\"") + name + "\":";
        text += values.empty() ? "[" : values;
        text += "]";
    }
    return text + "}";
}

} // namespace estate
