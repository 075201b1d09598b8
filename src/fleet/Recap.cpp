#include "fleet/Recap.h"

#include "fleet/PartitionName.h"
#include "fleet/Progress.h"
#include "report/FailureReason.h"
#include "report/ListingFailure.h"
#include "report/ReportCommand.h"

#include <algorithm>
#include <cmath>
#include <regex>
#include <string_view>

namespace fleet {

namespace {

// Lists are fitted to a terminal of this width when the recap goes elsewhere.
constexpr std::size_t gc_ColumnsWhenUnknown = 80;
constexpr std::size_t gc_LongestShown = 3;
constexpr char gc_Indent[] = "  ";
constexpr std::string_view gc_ListSeparator = ", ";

std::size_t tablePlace(report::Outcome outcome) {
    auto const& table = report::outcomeTable();
    auto const row = std::find_if(table.begin(), table.end(), [&](report::OutcomeText const& text) {
        return text.outcome == outcome;
    });
    return static_cast<std::size_t>(row - table.begin());
}

// The console's own words in a failed action's reason ("[RetStr1] = timeout").
std::string consoleMessage(std::string const& reason) {
    static std::regex const line(R"((?:^|\n)\[RetStr1\] = ([^\n]+))");
    std::smatch match;
    return std::regex_search(reason, match, line) ? match[1].str() : "";
}

std::string failedActionText(std::string const& reason) {
    report::FailureReason const facts = report::parseFailureReason(reason);
    std::string text = std::string(report::remoteActionName(*facts.action)) + " failed";
    if (facts.rc) {
        text += ", Rc " + std::to_string(*facts.rc);
    }
    if (facts.rcCmd) {
        text += ", RcCmd " + std::to_string(*facts.rcCmd);
    }
    std::string const message = consoleMessage(reason);
    return message.empty() ? text : text + ": " + message;
}

// Why a partition failed, in one line that partitions failing alike share.
std::string reasonOf(PartitionRecord const& record) {
    auto const& result = record.result;
    if (record.stop) {
        return std::string(report::remoteActionName(record.stop->action)) +
               (record.stop->bySignal ? " stopped when the run was interrupted"
                                      : " stopped by the time limit");
    }
    if (report::isFailureReason(result.reason)) {
        return failedActionText(result.reason);
    }
    if (!result.reason.empty()) {
        return result.reason.substr(0, result.reason.find('\n'));
    }
    return result.statusText;
}

// The console's answer first, so that a narrow terminal still shows it; the
// command stays in the summary.
std::string listingReason(report::ListingFailure const& failure) {
    if (!failure.exitStatus) {
        return failure.message;
    }
    return failure.message + " (exit status " + std::to_string(*failure.exitStatus) + ")";
}

std::string wholeSeconds(double seconds) {
    return std::to_string(static_cast<long>(std::floor(std::max(0.0, seconds)))) + " s";
}

// prefix followed by as many items as fit in columns, at least one, and
// " and N more" for the rest.
std::string listFitting(std::string const& prefix, std::vector<std::string> const& items,
                        std::size_t columns) {
    std::string line = prefix + items.front();
    std::size_t shown = 1;
    for (; shown < items.size(); ++shown) {
        std::size_t const restAfter = items.size() - shown - 1;
        std::string const more =
            restAfter == 0 ? "" : " and " + std::to_string(restAfter) + " more";
        if (line.size() + gc_ListSeparator.size() + items[shown].size() + more.size() >= columns) {
            break;
        }
        line.append(gc_ListSeparator).append(items[shown]);
    }
    if (shown < items.size()) {
        line += " and " + std::to_string(items.size() - shown) + " more";
    }
    return fitToWidth(line, columns) + "\n";
}

} // namespace

Recap::Recap(std::vector<MachineRecord> const& machines)
    : _machineCount(machines.size()), _outcomeCounts(report::gc_OutcomeCount, 0) {
    for (MachineRecord const& machine : machines) {
        if (machine.listingFailure) {
            _addFailure(report::gc_ListingFailedLabel, listingReason(*machine.listingFailure),
                        machine.identity);
        }
        for (PartitionRecord const& record : machine.partitions) {
            _count(record);
        }
    }
    std::stable_sort(_failures.begin(), _failures.end(),
                     [](FailureGroup const& one, FailureGroup const& other) {
                         return one.names.size() > other.names.size();
                     });
    std::stable_sort(
        _durations.begin(), _durations.end(),
        [](Duration const& one, Duration const& other) { return one.seconds > other.seconds; });
}

void Recap::_count(PartitionRecord const& record) {
    ++_partitionCount;
    // A partition still unsettled at the end was cut short by the run's end.
    report::Outcome const outcome = record.outcome.value_or(report::Outcome::Interrupted);
    ++_outcomeCounts[tablePlace(outcome)];
    if (report::isFailure(outcome)) {
        _addFailure(report::textOf(outcome).label, reasonOf(record), shownName(record.partition));
    }
    if (record.seconds) {
        _durations.push_back(Duration{*record.seconds, shownName(record.partition)});
    }
}

void Recap::_addFailure(std::string const& label, std::string const& reason,
                        std::string const& name) {
    auto const group =
        std::find_if(_failures.begin(), _failures.end(), [&](FailureGroup const& known) {
            return known.label == label && known.reason == reason;
        });
    if (group != _failures.end()) {
        group->names.push_back(name);
        return;
    }
    _failures.push_back(FailureGroup{label, reason, {name}});
}

std::string Recap::text(RecapEnding const& ending, std::size_t columns) const {
    std::size_t const width = columns == 0 ? gc_ColumnsWhenUnknown : columns;
    std::string text = fitToWidth(_headline(ending), width) + "\n";
    if (!ending.interruptedBy.empty()) {
        text += std::string(gc_Indent) + "interrupted by " + ending.interruptedBy + " after " +
                wholeSeconds(ending.elapsedSeconds) + "\n";
    }
    if (_partitionCount > 0) {
        text += fitToWidth(gc_Indent + _totalsLine(), width) + "\n";
    }
    text += _failureLines(width) + _longestLine(width);
    if (!ending.summaryFile.empty()) {
        text += std::string(gc_Indent) + "summary: " + ending.summaryFile + "\n";
    }
    if (!ending.reportFolder.empty()) {
        text += std::string(gc_Indent) + "report: " + ending.reportFolder + "\n";
    }
    return text;
}

std::string Recap::_headline(RecapEnding const& ending) const {
    return std::string(report::gc_ProgramName) + ": " + std::to_string(_partitionCount) +
           (_partitionCount == 1 ? " partition" : " partitions") + " of " +
           std::to_string(_machineCount) + (_machineCount == 1 ? " machine" : " machines") +
           " in " + clockText(ending.elapsedSeconds);
}

std::string Recap::_totalsLine() const {
    std::string line;
    for (auto const& row : report::outcomeTable()) {
        std::size_t const count = _outcomeCounts[tablePlace(row.outcome)];
        if (count > 0) {
            line += (line.empty() ? "" : ", ") + std::to_string(count) + " " + row.label;
        }
    }
    return line;
}

// Each group on two lines, so that a long reason leaves the host names
// their own row: the count, outcome and reason, then the first host names.
std::string Recap::_failureLines(std::size_t columns) const {
    if (_failures.empty()) {
        return "";
    }
    std::string const inGroup = std::string(gc_Indent) + gc_Indent;
    std::string lines = std::string(gc_Indent) + "failed, by reason:\n";
    for (FailureGroup const& group : _failures) {
        lines += fitToWidth(inGroup + std::to_string(group.names.size()) + " " + group.label +
                                ": " + group.reason,
                            columns) +
                 "\n";
        lines += listFitting(inGroup + gc_Indent, group.names, columns);
    }
    return lines;
}

std::string Recap::_longestLine(std::size_t columns) const {
    if (_durations.empty()) {
        return "";
    }
    std::vector<std::string> longest;
    for (std::size_t index = 0; index < _durations.size() && index < gc_LongestShown; ++index) {
        longest.push_back(_durations[index].name + " " + wholeSeconds(_durations[index].seconds));
    }
    return listFitting(std::string(gc_Indent) + "longest: ", longest, columns);
}

} // namespace fleet
