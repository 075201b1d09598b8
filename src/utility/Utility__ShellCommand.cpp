#include "utility/Utility__ShellCommand.h"

namespace Utility {

void Utility__ShellCommand::_u_PrintText(std::ostream& out, std::vector<std::string> const& lines,
                                         std::string const& prefix) {
    for (std::string const& line : lines) {
        if (!prefix.empty()) {
            out << "|" << prefix << "|";
        }
        out << line << "\n";
    }
    out.flush();
}

} // namespace Utility
