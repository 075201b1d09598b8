#pragma once

#include "report/SinceLastRun.h"

#include <string>

namespace report {

// The report page's parts that show the history (docs/report.md): the
// section "Since the last run" above the tables, and each partition's
// "Failing since" and "Last surveyed" cells. A page without history has
// none of them.

// The section: the counts of each kind of change first, then their lists;
// for the console's first recorded run that there is nothing to compare,
// and for a run whose history was not recorded that it was not, and why.
std::string sinceLastRunSection(SinceLastRun const& since);

// Whether the partitions table gets the history's columns: not when the
// history could not be read, as every cell would be empty.
bool hasHistoryColumns(SinceLastRun const& since);

// The <col> elements and the headings of the two columns.
std::string historyColumns();
std::string historyHeadings();

// A partition's two cells, left open as the table's other cells: when it
// was last surveyed with, for a partition not surveyed for
// since.staleAfterRuns runs in a row, the stale mark; and when its failing
// streak began. Empty cells for a partition the history does not know.
std::string historyCells(SinceLastRun const& since, std::string const& machine,
                         std::string const& partition);

} // namespace report
