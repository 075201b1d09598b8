#include "estate/EstateRows.h"

#include "estate/Estate.h"
#include "report/JsonMember.h"
#include "report/ListingFailure.h"
#include "report/Outcome.h"

#include <nlohmann/json.hpp>

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
    for (report::OutcomeText const& row : report::outcomeTable()) {
        outcomes.push_back(
            {row.name, row.label, row.pageClass, report::isFailure(row.outcome) ? 1 : 0});
    }
    outcomes.push_back(
        {report::gc_ListingFailedName, report::gc_ListingFailedLabel, "listing-failed", 1});
    return outcomes;
}

} // namespace


EstateRows::EstateRows() {
    _data = Json{{"outcomes", outcomeTable()}, {"consoles", Json::array()}, {"machines", Json::array()},
                 {"texts", Json::array()}};
    for (char const* column : {"machine", "id", "host", "ip", "outcome", "status", "reason", "seconds"}) {
        _data[column] = Json::array();
    }
}

long long EstateRows::_textIndex(std::string const& text) {
    auto const [place, added] = _textIndices.try_emplace(text, static_cast<long long>(_textIndices.size()));
    if (added) {
        _data["texts"].push_back(text);
    }
    return place->second;
}

void EstateRows::add(ConsoleRun const& console, std::optional<nlohmann::ordered_json> const& summary) {
    std::optional<std::string> const report = consoleReportPath(console);
    _data["consoles"].push_back({{"name", console.record.console}, {"report", report ? Json(*report) : Json()}});
    _console = _data["consoles"].size() - 1;
    for (nlohmann::ordered_json const& machine :
         summary ? member(*summary, "machines") : nlohmann::ordered_json()) {
        _addMachine(machine);
    }
}

void EstateRows::_addMachine(nlohmann::ordered_json const& machine) {
    _data["machines"].push_back({_console, textOf(member(machine, "identity")), textOf(member(machine, "return_code"))});
    _machine = _data["machines"].size() - 1;
    if (!member(machine, "listing_failure").is_null()) {
        _addListingFailure(member(machine, "listing_failure"));
    }
    for (nlohmann::ordered_json const& partition : member(machine, "partitions")) {
        _addPartition(partition);
    }
}

void EstateRows::_addPartition(nlohmann::ordered_json const& partition) {
    std::optional<report::Outcome> const outcome = report::outcomeNamed(textOf(member(partition, "outcome")));
    nlohmann::ordered_json const& reason = member(partition, "reason");
    nlohmann::ordered_json const& seconds = member(partition, "seconds");
    _data["machine"].push_back(_machine);
    _data["id"].push_back(textOf(member(partition, "id")));
    _data["host"].push_back(textOf(member(partition, "host")));
    _data["ip"].push_back(textOf(member(partition, "ip")));
    _data["outcome"].push_back(outcome ? static_cast<std::size_t>(*outcome) : gc_ListingFailedOutcome);
    _data["status"].push_back(_textIndex(textOf(member(partition, "status_text"))));
    _data["reason"].push_back(reason.is_null() ? -1 : _textIndex(textOf(reason)));
    _data["seconds"].push_back(seconds.is_number() ? Json(seconds.get<double>()) : Json());
}

void EstateRows::_addListingFailure(nlohmann::ordered_json const& failure) {
    _data["machine"].push_back(_machine);
    for (char const* column : {"id", "host", "ip"}) {
        _data[column].push_back("");
    }
    _data["outcome"].push_back(gc_ListingFailedOutcome);
    _data["status"].push_back(_textIndex(report::gc_ListingFailedLabel));
    _data["reason"].push_back(_textIndex(report::listingFailureText(failure)));
    _data["seconds"].push_back(nullptr);
}

std::string EstateRows::scriptText() const {
    std::string text = _data.dump(-1, ' ', false, Json::error_handler_t::replace);
    for (std::size_t at = text.find('<'); at != std::string::npos; at = text.find('<', at)) {
        text.replace(at, 1, "\\u003c");
    }
    return text;
}

} // namespace estate
