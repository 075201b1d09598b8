#pragma once

#include <optional>
#include <string>

namespace report {

// A remote action the survey has the console run on a partition: the client
// run, or getting its document back. quorvex-survey stops actions that run
// past the time limit and the summary names the action it stopped.
enum class RemoteAction {
    RunCommand,
    GetFile,
};

// The console's name of the action, as its command line and the summary
// carry it: "runCmdOnPartition" or "getFileFromPartition".
char const* remoteActionName(RemoteAction action);

// The action a console command line runs: getting a file when the line names
// that action, else the client run.
RemoteAction remoteActionOfCommandLine(std::string const& commandLine);

} // namespace report
