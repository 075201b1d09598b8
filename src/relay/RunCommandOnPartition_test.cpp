#include "relay/RunCommandOnPartition.h"

#include "relay/RELAY_Utility.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

using Quorvex::RELAY::FileInfo;
using Quorvex::RELAY::RunCommandOnPartition;

namespace {

FileInfo clientFile(std::string const& name) {
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

namespace {

// The client survey options as completed for partition 3 of 1234-ABC_10ABCDE.
std::string completedOptions(std::string options) {
    RunCommandOnPartition run{Quorvex::RELAY::TargetPartition(QuorvexTest::examplePartition())};
    run._initialize_ClientQuorvexParameters(options);
    return options;
}

} // namespace

TEST(RunCommandOnPartition, EmptyOptionsGetMachineAndVersionAfterALeadingBlank) {
    EXPECT_EQ(completedOptions(""), " -c 1234-ABC_10ABCDE -pylonv 4.0.11");
}

TEST(RunCommandOnPartition, OptionsNamingTheMachineGetOnlyTheVersion) {
    EXPECT_EQ(completedOptions("-c X"), "-c X -pylonv 4.0.11");
}

TEST(RunCommandOnPartition, OptionsNamingTheVersionGetOnlyTheMachine) {
    EXPECT_EQ(completedOptions("-pylonv 5"), "-pylonv 5 -c 1234-ABC_10ABCDE");
}

TEST(RunCommandOnPartition, MinusCInsideAnotherWordCountsAsNamingTheMachine) {
    EXPECT_EQ(completedOptions("-cfg /etc/q.cfg"), "-cfg /etc/q.cfg -pylonv 4.0.11");
    EXPECT_EQ(completedOptions("x-cy"), "x-cy -pylonv 4.0.11");
}

TEST(RunCommandOnPartition, OptionsNamingBothAreLeftAlone) {
    EXPECT_EQ(completedOptions("-pylonv 5 -c Y"), "-pylonv 5 -c Y");
}

TEST(RunCommandOnPartition, VersionCheckSeesTheMachineJustAppended) {
    // The machine text itself may hold "-pylonv"; the version is then not added.
    RunCommandOnPartition run{Quorvex::RELAY::TargetPartition(
        Quorvex::System::Partition(Quorvex::System::MTMS("A-pylonv", "S"), "3", ""))};
    std::string options;
    run._initialize_ClientQuorvexParameters(options);
    EXPECT_EQ(options, " -c A-pylonv_S");
}
