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
// The PIDs of the direct children of pid; none when it is gone.
std::vector<int> childrenOf(int pid);
// The numbers of the open descriptors of pid, in ascending order.
std::vector<int> descriptorsOf(int pid);

} // namespace FleetTest
