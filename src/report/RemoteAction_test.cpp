#include "report/RemoteAction.h"

#include <gtest/gtest.h>

namespace {

using report::RemoteAction;

TEST(RemoteAction, NamesAreTheConsolesActionNames) {
    EXPECT_STREQ("runCmdOnPartition", report::remoteActionName(RemoteAction::RunCommand));
    EXPECT_STREQ("getFileFromPartition", report::remoteActionName(RemoteAction::GetFile));
}

TEST(RemoteAction, CommandLineNamingTheGetFileActionGetsAFile) {
    EXPECT_EQ(RemoteAction::GetFile,
              report::remoteActionOfCommandLine("relay -a getFileFromPartition -p 3 x.VPD.xml"));
}

TEST(RemoteAction, AnyOtherCommandLineIsTheClientRun) {
    EXPECT_EQ(RemoteAction::RunCommand,
              report::remoteActionOfCommandLine("relay -a runCmdOnPartition -p 3 client"));
    EXPECT_EQ(RemoteAction::RunCommand, report::remoteActionOfCommandLine(""));
}

} // namespace
