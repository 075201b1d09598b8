// pylon-sim: a simulated PYLON console. Installed (linked or bind-mounted) as
// lsvtc, lspartition and runact-api, it plays the tool named by the base name
// of argv[0]; see sim/README.md.

#include "Console.h"

#include <cstdlib>
#include <iostream>
#include <string>
#include <vector>

namespace {

constexpr int gc_ExitUsage = 2;

std::string _baseName(std::string const& path) {
    std::size_t const slash = path.rfind('/');
    return slash == std::string::npos ? path : path.substr(slash + 1);
}

int _usage() {
    std::cerr
        << "usage: run as lsvtc, lspartition or runact-api (through a link or a bind mount),\n"
           "       or: pylon-sim --check SCENARIO-FILE\n"
           "The scenario is named by PYLON_SIM_SCENARIO, the invocation log by PYLON_SIM_LOG.\n";
    return gc_ExitUsage;
}

} // namespace

int main(int argc, char** argv) {
    std::string const tool = _baseName(argc > 0 ? argv[0] : "");
    std::vector<std::string> const arguments(argv + (argc > 0 ? 1 : 0), argv + argc);
    if (PylonSim::Console::isTool(tool)) {
        return PylonSim::Console::answer(tool, arguments);
    }
    if (arguments.size() == 2 && arguments[0] == "--check") {
        return PylonSim::Console::check(arguments[1]);
    }
    return _usage();
}
