#include "InvocationLog.h"

#include <fstream>

namespace PylonSim {

std::string InvocationLog::formatLine(std::string const& tool,
                                      std::vector<std::string> const& arguments) {
    std::string line = tool;
    for (std::string const& argument : arguments) {
        line += '\t' + _escape(argument);
    }
    return line + '\n';
}

bool InvocationLog::append(std::string const& fileName, std::string const& line) {
    // One buffered write of the whole line keeps calls from several
    // processes on separate lines.
    std::ofstream out(fileName, std::ios::binary | std::ios::app);
    out.write(line.data(), static_cast<std::streamsize>(line.size()));
    out.close();
    return static_cast<bool>(out);
}

std::string InvocationLog::_escape(std::string const& argument) {
    std::string escaped;
    for (char const c : argument) {
        if (c == '\\') {
            escaped += "\\\\";
        } else if (c == '\t') {
            escaped += "\\t";
        } else if (c == '\n') {
            escaped += "\\n";
        } else {
            escaped += c;
        }
    }
    return escaped;
}

} // namespace PylonSim
