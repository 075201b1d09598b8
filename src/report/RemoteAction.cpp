#include "report/RemoteAction.h"

namespace report {

namespace {

constexpr char gc_RunCommandName[] = "runCmdOnPartition";
constexpr char gc_GetFileName[] = "getFileFromPartition";

} // namespace

char const* remoteActionName(RemoteAction action) {
    return action == RemoteAction::GetFile ? gc_GetFileName : gc_RunCommandName;
}

RemoteAction remoteActionOfCommandLine(std::string const& commandLine) {
    return commandLine.find(gc_GetFileName) != std::string::npos ? RemoteAction::GetFile
                                                                 : RemoteAction::RunCommand;
}

} // namespace report
