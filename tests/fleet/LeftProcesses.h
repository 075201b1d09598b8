#pragma once
// Processes that belong to one simulated console: every process that
// inherited its invocation log setting (PYLON_SIM_LOG=<path>), other than
// the test itself. Once a survey has ended, any such process is a console
// action, or a process an action started, that the survey left behind.

#include <string>
#include <vector>

namespace FleetTest {

// "<pid> <command line>" of each such process.
std::vector<std::string> processesOfConsole(std::string const& logPath);

} // namespace FleetTest
