#include "history/ChangeList.h"

#include "history/ColumnValue.h"
#include "history/DisplayText.h"
#include "history/FittedTable.h"

#include <SQLiteCpp/Statement.h>
#include <cstdint>

#include <algorithm>
#include <array>
#include <iterator>
#include <map>
#include <tuple>
#include <vector>

namespace history {

namespace {

using Json = nlohmann::ordered_json;

constexpr int gc_EventColumnCount = static_cast<int>(std::size(gc_EventKeys));

// The columns of an event, in gc_EventKeys' order.
enum EventColumn : std::size_t {
    Run,
    Console,
    Scope,
    Kind,
    Machine,
    Partition,
    Component,
    ComponentName,
    Property,
    OldValue,
    NewValue,
    Outcome,
    Reason,
    FailingSinceRun,
    RunsFailing
};

// One event as read, its values in gc_EventKeys' order.
using Event = std::array<Json, std::size(gc_EventKeys)>;

// A group of events: its key in the JSON form, its title, and which
// events it takes (scope "" for any scope, kind "" for any kind).
struct EventGroup {
    char const* key;
    char const* title;
    char const* scope;
    char const* kind;
    char const* otherKind;
};

constexpr std::array<EventGroup, 8> gc_Groups{{
    {"new_failures", "New failures", "partition", "newly_failing", ""},
    {"still_failing", "Still failing", "partition", "still_failing", ""},
    {"recoveries", "Recoveries", "partition", "recovered", ""},
    {"newly_inactive", "Newly inactive", "partition", "newly_inactive", ""},
    {"appeared", "Appeared", "", "appeared", ""},
    {"disappeared", "Disappeared", "", "disappeared", ""},
    {"machine_listing", "Machine listing", "machine", "listing_failed", "listing_recovered"},
    {"inventory", "Inventory changes", "component", "", ""},
}};

bool belongs(EventGroup const& group, Event const& event) {
    auto const& scope = event[Scope].get_ref<std::string const&>();
    auto const& kind = event[Kind].get_ref<std::string const&>();
    bool const scopeFits = *group.scope == '\0' || scope == group.scope;
    bool const kindFits = *group.kind == '\0' || kind == group.kind || kind == group.otherKind;
    return scopeFits && kindFits;
}

std::string text(Event const& event, EventColumn column) {
    Json const& value = event[column];
    if (value.is_null()) {
        return "";
    }
    return value.is_string() ? value.get<std::string>() : value.dump();
}

// The runs whose events are shown, oldest first.
std::vector<long long> selectedRuns(SQLite::Database& database, ChangeSelection const& selection) {
    if (!selection.sinceUnix) {
        return {*selection.run};
    }
    SQLite::Statement query(database, "SELECT id FROM runs WHERE started_unix >= ?1"
                                      " AND (?2 IS NULL OR console = ?2) ORDER BY id");
    query.bind(1, static_cast<std::int64_t>(*selection.sinceUnix));
    if (selection.console) {
        query.bind(2, *selection.console);
    }
    std::vector<long long> runs;
    while (query.executeStep()) {
        runs.push_back(query.getColumn(0).getInt64());
    }
    return runs;
}

std::vector<Event> readEvents(SQLite::Database& database, std::vector<long long> const& runs) {
    SQLite::Statement query(database,
                            "SELECT e.run_id, r.console, e.scope, e.kind, e.machine, e.partition,"
                            " e.component, e.component_name, e.property, e.old_value, e.new_value,"
                            " e.outcome, e.reason, e.failing_since_run, e.runs_failing"
                            " FROM events e JOIN runs r ON r.id = e.run_id WHERE e.run_id = ?1"
                            " ORDER BY e.machine, e.partition, e.component, e.property, e.id");
    std::vector<Event> events;
    for (long long const run : runs) {
        query.reset();
        query.bind(1, static_cast<std::int64_t>(run));
        while (query.executeStep()) {
            Event event;
            for (int i = 0; i < gc_EventColumnCount; ++i) {
                event[static_cast<std::size_t>(i)] = jsonValue(query.getColumn(i));
            }
            events.push_back(std::move(event));
        }
    }
    return events;
}

// Over several runs, a partition still failing in each is shown once, as
// the latest of them says it.
std::vector<Event> latestStillFailing(std::vector<Event> const& events) {
    std::map<std::tuple<std::string, std::string, std::string>, Event> latest;
    for (Event const& event : events) {
        latest[{text(event, Console), text(event, Machine), text(event, Partition)}] = event;
    }
    std::vector<Event> kept;
    std::transform(latest.begin(), latest.end(), std::back_inserter(kept),
                   [](auto const& entry) { return entry.second; });
    std::stable_sort(kept.begin(), kept.end(), [](Event const& a, Event const& b) {
        return a[Run].get<long long>() < b[Run].get<long long>();
    });
    return kept;
}

std::vector<Event> groupEvents(EventGroup const& group, std::vector<Event> const& events,
                               bool severalRuns) {
    std::vector<Event> members;
    std::copy_if(events.begin(), events.end(), std::back_inserter(members),
                 [&group](Event const& event) { return belongs(group, event); });
    if (severalRuns && std::string(group.key) == "still_failing") {
        return latestStillFailing(members);
    }
    return members;
}

// One column of a group's table: its heading and how an event fills it.
struct EventCell {
    TableColumn column;
    std::string (*value)(Event const& event);
};

std::string runCell(Event const& event) {
    return text(event, Run);
}
std::string machineCell(Event const& event) {
    return text(event, Machine);
}
// A whole machine appears and disappears too.
std::string partitionCell(Event const& event) {
    return text(event, Scope) == "machine" ? "(whole machine)" : text(event, Partition);
}
std::string outcomeCell(Event const& event) {
    return text(event, Outcome);
}
std::string reasonCell(Event const& event) {
    return text(event, Reason);
}
std::string sinceCell(Event const& event) {
    return text(event, FailingSinceRun);
}
std::string runsFailingCell(Event const& event) {
    return text(event, RunsFailing);
}
std::string kindCell(Event const& event) {
    std::string kind = text(event, Kind);
    std::replace(kind.begin(), kind.end(), '_', ' ');
    return kind;
}
std::string componentCell(Event const& event) {
    return text(event, Component);
}
std::string nameCell(Event const& event) {
    return text(event, ComponentName);
}
// What changed in a component: "serial OLD → NEW" for a replacement,
// "KEYWORD: OLD → NEW" for a property.
std::string detailCell(Event const& event) {
    std::string const change = text(event, OldValue) + " \u2192 " + text(event, NewValue);
    if (text(event, Kind) == "replaced") {
        return "serial " + change;
    }
    return text(event, Kind) == "property_changed" ? text(event, Property) + ": " + change : "";
}

std::vector<EventCell> groupCells(std::string const& key) {
    EventCell const machine{{"Machine", false, true}, machineCell};
    EventCell const partition{{"Partition", false, true}, partitionCell};
    EventCell const outcome{{"Outcome"}, outcomeCell};
    EventCell const reason{{"Reason", false, true}, reasonCell};
    if (key == "new_failures") {
        return {machine, partition, outcome, reason};
    }
    if (key == "still_failing") {
        return {machine,
                partition,
                outcome,
                {{"Since run", true}, sinceCell},
                {{"Runs", true}, runsFailingCell},
                reason};
    }
    if (key == "recoveries") {
        return {machine, partition, outcome};
    }
    if (key == "machine_listing") {
        return {machine, {{"Change"}, kindCell}, reason};
    }
    if (key == "inventory") {
        return {machine,
                partition,
                {{"Change"}, kindCell},
                {{"Component", false, true}, componentCell},
                {{"Name", false, true}, nameCell},
                {{"Detail", false, true}, detailCell}};
    }
    return {machine, partition};
}

// A group's table, with the run of each event when several runs are shown.
std::string groupText(EventGroup const& group, std::vector<Event> const& events, bool severalRuns,
                      std::size_t width) {
    std::vector<EventCell> cells = groupCells(group.key);
    if (severalRuns) {
        cells.insert(cells.begin(), EventCell{{"Run", true}, runCell});
    }
    std::vector<TableColumn> columns;
    std::transform(cells.begin(), cells.end(), std::back_inserter(columns),
                   [](EventCell const& cell) { return cell.column; });
    FittedTable table(columns);
    for (Event const& event : events) {
        std::vector<std::string> row;
        std::transform(cells.begin(), cells.end(), std::back_inserter(row),
                       [&event](EventCell const& cell) { return cell.value(event); });
        table.addRow(row);
    }
    std::string const title = std::string(group.title) + " (" + std::to_string(events.size()) + ")";
    return "\n" + (width == 0 ? title : cutToWidth(title, width)) + "\n" + table.text(width, "  ");
}

// The newest run (of the console, when one is chosen); nullopt when none
// is recorded.
std::optional<long long> newestRun(SQLite::Database& database,
                                   std::optional<std::string> const& console) {
    SQLite::Statement query(database, "SELECT max(id) FROM runs WHERE ?1 IS NULL OR console = ?1");
    if (console) {
        query.bind(1, *console);
    }
    query.executeStep();
    return numberValue(query.getColumn(0));
}

// The selection with its run filled in when none was chosen; nullopt when
// there is no run to show.
std::optional<ChangeSelection> resolved(SQLite::Database& database, ChangeSelection selection) {
    if (!selection.run && !selection.sinceUnix) {
        selection.run = newestRun(database, selection.console);
        if (!selection.run) {
            return std::nullopt;
        }
    }
    return selection;
}

// The run shown: {"id", "console", "started", "previous_run"}; the previous
// run is the console's latest with a smaller id.
Json runJson(SQLite::Database& database, long long run) {
    SQLite::Statement query(database,
                            "SELECT r.id, r.console, r.started, (SELECT max(p.id) FROM runs p"
                            " WHERE p.console = r.console AND p.id < r.id) FROM runs r"
                            " WHERE r.id = ?1");
    query.bind(1, static_cast<std::int64_t>(run));
    query.executeStep();
    return {{"id", jsonValue(query.getColumn(0))},
            {"console", jsonValue(query.getColumn(1))},
            {"started", jsonValue(query.getColumn(2))},
            {"previous_run", jsonValue(query.getColumn(3))}};
}

std::string runHeading(Json const& run) {
    std::string heading = "Changes of run " + run["id"].dump() + " of " +
                          run["console"].get<std::string>() + ", started " +
                          shownTime(run["started"].get<std::string>());
    if (run["previous_run"].is_null()) {
        return heading + ": the console's first recorded run, nothing to compare with";
    }
    return heading + ", since run " + run["previous_run"].dump();
}

std::string sinceHeading(ChangeSelection const& selection, std::vector<long long> const& runs) {
    std::string heading = "Changes since " + selection.sinceText +
                          (selection.console ? " on " + *selection.console : std::string());
    if (runs.empty()) {
        return heading + ": no run recorded";
    }
    return heading + ": " + std::to_string(runs.size()) +
           (runs.size() == 1 ? " run, " : " runs, ") + std::to_string(runs.front()) + " to " +
           std::to_string(runs.back());
}

std::string headingText(SQLite::Database& database, ChangeSelection const& selection,
                        std::vector<long long> const& runs) {
    return selection.sinceUnix ? sinceHeading(selection, runs)
                               : runHeading(runJson(database, *selection.run));
}

} // namespace

bool hasRun(SQLite::Database& database, long long run) {
    SQLite::Statement query(database, "SELECT 1 FROM runs WHERE id = ?1");
    query.bind(1, static_cast<std::int64_t>(run));
    return query.executeStep();
}

std::string changeListText(SQLite::Database& database, ChangeSelection const& chosen,
                           std::size_t width) {
    std::optional<ChangeSelection> const selection = resolved(database, chosen);
    if (!selection) {
        return chosen.console ? "No run of " + *chosen.console + " recorded.\n"
                              : std::string("No run recorded.\n");
    }
    std::vector<long long> const runs = selectedRuns(database, *selection);
    std::vector<Event> const events = readEvents(database, runs);
    std::string const heading = headingText(database, *selection, runs);
    std::string text = (width == 0 ? heading : cutToWidth(heading, width)) + "\n";
    bool const severalRuns = selection->sinceUnix.has_value();
    for (EventGroup const& group : gc_Groups) {
        std::vector<Event> const members = groupEvents(group, events, severalRuns);
        if (!members.empty()) {
            text += groupText(group, members, severalRuns, width);
        }
    }
    return events.empty() && !runs.empty() ? text + "\nNo change.\n" : text;
}

Json changeListJson(SQLite::Database& database, ChangeSelection const& chosen) {
    std::optional<ChangeSelection> const selection = resolved(database, chosen);
    Json document = {{"run", nullptr},
                     {"since", chosen.sinceUnix ? Json(chosen.sinceText) : Json(nullptr)},
                     {"runs", Json::array()}};
    std::vector<long long> const runs =
        selection ? selectedRuns(database, *selection) : std::vector<long long>();
    if (selection && !selection->sinceUnix) {
        document["run"] = runJson(database, *selection->run);
    }
    document["runs"] = runs;
    std::vector<Event> const events = readEvents(database, runs);
    for (EventGroup const& group : gc_Groups) {
        Json members = Json::array();
        for (Event const& event : groupEvents(group, events, chosen.sinceUnix.has_value())) {
            Json member = Json::object();
            for (std::size_t i = 0; i < event.size(); ++i) {
                member[gc_EventKeys[i]] = event[i];
            }
            members.push_back(std::move(member));
        }
        document[group.key] = std::move(members);
    }
    return document;
}

} // namespace history
