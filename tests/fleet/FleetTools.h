#pragma once
// Paths of the two survey programs in the build tree.

#include <string>

namespace FleetTest {

// quorvex-survey, the console-wide survey.
std::string consoleWideTool();
// quorvexPYLON_VPD_Survey_ClientPartition, the one-machine survey tool.
std::string oneMachineTool();

} // namespace FleetTest
