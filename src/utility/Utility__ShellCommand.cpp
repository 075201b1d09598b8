#include "utility/Utility__ShellCommand.h"

namespace Utility {

void Utility__ShellCommand::_u_PrintText(std::ostream& out, std::vector<std::string> const& lines,
                                         std::string const& prefix) {
    for (std::string const& line : lines) {
        if (!prefix.empty()) {
            out.put('|').write(prefix.data(), static_cast<std::streamsize>(prefix.size())).put('|');
        }
        // Unformatted writes: the same bytes without a formatting pass per line.
        out.write(line.data(), static_cast<std::streamsize>(line.size())).put('\n');
    }
    out.flush();
}

} // namespace Utility
