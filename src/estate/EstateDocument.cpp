#include "estate/EstateDocument.h"

#include "estate/Estate.h"

#include <utility>

namespace estate {

using Json = nlohmann::ordered_json;

namespace {

template <typename Value> Json orNull(std::optional<Value> const& value) {
    return value ? Json(*value) : Json();
}

Json textOrNull(std::string const& text) {
    return text.empty() ? Json() : Json(text);
}

// The console's "since_last_run": null when its run is not recorded.
Json changesDocument(std::optional<ConsoleChanges> const& changes) {
    if (!changes) {
        return Json();
    }
    return Json{{"run_id", orNull(changes->runId)},
                {"previous_run_id", orNull(changes->previousRunId)},
                {"new_failures", changes->newFailures},
                {"recoveries", changes->recoveries},
                {"inventory_changes", changes->inventoryChanges},
                {"error", orNull(changes->unavailable)}};
}

std::string jsonText(Json const& value) {
    return value.dump(-1, ' ', false, Json::error_handler_t::replace);
}

} // namespace

void EstateDocument::add(ConsoleRun const& console, std::optional<Json> const& summary) {
    ConsoleRecord const& record = console.record;
    Json const entry{{"console", record.console},
                     {"record", textOf(record.kind).name},
                     {"message", textOrNull(record.message)},
                     {"exit_status", orNull(record.exitStatus)},
                     {"age_seconds", orNull(record.ageSeconds)},
                     {"console_host", textOrNull(console.consoleHost)},
                     {"mode", textOrNull(console.mode)},
                     {"run_started", orNull(console.runStarted)},
                     {"report", orNull(consoleReportPath(console))},
                     {"since_last_run", changesDocument(console.changes)}};
    std::string entryText = jsonText(entry);
    entryText.pop_back();
    _consoles += (_consoles.empty() ? "" : ",") + entryText +
                 ",\"summary\":" + (summary ? jsonText(*summary) : std::string("null")) + "}";
}

std::string EstateDocument::text(std::string const& collected, Json const& totals) && {
    Json const head{{"schema_version", gc_EstateSchemaVersion},
                    {"tool", "quorvex-survey estate"},
                    {"version", QUORVEX_VERSION},
                    {"collected", collected},
                    {"totals", totals}};
    std::string start = jsonText(head);
    start.pop_back();
    _consoles.insert(0, start + ",\"consoles\":[");
    _consoles += "]}\n";
    return std::move(_consoles);
}

} // namespace estate
