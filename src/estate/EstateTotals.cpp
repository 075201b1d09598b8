#include "estate/EstateTotals.h"

#include "report/JsonMember.h"
#include "report/Outcome.h"

namespace estate {

using Json = nlohmann::ordered_json;
using report::member;

void EstateTotals::add(ConsoleRun const& console, std::optional<Json> const& summary) {
    ++_consoles;
    ++_records[textOf(console.record.kind).name];
    for (Json const& machine : summary ? member(*summary, "machines") : Json()) {
        ++_machines;
        _machinesListingFailed += member(machine, "listing_failure").is_null() ? 0 : 1;
        for (Json const& partition : member(machine, "partitions")) {
            ++_partitions;
            Json const& outcome = member(partition, "outcome");
            ++_outcomes[outcome.is_string() ? outcome.get<std::string>() : ""];
        }
    }
}

Json EstateTotals::document() const {
    Json records = Json::object();
    for (RecordText const& row : recordTable()) {
        auto const count = _records.find(row.name);
        records[row.name] = count == _records.end() ? 0 : count->second;
    }
    Json outcomes = Json::object();
    for (report::OutcomeText const& row : report::outcomeTable()) {
        auto const count = _outcomes.find(row.name);
        outcomes[row.name] = count == _outcomes.end() ? 0 : count->second;
    }
    return Json{{"consoles", _consoles},     {"records", std::move(records)},
                {"machines", _machines},     {"machines_listing_failed", _machinesListingFailed},
                {"partitions", _partitions}, {"outcomes", std::move(outcomes)}};
}

} // namespace estate
