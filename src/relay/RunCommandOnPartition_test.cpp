#include "relay/RunCommandOnPartition.h"

#include "relay/RELAY_Utility.h"

#include <gtest/gtest.h>

using Quorvex::RELAY::FileInfo;
using Quorvex::RELAY::RunCommandOnPartition;

namespace {

FileInfo clientFile(std::string const& name)
{
    FileInfo info(name, "", "", "");
    Quorvex::RELAY::RELAY_Utility::set_Default_Client_FileInfo(info);
    return info;
}

} // namespace

TEST(RunCommandOnPartition, ClientSurveyParameterTextIsBuiltByteForByte) {
    EXPECT_EQ(RunCommandOnPartition::createString_RunCommandParameters(
                  0, " -c 1234-ABC_10ABCDE -pylonv 4.0.11", clientFile("/tmp/quorvex.out")),
              "CmdID::0::CmdOpts::\" -c 1234-ABC_10ABCDE -pylonv 4.0.11\"::"
              "RemoteFN::\"/tmp/quorvex.out\"::"
              "RemoteFileInfo::\"FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=system\"");
}

TEST(RunCommandOnPartition, NegativeCommandNumberAndEmptyOptions) {
    FileInfo const info("/tmp/r", "u", "g", "600");
    EXPECT_EQ(RunCommandOnPartition::createString_RunCommandParameters(-1, "", info),
              "CmdID::-1::CmdOpts::\"\"::RemoteFN::\"/tmp/r\"::"
              "RemoteFileInfo::\"FILE_PERM=600;FILE_OWNER=u;FILE_GROUP=g\"");
}

TEST(RunCommandOnPartition, RemoteFileAttributesAreTakenAsGiven) {
    EXPECT_EQ(RunCommandOnPartition::createString_RunCommandParameters(7, "-x", FileInfo()),
              "CmdID::7::CmdOpts::\"-x\"::RemoteFN::\"\"::"
              "RemoteFileInfo::\"FILE_PERM=;FILE_OWNER=;FILE_GROUP=\"");
}

TEST(RunCommandOnPartition, HasNoVirtualFunctions) {
    EXPECT_FALSE(std::is_polymorphic<RunCommandOnPartition>::value);
}
