#include "survey/InputParameter.h"
#include "survey/Survey_Files.h"
#include "survey/VPD_Survey_ClientPartition.h"
#include "utility/Trace.h"

#include <ostream>
#include <string>

namespace {

constexpr char gc_MachineOption[] = "-c";
// The run's outcome travels only in text; the exit status says the tool ran.
// Kept for the console's scripts: see docs/compatibility.md#exit-status
constexpr int gc_ExitAfterRun = 2;
constexpr int gc_ExitBadCommandLine = 255;

} // namespace

int main(int argc, char** argv) {
    // The first trace object with a name: opens (and truncates) the shared trace file.
    Utility::Trace trace(Quorvex::PYLON::VPD::get_TraceFileName());
    trace << "PYLON_VPD_Survey_ClientPartition::main" << std::endl;

    Utility::InputParameter parameters(static_cast<unsigned int>(argc), argv);
    if (!parameters.contains(gc_MachineOption) || parameters[gc_MachineOption].empty()) {
        return gc_ExitBadCommandLine;
    }
    VPD_Survey_ClientPartition(parameters[gc_MachineOption]);
    return gc_ExitAfterRun;
}
