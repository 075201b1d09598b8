#pragma once

#include "estate/Estate.h"

#include <string>

namespace estate {

// Writes the estate report into folder (made when missing): index.html,
// estate.csv and estate.json, each through a temporary name renamed when
// complete (an estate report from before is replaced: the history keeps the
// past), and each collected console's own report, as `quorvex-survey report`
// writes it, in consoles/<consoleFolderName()>/. Throws util::SystemError
// when the folder cannot be made or a file cannot be written.
void writeEstate(Estate const& estate, std::string const& folder);

} // namespace estate
