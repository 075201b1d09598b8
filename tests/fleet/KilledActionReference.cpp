#include "KilledActionReference.h"

#include "FleetTools.h"

#include <sys/stat.h>

namespace FleetTest {

namespace {

constexpr char gc_RemoteActionTool[] = "/usr/bin/runact-api";
// In the sandbox every console tool path holds the simulator, which plays the
// tool named by argv[0].
constexpr char gc_Simulator[] = "/opt/vtc/bin/lspartition";

} // namespace

KilledActionReference::KilledActionReference(std::string const& identity,
                                             std::vector<std::string> const& partitionIds) {
    _writeStandIn(partitionIds);
    _result = QuorvexTest::runInSandbox({"--vpd", _vpd.path(), "--trace", _trace.path(), "--bind",
                                         _tools.file("runact-api") + ":" + gc_RemoteActionTool},
                                        {oneMachineTool(), "-c", identity});
}

QuorvexTest::CommandResult const& KilledActionReference::result() const {
    return _result;
}

std::string KilledActionReference::vpdFile(std::string const& name) const {
    return QuorvexTest::readFile(_vpd.file(name));
}

std::string KilledActionReference::trace() const {
    return QuorvexTest::readFile(_trace.file("quorvexPYLON_VPD_Survey_ClientPartition.Trace"));
}

// The shell may run the command in its own process or replace itself by it;
// either way the action ends killed by SIGKILL, having printed nothing.
void KilledActionReference::_writeStandIn(std::vector<std::string> const& partitionIds) const {
    std::string script = "#!/bin/bash\ncase \"$*\" in\n";
    for (std::string const& id : partitionIds) {
        script += "  *runCmdOnPartition*::PartitionId::" + id +
                  "::*)\n"
                  "    if [[ $(cat /proc/$PPID/comm) == sh ]]; then kill -KILL \"$PPID\"; fi\n"
                  "    kill -KILL \"$$\" ;;\n";
    }
    script += "esac\nexec -a runact-api " + std::string(gc_Simulator) + " \"$@\"\n";
    std::string const path = _tools.file("runact-api");
    QuorvexTest::writeFile(path, script);
    ::chmod(path.c_str(), 0755);
}

} // namespace FleetTest
