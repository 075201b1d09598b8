#pragma once

#include "estate/ConsoleRun.h"

#include <string>
#include <vector>

namespace estate {

// Everything one collection brought: when it ran and each console of the
// inventory once, those that could not be collected first (in the record
// table's order), then the collected ones, each group by console name.
struct Estate {
    std::string collected;
    std::vector<ConsoleRun> consoles;
};

// Reads records.json and every console's bundle from collectFolder. Throws
// util::SystemError when records.json cannot be read and MalformedInput when
// it is not such a file; a console's bundle that cannot be read is that
// console's tool_error (readConsoleRun), never a failure of the whole.
Estate readEstate(std::string const& collectFolder);

// The name of a console's folder in the estate report: its inventory name
// with every byte but ASCII letters, digits, "-" and inner "." written as
// "_" and two hex digits, so that any two consoles get two folders and no
// name reaches outside the report or needs escaping in a link.
std::string consoleFolderName(std::string const& console);

// Where a console's own report is in the estate report, relative to the
// estate's page, such as "consoles/site-a/index.html"; nothing for a console
// without a summary.
std::optional<std::string> consoleReportPath(ConsoleRun const& console);

} // namespace estate
