#include "FleetTools.h"

namespace FleetTest {

std::string consoleWideTool() {
    return QUORVEX_FLEET_TOOL;
}

std::string oneMachineTool() {
    return QUORVEX_SURVEY_TOOL;
}

} // namespace FleetTest
