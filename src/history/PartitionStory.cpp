#include "history/PartitionStory.h"

#include "history/ColumnValue.h"
#include "history/DisplayText.h"
#include "history/FittedTable.h"

#include <SQLiteCpp/Statement.h>

#include <algorithm>
#include <iterator>

namespace history {

namespace {

using Json = nlohmann::ordered_json;

// The keys of a run of the story, in the query's order.
constexpr char const* gc_StoryRunKeys[] = {
    "run",       "started",           "outcome",           "status_text",  "reason",
    "inventory", "inventory_problem", "failing_since_run", "runs_failing", "change"};
// The keys of a component event, in the query's order.
constexpr char const* gc_ComponentKeys[] = {"run",      "kind",      "component", "component_name",
                                            "property", "old_value", "new_value"};

// Each run of the console that listed the partition, with the partition
// event it brought (one at most).
SQLite::Statement storyRuns(SQLite::Database& database, PartitionSelection const& selection) {
    SQLite::Statement query(
        database,
        "SELECT p.run_id, r.started, p.outcome, p.status_text, p.reason, p.inventory,"
        " p.inventory_problem, p.failing_since_run, p.runs_failing,"
        " (SELECT group_concat(e.kind, ', ') FROM events e WHERE e.run_id = p.run_id"
        " AND e.scope = 'partition' AND e.machine = p.machine AND e.partition = p.partition)"
        " FROM partition_results p JOIN runs r ON r.id = p.run_id"
        " WHERE p.machine = ?1 AND p.partition = ?2 AND r.console = ?3 ORDER BY p.run_id");
    query.bind(1, selection.machine);
    query.bind(2, selection.partition);
    query.bind(3, *selection.console);
    return query;
}

SQLite::Statement componentEvents(SQLite::Database& database, PartitionSelection const& selection) {
    SQLite::Statement query(
        database, "SELECT e.run_id, e.kind, e.component, e.component_name, e.property, e.old_value,"
                  " e.new_value FROM events e JOIN runs r ON r.id = e.run_id"
                  " WHERE e.machine = ?1 AND e.partition = ?2 AND r.console = ?3"
                  " AND e.scope = 'component' ORDER BY e.run_id, e.component, e.property, e.id");
    query.bind(1, selection.machine);
    query.bind(2, selection.partition);
    query.bind(3, *selection.console);
    return query;
}

template <std::size_t Count> Json rows(SQLite::Statement& query, char const* const (&keys)[Count]) {
    Json rows = Json::array();
    while (query.executeStep()) {
        Json row = Json::object();
        for (std::size_t i = 0; i < Count; ++i) {
            row[keys[i]] = jsonValue(query.getColumn(static_cast<int>(i)));
        }
        rows.push_back(std::move(row));
    }
    return rows;
}

std::string text(Json const& value) {
    if (value.is_null()) {
        return "";
    }
    return value.is_string() ? value.get<std::string>() : value.dump();
}

std::string spaced(std::string words) {
    std::replace(words.begin(), words.end(), '_', ' ');
    return words;
}

std::string runsText(Json const& runs, std::size_t width) {
    FittedTable table({{"Run", true},
                       {"Started"},
                       {"Outcome"},
                       {"Change"},
                       {"Inventory"},
                       {"Reason", false, true}});
    for (Json const& run : runs) {
        std::string const reason =
            run["reason"].is_null() ? text(run["inventory_problem"]) : text(run["reason"]);
        table.addRow({text(run["run"]), shownTime(text(run["started"])), text(run["outcome"]),
                      spaced(text(run["change"])), text(run["inventory"]), reason});
    }
    return table.text(width, "  ");
}

// What changed in a component, as "history changes" says it.
std::string detailText(Json const& event) {
    std::string const change = text(event["old_value"]) + " \u2192 " + text(event["new_value"]);
    if (event["kind"] == "replaced") {
        return "serial " + change;
    }
    return event["kind"] == "property_changed" ? text(event["property"]) + ": " + change : "";
}

std::string componentsText(Json const& events, std::size_t width) {
    FittedTable table({{"Run", true},
                       {"Change"},
                       {"Component", false, true},
                       {"Name", false, true},
                       {"Detail", false, true}});
    for (Json const& event : events) {
        table.addRow({text(event["run"]), spaced(text(event["kind"])), text(event["component"]),
                      text(event["component_name"]), detailText(event)});
    }
    return table.text(width, "  ");
}

std::string fitted(std::string const& line, std::size_t width) {
    return (width == 0 ? line : cutToWidth(line, width)) + "\n";
}

} // namespace

std::vector<std::string> consolesListing(SQLite::Database& database,
                                         PartitionSelection const& selection) {
    SQLite::Statement query(database, "SELECT DISTINCT r.console FROM partition_results p"
                                      " JOIN runs r ON r.id = p.run_id"
                                      " WHERE p.machine = ?1 AND p.partition = ?2 ORDER BY 1");
    query.bind(1, selection.machine);
    query.bind(2, selection.partition);
    std::vector<std::string> consoles;
    while (query.executeStep()) {
        consoles.push_back(query.getColumn(0).getString());
    }
    return consoles;
}

Json partitionStoryJson(SQLite::Database& database, PartitionSelection const& selection) {
    SQLite::Statement runs = storyRuns(database, selection);
    SQLite::Statement events = componentEvents(database, selection);
    return {{"console", *selection.console},
            {"machine", selection.machine},
            {"partition", selection.partition},
            {"runs", rows(runs, gc_StoryRunKeys)},
            {"component_events", rows(events, gc_ComponentKeys)}};
}

std::string partitionStoryText(SQLite::Database& database, PartitionSelection const& selection,
                               std::size_t width) {
    Json const story = partitionStoryJson(database, selection);
    std::size_t const runCount = story["runs"].size();
    std::string text =
        fitted(selection.partition + " on " + selection.machine + " (" + *selection.console +
                   "): listed by " + std::to_string(runCount) + (runCount == 1 ? " run" : " runs"),
               width);
    text += "\n" + fitted("Runs", width) + runsText(story["runs"], width);
    if (!story["component_events"].empty()) {
        text +=
            "\n" +
            fitted("Component changes (" + std::to_string(story["component_events"].size()) + ")",
                   width) +
            componentsText(story["component_events"], width);
    }
    return text;
}

} // namespace history
