// Runs the remote action command against the simulated console and checks
// what the console received, what the trace shows and the codes read back.

#include "relay/Base.h"

#include "relay/PutFileToPartition.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

using Quorvex::RELAY::Base;
using Quorvex::RELAY::cBlankReturnCode;
using Quorvex::RELAY::ReturnCode;
using Quorvex::RELAY::TargetPartition;
using QuorvexTest::examplePartition;
using QuorvexTest::expectedTraceBlock;
using QuorvexTest::Invocation;
using QuorvexTest::SimulatedConsole;

using Base_Run = QuorvexTest::TracedTest;

namespace {

std::string const gc_DoneLine = "Rc::0::RcCmd::0::RetStr1::done::RetStr2::";

// The command up to the target, as built, for partition 3 addressed by identifier.
std::string const gc_RunCommandPrefix =
    "/usr/bin/runact-api -c ZOR.ServiceEvent::::runCmdOnPartition::CallerID::0::"
    "CecMT::\"1234-ABC\"::CecMS::\"10ABCDE\"::PartitionId::\"3\"";

// A Base that runs "runCmdOnPartition" on partition 3.
Base runBase() {
    Base base{TargetPartition(examplePartition())};
    base.set_Action("runCmdOnPartition");
    return base;
}

} // namespace

TEST_F(Base_Run, CompletePutCommandLineIsExecutedByteForByte) {
    SimulatedConsole const console("[putFileToPartition 3]\nstdout " + gc_DoneLine + "\n");
    Base base{TargetPartition(examplePartition())};
    base.set_Action("putFileToPartition");
    base.get_TargetPartition().use_PartitionArray();

    int const exitCode = base.execute(
        Quorvex::RELAY::PutFileToPartition::createString_PutFileParameters("/tmp/quorvex.tar"));

    EXPECT_EQ(exitCode, 0);
    EXPECT_EQ(_trace.text(),
              expectedTraceBlock(
                  "/usr/bin/runact-api -c ZOR.ServiceEvent::::putFileToPartition::CallerID::0::"
                  "CecMT::\"1234-ABC\"::CecMS::\"10ABCDE\"::PartitionArray::{\"3\"}::"
                  "LocalFN::\"/tmp/quorvex.tar\"::RemoteFN::\"/tmp/quorvex.tar\"::"
                  "RemoteFileInfo::\"FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=system\"",
                  0, gc_DoneLine + "\n\n", "\n"));
    EXPECT_EQ(console.invocations(),
              (std::vector<Invocation>{
                  {"runact-api", "-c",
                   "ZOR.ServiceEvent::::putFileToPartition::CallerID::0::CecMT::1234-ABC::CecMS::"
                   "10ABCDE::"
                   "PartitionArray::{3}::LocalFN::/tmp/quorvex.tar::RemoteFN::/tmp/quorvex.tar::"
                   "RemoteFileInfo::FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=system"}}));
}

TEST_F(Base_Run, EmptyParametersAppendNothingToTheCommandLine) {
    SimulatedConsole const console("[runCmdOnPartition 3]\nstdout " + gc_DoneLine + "\n");
    Base base = runBase();
    EXPECT_EQ(base.execute(""), 0);
    EXPECT_EQ(_trace.text(),
              expectedTraceBlock(gc_RunCommandPrefix, 0, gc_DoneLine + "\n\n", "\n"));
    EXPECT_EQ(console.invocations(),
              (std::vector<Invocation>{{"runact-api", "-c",
                                        "ZOR.ServiceEvent::::runCmdOnPartition::CallerID::0::"
                                        "CecMT::1234-ABC::CecMS::10ABCDE::PartitionId::3"}}));
}

TEST_F(Base_Run, UnsetActionIsSentAsErrorNoAction) {
    SimulatedConsole const console("");
    Base base{TargetPartition(examplePartition())};
    EXPECT_EQ(base.execute("x::\"1\""), 3);
    ASSERT_EQ(console.invocations().size(), 1u);
    EXPECT_EQ(console.invocations()[0][2],
              "ZOR.ServiceEvent::::ERROR_NO_ACTION::CallerID::0::CecMT::1234-ABC::CecMS::10ABCDE::"
              "PartitionId::3::x::1");
    EXPECT_EQ(base.get_ReturnCode().get_Rc(), 3);
    EXPECT_EQ(base.get_ReturnCode().get_RetStr1(), "unknown action");
}

TEST_F(Base_Run, SuccessKeepsEveryOutputLineAndReadsTheReturnCode) {
    SimulatedConsole const console("[runCmdOnPartition 3]\nstdout " + gc_DoneLine + "\n");
    Base base = runBase();
    EXPECT_EQ(base.execute("CmdID::0"), 0);
    EXPECT_EQ(base.get_Output(), (std::vector<std::string>{gc_DoneLine, ""}));
    ASSERT_EQ(base.get_ListOf_ReturnCodes().size(), 1u);
    ReturnCode const rc = base.get_ReturnCode();
    EXPECT_EQ(rc.get_Rc(), 0);
    EXPECT_EQ(rc.get_RcCmd(), 0);
    EXPECT_EQ(rc.get_RetStr1(), "done");
    EXPECT_EQ(rc.get_RetStr2(), "");
}

TEST_F(Base_Run, NonZeroExitLeavesOutputEmptyButParsesTheLines) {
    SimulatedConsole const console("[runCmdOnPartition 3]\n"
                                   "stdout Rc::1::RcCmd::0::RetStr1::timeout::RetStr2::\n"
                                   "stderr partition not reachable\n"
                                   "exit 1\n");
    Base base = runBase();
    EXPECT_EQ(base.execute("CmdID::0"), 1);
    EXPECT_EQ(_trace.text(), expectedTraceBlock(gc_RunCommandPrefix + "::CmdID::0", 1,
                                                "Rc::1::RcCmd::0::RetStr1::timeout::RetStr2::\n\n",
                                                "partition not reachable\n\n"));
    EXPECT_TRUE(base.get_Output().empty());
    ASSERT_EQ(base.get_ListOf_ReturnCodes().size(), 1u);
    EXPECT_EQ(base.get_ReturnCode().get_Rc(), 1);
    EXPECT_EQ(base.get_ReturnCode().get_RetStr1(), "timeout");
}

TEST_F(Base_Run, FailedRunAfterASuccessfulOneLeavesNoOutput) {
    SimulatedConsole const console(
        "[runCmdOnPartition 3]\nstdout " + gc_DoneLine +
        "\n"
        "[getFileFromPartition 3]\nstdout Rc::5::RetStr1::missing\nexit 4\n");
    Base base = runBase();
    EXPECT_EQ(base.execute(""), 0);
    EXPECT_FALSE(base.get_Output().empty());
    base.set_Action("getFileFromPartition");
    EXPECT_EQ(base.execute(""), 4);
    EXPECT_TRUE(base.get_Output().empty());
    ASSERT_EQ(base.get_ListOf_ReturnCodes().size(), 1u);
    EXPECT_EQ(base.get_ReturnCode().get_Rc(), 5);
}

TEST_F(Base_Run, NoOutputAtAllGivesTheBlankReturnCode) {
    SimulatedConsole const console("[runCmdOnPartition 3]\nexit 1\n");
    Base base = runBase();
    EXPECT_EQ(base.execute(""), 1);
    EXPECT_EQ(_trace.text(), expectedTraceBlock(gc_RunCommandPrefix, 1, "\n", "\n"));
    EXPECT_TRUE(base.get_ListOf_ReturnCodes().empty());
    EXPECT_EQ(&base.get_ReturnCode(), &cBlankReturnCode);
    EXPECT_EQ(base.get_ReturnCode().get_Rc(), -1);
    EXPECT_EQ(base.get_ReturnCode().get_RcCmd(), -1);
    EXPECT_EQ(base.get_ReturnCode().get_RetStr1(), "");
}

TEST_F(Base_Run, SuccessWithoutOutputKeepsTheEmptyLineButReadsNoCode) {
    SimulatedConsole const console("[runCmdOnPartition 3]\n");
    Base base = runBase();
    EXPECT_EQ(base.execute(""), 0);
    EXPECT_EQ(base.get_Output(), (std::vector<std::string>{""}));
    EXPECT_EQ(base.get_ReturnCode().get_Rc(), -1);
}

TEST_F(Base_Run, EmptyLinesAddNoCodeAndTheFirstOfSeveralIsReturned) {
    SimulatedConsole const console("[runCmdOnPartition 3]\n"
                                   "stdout Rc::4::RcCmd::2::RetStr1::first\n"
                                   "stdout \n"
                                   "stdout Rc::0::RetStr1::second\n");
    Base base = runBase();
    EXPECT_EQ(base.execute(""), 0);
    EXPECT_EQ(base.get_Output().size(), 4u);
    ASSERT_EQ(base.get_ListOf_ReturnCodes().size(), 2u);
    EXPECT_EQ(base.get_ReturnCode().get_Rc(), 4);
    EXPECT_EQ(base.get_ReturnCode().get_RetStr1(), "first");
    EXPECT_EQ(base.get_ListOf_ReturnCodes()[1].get_RetStr1(), "second");
}

TEST_F(Base_Run, MalformedLinesAreParsedAsFarAsTheyGo) {
    SimulatedConsole const console("[runCmdOnPartition 3]\n"
                                   "stdout Rc\n"
                                   "stdout Rc::abc\n"
                                   "stdout ::\n"
                                   "stdout x::1::Rc::5::x::2\n"
                                   "stdout a::b::c\n"
                                   "stdout Rc:0\n"
                                   "stdout-nolf RetStr1::Rc::RcCmd::3");
    Base base = runBase();
    EXPECT_EQ(base.execute(""), 0);
    std::vector<ReturnCode> const& codes = base.get_ListOf_ReturnCodes();
    ASSERT_EQ(codes.size(), 7u);
    EXPECT_TRUE(codes[0].contains("Rc"));
    EXPECT_EQ(codes[0].get_Rc(), 0);
    EXPECT_EQ(codes[1].get_ValueOf("Rc"), "abc");
    EXPECT_EQ(codes[1].get_Rc(), 0);
    EXPECT_EQ(codes[2].get_Values(), (std::map<std::string, std::string>{{"", ""}}));
    EXPECT_EQ(codes[2].get_Rc(), -1);
    EXPECT_EQ(codes[3].get_Rc(), 5);
    EXPECT_EQ(codes[3].get_ValueOf("x"), "2");
    EXPECT_EQ(codes[4].get_ValueOf("a"), "b");
    EXPECT_EQ(codes[4].get_ValueOf("c"), "");
    EXPECT_EQ(codes[5].get_Rc(), -1);
    EXPECT_TRUE(codes[5].contains("Rc:0"));
    EXPECT_EQ(codes[6].get_ValueOf("Rc"), "RcCmd");
    EXPECT_EQ(codes[6].get_RcCmd(), -1);
    EXPECT_EQ(base.get_Output().back(), "RetStr1::Rc::RcCmd::3");
}

TEST_F(Base_Run, VeryLongAndBinaryLinesNeitherCrashNorHang) {
    SimulatedConsole const console("[runCmdOnPartition 3]\nstdout-file long.out\n");
    std::string const longText(60000, 'y');
    std::string const tooLongText(100000, 'z');
    QuorvexTest::writeFile(console.directory() + "/long.out",
                           "Rc::0::RetStr1::" + longText + "\n" + std::string("Rc::2\0junk\n", 11) +
                               "Rc::7::RetStr1::" + tooLongText + "\n");
    Base base = runBase();
    EXPECT_EQ(base.execute(""), 0);
    std::vector<ReturnCode> const& codes = base.get_ListOf_ReturnCodes();
    ASSERT_GE(codes.size(), 2u);
    ASSERT_LE(codes.size(), 3u);
    EXPECT_EQ(codes[0].get_Rc(), 0);
    EXPECT_EQ(codes[0].get_RetStr1(), longText);
    // The runner cuts a line at its first NUL byte.
    EXPECT_EQ(codes[1].get_Values(), (std::map<std::string, std::string>{{"Rc", "2"}}));
    if (codes.size() == 3u) {
        EXPECT_EQ(codes[2].get_Rc(), 7);
    }
}
