#pragma once
// The invocation log: one line per call of a console tool, so tests can check
// the exact command lines the console received.

#include <string>
#include <vector>

namespace PylonSim {

class InvocationLog {
public:
    // The tool's base name, then each argument preceded by a TAB; backslash,
    // TAB and line feed inside an argument are written as \\, \t and \n.
    static std::string formatLine(std::string const& tool,
                                  std::vector<std::string> const& arguments);

    // Appends the line to the log file in one write; false when it cannot.
    static bool append(std::string const& fileName, std::string const& line);

private:
    static std::string _escape(std::string const& argument);
};

} // namespace PylonSim
