#pragma once

#include <ostream>
#include <string>
#include <vector>

namespace Utility {

// Support functions of the shell command runner.
class Utility__ShellCommand {
public:
    // Writes each line followed by "\n"; with a non-empty prefix each line
    // reads "|" + prefix + "|" + line. Flushes the stream at the end.
    static void _u_PrintText(std::ostream& out, std::vector<std::string> const& lines,
                             std::string const& prefix);
};

} // namespace Utility
