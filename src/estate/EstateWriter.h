#pragma once

#include "estate/Estate.h"
#include "estate/EstateHistory.h"

#include <string>

namespace estate {

// Writes the estate report into folder (made when missing): index.html,
// estate.csv and estate.json, each through a temporary name renamed when
// complete (an estate report from before is replaced: the history keeps the
// past), and each collected console's own report, as `quorvex-survey report`
// writes it, in consoles/<consoleFolderName()>/. Each console's run is
// recorded in history before its report is written, so that the report and
// the estate show what changed since the console's previous run; a run that
// cannot be recorded is kept in history's failures and stops nothing.
// Throws util::SystemError when the folder cannot be made or a file cannot
// be written.
void writeEstate(Estate const& estate, std::string const& folder, EstateHistory& history);

} // namespace estate
