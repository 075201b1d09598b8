#include "report/SinceLastRunSection.h"

#include "report/Outcome.h"
#include "report/ReadableTime.h"
#include "utility/TextSafety.h"

#include <optional>
#include <vector>

namespace report {

using util::escapeHtml;

namespace {

using PartitionChange = SinceLastRun::PartitionChange;
using ComponentChange = SinceLastRun::ComponentChange;

// A list longer than this shows its first items and how many more there
// are: the partitions table has them all.
constexpr std::size_t gc_ListedChanges = 100;

// A time in a table cell: date, hours and minutes, which sort as text in
// the script's sorting; the whole time in its title and datetime.
std::string shortTimeElement(std::string const& isoTime) {
    std::optional<std::string> const readable = readableTime(isoTime);
    if (!readable) {
        return escapeHtml(isoTime);
    }
    return "<time datetime=\"" + escapeHtml(isoTime) + "\" title=\"" + *readable + "\">" +
           isoTime.substr(0, 10) + " " + isoTime.substr(11, 5) + "</time>";
}

std::string timeElement(std::string const& isoTime) {
    std::optional<std::string> const readable = readableTime(isoTime);
    return "<time datetime=\"" + escapeHtml(isoTime) + "\">" +
           (readable ? *readable : escapeHtml(isoTime)) + "</time>";
}

// A reason on one line: its lines joined by spaces, cut after
// gc_ReasonCharacters bytes (the partitions table has it whole).
constexpr std::size_t gc_ReasonCharacters = 160;

std::string oneLine(std::string const& text) {
    std::string line;
    for (char const character : text) {
        bool const blank =
            character == ' ' || character == '\n' || character == '\t' || character == '\r';
        if (!blank) {
            line += character;
        } else if (!line.empty() && line.back() != ' ') {
            line += ' ';
        }
    }
    if (!line.empty() && line.back() == ' ') {
        line.pop_back();
    }
    if (line.size() <= gc_ReasonCharacters) {
        return line;
    }
    std::size_t cut = gc_ReasonCharacters;
    // Not inside a character's UTF-8 bytes.
    while (cut > 0 && (static_cast<unsigned char>(line[cut]) & 0xC0U) == 0x80U) {
        --cut;
    }
    return line.substr(0, cut) + "\u2026";
}

// The outcome's key and its label, as the table shows them; the name as it
// is for an outcome the table lacks.
std::string outcomeText(std::string const& name) {
    std::optional<Outcome> const outcome = outcomeNamed(name);
    if (!outcome) {
        return escapeHtml(name);
    }
    return R"(<span class="outcome-name"><span class="key )" +
           std::string(textOf(*outcome).pageClass) + "\"></span>" + textOf(*outcome).label +
           "</span>";
}

// "host on machine", kept whole on their lines.
std::string partitionName(std::string const& machine, std::string const& partition) {
    return "<b>" + escapeHtml(partition) + "</b> on <span class=\"machine-name\">" +
           escapeHtml(machine) + "</span>";
}

std::string runsText(long long runs) {
    return std::to_string(runs) + (runs == 1 ? " run" : " runs");
}

std::string partitionChangeItem(PartitionChange const& change) {
    std::string item = "<li>" + partitionName(change.machine, change.partition);
    if (!change.outcome.empty()) {
        item += ": " + outcomeText(change.outcome);
    }
    if (change.failingSince && change.runsFailing > 1) {
        item += ", failing since " + timeElement(*change.failingSince) + " (" +
                runsText(change.runsFailing) + ")";
    }
    if (!change.reason.empty()) {
        item += " &middot; <q>" + escapeHtml(oneLine(change.reason)) + "</q>";
    }
    return item + "</li>\n";
}

std::string componentText(ComponentChange const& change) {
    std::string const name = change.componentName.empty() ? change.component : change.componentName;
    std::string text = "<b>" + escapeHtml(name) + "</b>";
    if (!change.componentName.empty() && change.component != change.componentName) {
        text += " (" + escapeHtml(change.component) + ")";
    }
    return text;
}

// What happened to the component: the kind, and the old and new value of a
// replacement (serial numbers) or of a changed property.
std::string componentChangeText(ComponentChange const& change) {
    std::string const values = " <span class=\"old-value\">" + escapeHtml(change.oldValue) +
                               "</span> &rarr; <span class=\"new-value\">" +
                               escapeHtml(change.newValue) + "</span>";
    if (change.kind == "replaced") {
        return "replaced, serial number" + values;
    }
    if (change.kind == "property_changed") {
        return escapeHtml(change.property) + values;
    }
    return escapeHtml(change.kind);
}

std::string componentChangeItem(ComponentChange const& change) {
    return "<li>" + partitionName(change.machine, change.partition) + ": " + componentText(change) +
           " " + componentChangeText(change) + "</li>\n";
}

std::string machineItem(std::string const& machine) {
    return "<li><span class=\"machine-name\">" + escapeHtml(machine) + "</span></li>\n";
}

// One list under its heading, its first gc_ListedChanges items; nothing for
// an empty one.
template <typename Change, typename Item>
std::string changeList(char const* id, char const* heading, std::vector<Change> const& changes,
                       Item item) {
    if (changes.empty()) {
        return "";
    }
    std::string list = "<h3 id=\"" + std::string(id) + "\">" + heading + "</h3>\n<ul class=\"" +
                       "change-list\">\n";
    for (std::size_t i = 0; i < changes.size() && i < gc_ListedChanges; ++i) {
        list += item(changes[i]);
    }
    if (changes.size() > gc_ListedChanges) {
        list += "<li class=\"more\">and " + std::to_string(changes.size() - gc_ListedChanges) +
                " more</li>\n";
    }
    return list + "</ul>\n";
}

// A kind of change: its list's anchor and heading, its count and its list.
struct Kind {
    char const* id;
    char const* heading;
    std::size_t count;
    std::string list;
};

template <typename Change, typename Item>
Kind kindOf(char const* id, char const* heading, std::vector<Change> const& changes, Item item) {
    return {id, heading, changes.size(), changeList(id, heading, changes, item)};
}

// The kinds of change in the order the section shows them.
std::vector<Kind> kindsOf(SinceLastRun const& since) {
    return {kindOf("new-failures", "New failures", since.newFailures, partitionChangeItem),
            kindOf("recoveries", "Recovered", since.recoveries, partitionChangeItem),
            kindOf("still-failing", "Still failing", since.stillFailing, partitionChangeItem),
            kindOf("newly-inactive", "Newly inactive", since.newlyInactive, partitionChangeItem),
            kindOf("inventory-changes", "Inventory changes", since.inventoryChanges,
                   componentChangeItem),
            kindOf("partitions-appeared", "Partitions appeared", since.partitionsAppeared,
                   partitionChangeItem),
            kindOf("partitions-disappeared", "Partitions disappeared", since.partitionsDisappeared,
                   partitionChangeItem),
            kindOf("machines-appeared", "Machines appeared", since.machinesAppeared, machineItem),
            kindOf("machines-disappeared", "Machines disappeared", since.machinesDisappeared,
                   machineItem)};
}

// Each kind's count first, those with changes linking to their list; then
// the lists.
std::string countsAndLists(SinceLastRun const& since) {
    std::vector<Kind> const kinds = kindsOf(since);
    std::string text = "<ul class=\"change-counts\">\n";
    std::string lists;
    for (Kind const& kind : kinds) {
        std::string const label =
            kind.count == 0 ? std::string(kind.heading)
                            : "<a href=\"#" + std::string(kind.id) + "\">" + kind.heading + "</a>";
        text += std::string("<li") + (kind.count == 0 ? " class=\"none\"" : "") + "><b>" +
                std::to_string(kind.count) + "</b>" + label + "</li>\n";
        lists += kind.list;
    }
    return text + "</ul>\n" + lists;
}

std::string sectionBody(SinceLastRun const& since) {
    if (since.unavailable) {
        return "<p class=\"history-state\"><b>History not recorded</b>: " +
               escapeHtml(*since.unavailable) + ". What changed cannot be shown.</p>\n";
    }
    if (!since.previousRunId) {
        return "<p class=\"history-state\"><b>First recorded run</b> of this console: nothing to "
               "compare.</p>\n";
    }
    return "<p class=\"history-state\">Compared with the run started " +
           timeElement(since.previousStarted) + ".</p>\n" + countsAndLists(since);
}

} // namespace

std::string sinceLastRunSection(SinceLastRun const& since) {
    return "<section id=\"since-last-run\">\n<h2>Since the last run</h2>\n" + sectionBody(since) +
           "</section>\n";
}

bool hasHistoryColumns(SinceLastRun const& since) {
    return !since.unavailable;
}

// The last survey first: at a narrow width the table's box shows it, and the
// stale mark with it, beside the outcome.
std::string historyColumns() {
    return R"(<col class="last-surveyed"><col class="failing-since">)";
}

std::string historyHeadings() {
    return "<th data-column=\"last-surveyed\">Last surveyed</th>"
           "<th data-column=\"failing-since\">Failing since</th>";
}

std::string historyCells(SinceLastRun const& since, std::string const& machine,
                         std::string const& partition) {
    auto const found = since.partitions.find({machine, partition});
    if (found == since.partitions.end()) {
        return "<td><td>";
    }
    SinceLastRun::PartitionState const& state = found->second;
    std::string cells = "<td>" + (state.lastSurveyed ? shortTimeElement(*state.lastSurveyed)
                                                     : std::string("never"));
    if (state.isStale) {
        cells += " <b class=stale title=\"not surveyed for " + runsText(state.runsNotSurveyed) +
                 " in a row\">stale</b>";
    }
    return cells + "<td>" + (state.failingSince ? shortTimeElement(*state.failingSince) : "");
}

} // namespace report
