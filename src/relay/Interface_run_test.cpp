// The three remote operations run against the simulated console: the exact
// text each sends, how each addresses the partition, and the one Base they
// share inside an Interface.

#include "relay/Interface.h"

#include "relay/RELAY_Utility.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

using Quorvex::RELAY::FileInfo;
using Quorvex::RELAY::GetFileFromPartition;
using Quorvex::RELAY::Interface;
using Quorvex::RELAY::PutFileToPartition;
using Quorvex::RELAY::ReturnCode;
using Quorvex::RELAY::RunCommandOnPartition;
using Quorvex::RELAY::TargetPartition;
using QuorvexTest::examplePartition;
using QuorvexTest::expectedTraceBlock;
using QuorvexTest::Invocation;
using QuorvexTest::SimulatedConsole;

using Interface_Run = QuorvexTest::TracedTest;

namespace {

std::string const gc_DoneLine = "Rc::0::RcCmd::0::RetStr1::done::RetStr2::";

// Every action on every partition answers "done".
std::string const gc_AllDone = "[putFileToPartition *]\nstdout " + gc_DoneLine +
                               "\n[runCmdOnPartition *]\nstdout " + gc_DoneLine +
                               "\n[getFileFromPartition *]\nstdout " + gc_DoneLine + "\n";

std::string const gc_Machine = R"(CecMT::"1234-ABC"::CecMS::"10ABCDE"::)";
std::string const gc_ClientAttributes = "FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=system";

TargetPartition testTarget() {
    return TargetPartition(examplePartition());
}

// The argument runact-api received for its action text ("-c" is the first).
std::string actionArgument(SimulatedConsole const& console, std::size_t call) {
    std::vector<Invocation> const calls = console.invocations();
    return call < calls.size() && calls[call].size() == 3 ? calls[call][2] : "<no such call>";
}

// The CmdOpts text the console received for the client survey on partition 3.
std::string receivedClientOptions(SimulatedConsole const& console) {
    std::string const argument = actionArgument(console, 0);
    std::string::size_type const start = argument.find("::CmdOpts::");
    std::string::size_type const end = argument.find("::RemoteFN::");
    return start == std::string::npos || end == std::string::npos
               ? "<no options>"
               : argument.substr(start + 11, end - start - 11);
}

// Runs the client survey on partition 3 with the given options and returns
// the CmdOpts text the console received.
std::string clientOptionsSentFor(std::string const& options) {
    SimulatedConsole const console(gc_AllDone);
    Interface iface{testTarget()};
    iface.execute_PartitionQuorvex(options, "/tmp/quorvex.out");
    return receivedClientOptions(console);
}

} // namespace

TEST_F(Interface_Run, PutSendsItsParameterTextByteForByte) {
    SimulatedConsole const console(gc_AllDone);
    Interface iface{testTarget()};
    EXPECT_EQ(iface.putFileToPartition("/tmp/quorvex.tar"), 0);
    EXPECT_EQ(
        _trace.text(),
        expectedTraceBlock("/usr/bin/runact-api -c ZOR.ServiceEvent::::putFileToPartition::"
                           "CallerID::0::" +
                               gc_Machine +
                               "PartitionArray::{\"3\"}::"
                               "LocalFN::\"/tmp/quorvex.tar\"::RemoteFN::\"/tmp/quorvex.tar\"::"
                               "RemoteFileInfo::\"" +
                               gc_ClientAttributes + "\"",
                           0, gc_DoneLine + "\n\n", "\n"));
    EXPECT_EQ(
        actionArgument(console, 0),
        "ZOR.ServiceEvent::::putFileToPartition::CallerID::0::CecMT::1234-ABC::CecMS::10ABCDE::"
        "PartitionArray::{3}::LocalFN::/tmp/quorvex.tar::RemoteFN::/tmp/quorvex.tar::"
        "RemoteFileInfo::" +
            gc_ClientAttributes);
}

TEST_F(Interface_Run, ClientSurveySendsItsParameterTextByteForByte) {
    SimulatedConsole const console(gc_AllDone);
    Interface iface{testTarget()};
    EXPECT_EQ(iface.execute_PartitionQuorvex("", "/tmp/quorvex.out"), 0);
    EXPECT_EQ(_trace.text(),
              expectedTraceBlock("/usr/bin/runact-api -c ZOR.ServiceEvent::::runCmdOnPartition::"
                                 "CallerID::0::" +
                                     gc_Machine +
                                     "PartitionId::\"3\"::"
                                     "CmdID::0::CmdOpts::\" -c 1234-ABC_10ABCDE -pylonv 4.0.11\"::"
                                     "RemoteFN::\"/tmp/quorvex.out\"::"
                                     "RemoteFileInfo::\"" +
                                     gc_ClientAttributes + "\"",
                                 0, gc_DoneLine + "\n\n", "\n"));
    EXPECT_EQ(
        console.invocations(),
        (std::vector<Invocation>{
            {"runact-api", "-c",
             "ZOR.ServiceEvent::::runCmdOnPartition::CallerID::0::CecMT::1234-ABC::CecMS::10ABCDE::"
             "PartitionId::3::CmdID::0::CmdOpts:: -c 1234-ABC_10ABCDE -pylonv 4.0.11::"
             "RemoteFN::/tmp/quorvex.out::RemoteFileInfo::" +
                 gc_ClientAttributes}}));
}

TEST_F(Interface_Run, GetSendsItsParameterTextByteForByte) {
    SimulatedConsole const console(gc_AllDone);
    Interface iface{testTarget()};
    EXPECT_EQ(iface.getFileFromPartition("/tmp/quorvex.out", "/var/tmp/p3.out"), 0);
    EXPECT_EQ(_trace.text(),
              expectedTraceBlock(
                  "/usr/bin/runact-api -c ZOR.ServiceEvent::::getFileFromPartition::"
                  "CallerID::0::" +
                      gc_Machine +
                      "PartitionId::\"3\"::"
                      "RemoteFN::\"/tmp/quorvex.out\"::LocalFN::\"/var/tmp/p3.out\"::"
                      "LocalFileInfo::\"FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=pylon\"",
                  0, gc_DoneLine + "\n\n", "\n"));
    EXPECT_EQ(
        actionArgument(console, 0),
        "ZOR.ServiceEvent::::getFileFromPartition::CallerID::0::CecMT::1234-ABC::CecMS::10ABCDE::"
        "PartitionId::3::RemoteFN::/tmp/quorvex.out::LocalFN::/var/tmp/p3.out::"
        "LocalFileInfo::FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=pylon");
}

TEST_F(Interface_Run, GetWithOneNameUsesItOnBothSides) {
    SimulatedConsole const console(gc_AllDone);
    Interface iface{testTarget()};
    EXPECT_EQ(iface.getFileFromPartition("p3.VPD.xml"), 0);
    EXPECT_EQ(
        actionArgument(console, 0),
        "ZOR.ServiceEvent::::getFileFromPartition::CallerID::0::CecMT::1234-ABC::CecMS::10ABCDE::"
        "PartitionId::3::RemoteFN::p3.VPD.xml::LocalFN::p3.VPD.xml::"
        "LocalFileInfo::FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=pylon");
}

TEST_F(Interface_Run, FetchedDocumentLandsWhereTheConsolePutsIt) {
    SimulatedConsole const console("[getFileFromPartition 3]\nstdout " + gc_DoneLine +
                                   "\ndocument-nolf <VPD/>\n");
    Interface iface{testTarget()};
    EXPECT_EQ(iface.getFileFromPartition("p3.VPD.xml", "VPD/p3.VPD.xml"), 0);
    EXPECT_EQ(QuorvexTest::readFile("/var/adm/quorvex/VPD/p3.VPD.xml"), "<VPD/>");
    EXPECT_EQ(iface.get_ReturnCode().get_Rc(), 0);
}

TEST_F(Interface_Run, ClientOptionsNamingTheMachineGetOnlyTheVersion) {
    EXPECT_EQ(clientOptionsSentFor("-c X"), "-c X -pylonv 4.0.11");
    EXPECT_NE(_trace.text().find("::CmdOpts::\"-c X -pylonv 4.0.11\"::"), std::string::npos);
}

TEST_F(Interface_Run, ClientOptionsNamingTheVersionGetOnlyTheMachine) {
    EXPECT_EQ(clientOptionsSentFor("-pylonv 5"), "-pylonv 5 -c 1234-ABC_10ABCDE");
    EXPECT_NE(_trace.text().find("::CmdOpts::\"-pylonv 5 -c 1234-ABC_10ABCDE\"::"),
              std::string::npos);
}

TEST_F(Interface_Run, ClientOptionsWithMinusCInsideAWordGetNoMachine) {
    EXPECT_EQ(clientOptionsSentFor("-cfg /etc/q.cfg"), "-cfg /etc/q.cfg -pylonv 4.0.11");
}

TEST_F(Interface_Run, ClientOptionsNamingBothAreLeftAlone) {
    EXPECT_EQ(clientOptionsSentFor("-pylonv 5 -c Y"), "-pylonv 5 -c Y");
}

TEST_F(Interface_Run, RunWithMinusOneAndEmptyOptionsWritesThemAsTheyAre) {
    SimulatedConsole const console(gc_AllDone);
    Interface iface{testTarget()};
    FileInfo info("/tmp/r.out", "", "", "");
    Quorvex::RELAY::RELAY_Utility::set_Default_Client_FileInfo(info);
    EXPECT_EQ(iface.runCommandOnPartition(-1, "", info), 0);
    EXPECT_EQ(_trace.text(),
              expectedTraceBlock("/usr/bin/runact-api -c ZOR.ServiceEvent::::runCmdOnPartition::"
                                 "CallerID::0::" +
                                     gc_Machine +
                                     "PartitionId::\"3\"::"
                                     "CmdID::-1::CmdOpts::\"\"::RemoteFN::\"/tmp/r.out\"::"
                                     "RemoteFileInfo::\"" +
                                     gc_ClientAttributes + "\"",
                                 0, gc_DoneLine + "\n\n", "\n"));
    EXPECT_EQ(
        actionArgument(console, 0),
        "ZOR.ServiceEvent::::runCmdOnPartition::CallerID::0::CecMT::1234-ABC::CecMS::10ABCDE::"
        "PartitionId::3::CmdID::-1::CmdOpts::::RemoteFN::/tmp/r.out::RemoteFileInfo::" +
            gc_ClientAttributes);
}

TEST_F(Interface_Run, PutThenGetAddressesByArrayThenByIdentifier) {
    SimulatedConsole const console(gc_AllDone);
    Interface iface{testTarget()};
    iface.putFileToPartition("/tmp/quorvex.tar");
    iface.getFileFromPartition("/tmp/quorvex.out");
    EXPECT_NE(actionArgument(console, 0).find("::CecMS::10ABCDE::PartitionArray::{3}::LocalFN::"),
              std::string::npos);
    EXPECT_NE(actionArgument(console, 1).find("::CecMS::10ABCDE::PartitionId::3::RemoteFN::"),
              std::string::npos);
    EXPECT_EQ(console.invocations().size(), 2u);
}

TEST_F(Interface_Run, OperationsShareTheActionTargetModeAndReturnCodes) {
    SimulatedConsole const console(
        "[putFileToPartition 3]\nstdout Rc::0::RetStr1::put\n"
        "[runCmdOnPartition 3]\nstdout Rc::1::RcCmd::0::RetStr1::timeout\nexit 1\n"
        "[getFileFromPartition 3]\nstdout Rc::0::RetStr1::got\nstdout Rc::9\n");
    Interface iface{testTarget()};
    PutFileToPartition& put = iface;
    RunCommandOnPartition& run = iface;
    GetFileFromPartition& get = iface;
    std::string const prefix = "/usr/bin/runact-api -c ZOR.ServiceEvent::::";

    EXPECT_EQ(put.putFileToPartition("/tmp/quorvex.tar"), 0);
    // Before the run operation runs, it sees what the put left behind.
    EXPECT_EQ(run.createString_Command(), prefix + "putFileToPartition::CallerID::0::" +
                                              gc_Machine + "PartitionArray::{\"3\"}");
    // cppcheck-suppress knownConditionTrueFalse ; the operations share one virtual base
    EXPECT_EQ(&run.get_ReturnCode(), &put.get_ReturnCode());
    EXPECT_EQ(get.get_ReturnCode().get_RetStr1(), "put");
    EXPECT_EQ(get.get_Output(), (std::vector<std::string>{"Rc::0::RetStr1::put", ""}));
    ReturnCode const putCode = iface.get_ReturnCode();

    EXPECT_EQ(run.execute_PartitionQuorvex("", "/tmp/quorvex.out"), 1);
    EXPECT_EQ(get.createString_Command(),
              prefix + "runCmdOnPartition::CallerID::0::" + gc_Machine + "PartitionId::\"3\"");
    EXPECT_EQ(put.get_ReturnCode().get_RetStr1(), "timeout");
    EXPECT_TRUE(put.get_Output().empty());
    ReturnCode const runCode = iface.get_ReturnCode();

    EXPECT_EQ(get.getFileFromPartition("/tmp/quorvex.out"), 0);
    EXPECT_EQ(put.createString_Command(),
              prefix + "getFileFromPartition::CallerID::0::" + gc_Machine + "PartitionId::\"3\"");
    EXPECT_EQ(run.get_ListOf_ReturnCodes().size(), 2u);
    EXPECT_EQ(run.get_ReturnCode().get_RetStr1(), "got");

    // The copies taken after each operation keep that operation's codes.
    EXPECT_EQ(putCode.get_RetStr1(), "put");
    EXPECT_EQ(runCode.get_Rc(), 1);
    EXPECT_EQ(runCode.get_RcCmd(), 0);
    EXPECT_EQ(console.invocations().size(), 3u);
}

TEST_F(Interface_Run, InterfaceSendsTheMachineItWasGiven) {
    SimulatedConsole const console(gc_AllDone);
    Interface iface{testTarget()};
    iface.execute_PartitionQuorvex("", "/tmp/quorvex.out");
    EXPECT_EQ(actionArgument(console, 0)
                  .rfind("ZOR.ServiceEvent::::runCmdOnPartition::CallerID::0::CecMT::1234-ABC::"
                         "CecMS::10ABCDE::"
                         "PartitionId::3::",
                         0),
              0u);
    EXPECT_EQ(receivedClientOptions(console), " -c 1234-ABC_10ABCDE -pylonv 4.0.11");
}

TEST_F(Interface_Run, EachOperationStandingAloneSendsTheMachineItWasGiven) {
    SimulatedConsole const console(gc_AllDone);
    RunCommandOnPartition run(testTarget());
    PutFileToPartition put(testTarget());
    GetFileFromPartition get(testTarget());
    run.execute_PartitionQuorvex("", "/tmp/quorvex.out");
    put.putFileToPartition("/tmp/quorvex.tar");
    get.getFileFromPartition("/tmp/quorvex.out");
    EXPECT_EQ(receivedClientOptions(console), " -c 1234-ABC_10ABCDE -pylonv 4.0.11");
    for (std::size_t call = 0; call < 3; ++call) {
        EXPECT_NE(
            actionArgument(console, call).find("::CecMT::1234-ABC::CecMS::10ABCDE::Partition"),
            std::string::npos)
            << call;
    }
}

TEST_F(Interface_Run, ValueWithQuotesAndDoubleColonsIsPassedUnescaped) {
    SimulatedConsole const console(gc_AllDone);
    Interface iface{testTarget()};
    EXPECT_EQ(iface.getFileFromPartition("/tmp/a\"b::c\"d", "p3.out"), 0);
    EXPECT_NE(_trace.text().find("::RemoteFN::\"/tmp/a\"b::c\"d\"::LocalFN::\"p3.out\"::"),
              std::string::npos);
    // The shell took the quotes as its own: the console sees the text without them.
    EXPECT_NE(actionArgument(console, 0).find("::RemoteFN::/tmp/ab::cd::LocalFN::p3.out::"),
              std::string::npos);
}

TEST_F(Interface_Run, LoneDoubleQuoteBreaksTheShellLineWithoutACrash) {
    SimulatedConsole const console(gc_AllDone);
    Interface iface{testTarget()};
    int const exitCode = iface.getFileFromPartition("/tmp/a\"b", "p3.out");
    EXPECT_EQ(exitCode, 2);
    EXPECT_TRUE(console.invocations().empty());
    EXPECT_TRUE(iface.get_Output().empty());
    EXPECT_EQ(iface.get_ReturnCode().get_Rc(), -1);
    EXPECT_NE(_trace.text().find("::RemoteFN::\"/tmp/a\"b\"::LocalFN::\"p3.out\"::"),
              std::string::npos);
}
