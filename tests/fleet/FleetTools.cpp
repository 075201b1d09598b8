#include "FleetTools.h"

namespace FleetTest {

std::string consoleWideTool() {
    return QUORVEX_FLEET_TOOL;
}

std::string oneMachineTool() {
    return QUORVEX_SURVEY_TOOL;
}

} // namespace FleetTest

namespace FleetTest {

std::string listing(int partitions) {
    std::string line = std::string("[lspartition ") + gc_Identity + "]\nstdout ";
    for (int id = 1; id <= partitions; ++id) {
        line += std::to_string(id) + ",10.1.1.1" + std::to_string(id) + ",3,host" +
                std::to_string(id) + ",Zeph,7.2;";
    }
    return line + "\n";
}

} // namespace FleetTest
