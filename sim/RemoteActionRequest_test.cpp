#include "RemoteActionRequest.h"

#include <gtest/gtest.h>

using PylonSim::RemoteActionRequest;

namespace {

// The run-command call of a survey, as the shell hands it over: the double
// quotes are gone and the quoted options stay one word.
std::vector<std::string> const& _runCommandArguments() {
    static std::vector<std::string> const arguments{
        "-c",
        "ZOR.ServiceEvent::::runCmdOnPartition::CallerID::0::CecMT::1234-ABC::CecMS::10ABCDE::"
        "PartitionId::2::CmdID::0::CmdOpts:: -v  -of 1234-ABC_10ABCDE-2.VPD.xml -c "
        "1234-ABC_10ABCDE "
        "-pylonv 4.0.11::RemoteFN::1234-ABC_10ABCDE-2.QuorvexOutput::RemoteFileInfo::"
        "FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=system"};
    return arguments;
}

} // namespace

TEST(RemoteActionRequest, RunCommandCallGivesActionAndPartition) {
    RemoteActionRequest const request(_runCommandArguments());
    EXPECT_EQ("runCmdOnPartition", request.get_Action());
    EXPECT_EQ("2", request.get_PartitionID());
    EXPECT_FALSE(request.has_LocalFN());
}

TEST(RemoteActionRequest, GetFileCallGivesTheLocalFileName) {
    RemoteActionRequest const request(
        {"-c",
         "ZOR.ServiceEvent::::getFileFromPartition::CallerID::0::CecMT::1234-ABC::CecMS::10ABCDE::"
         "PartitionId::3::RemoteFN::1234-ABC_10ABCDE-3.VPD.xml::LocalFN::"
         "VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE-3.VPD.xml::"
         "LocalFileInfo::FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=pylon"});
    EXPECT_EQ("getFileFromPartition", request.get_Action());
    EXPECT_EQ("3", request.get_PartitionID());
    ASSERT_TRUE(request.has_LocalFN());
    EXPECT_EQ("VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE-3.VPD.xml",
              request.get_LocalFN());
}

TEST(RemoteActionRequest, PartitionArrayLosesItsBraces) {
    RemoteActionRequest const request(
        {"-c",
         "ZOR.ServiceEvent::::putFileToPartition::CallerID::0::CecMT::1234-ABC::CecMS::10ABCDE::"
         "PartitionArray::{3}::LocalFN::/tmp/quorvex.tar::RemoteFN::/tmp/quorvex.tar"});
    EXPECT_EQ("putFileToPartition", request.get_Action());
    EXPECT_EQ("3", request.get_PartitionID());
    EXPECT_EQ("/tmp/quorvex.tar", request.get_LocalFN());
}

TEST(RemoteActionRequest, PartitionArrayWithoutBracesIsTakenAsItIs) {
    EXPECT_EQ("3",
              RemoteActionRequest({"ZOR.ServiceEvent::::x::PartitionArray::3"}).get_PartitionID());
    EXPECT_EQ(
        "{3",
        RemoteActionRequest({"ZOR.ServiceEvent::::x::PartitionArray::{{3"}).get_PartitionID());
}

TEST(RemoteActionRequest, PartitionIdWinsOverPartitionArray) {
    RemoteActionRequest const request(
        {"ZOR.ServiceEvent::::a::PartitionArray::{4}::PartitionId::5"});
    EXPECT_EQ("5", request.get_PartitionID());
}

TEST(RemoteActionRequest, WordsSplitByTheShellAreJoinedWithOneBlank) {
    RemoteActionRequest const request({"-c",
                                       "ZOR.ServiceEvent::::runCmdOnPartition::PartitionId::7",
                                       "7::CmdOpts::", "-v", "::LocalFN::a", "b"});
    EXPECT_EQ("runCmdOnPartition", request.get_Action());
    EXPECT_EQ("7 7", request.get_PartitionID());
    EXPECT_EQ("a b", request.get_LocalFN());
}

TEST(RemoteActionRequest, MissingClassNameGivesNoAction) {
    EXPECT_EQ("", RemoteActionRequest({"-c", "runCmdOnPartition::PartitionId::2"}).get_Action());
    EXPECT_EQ("", RemoteActionRequest({}).get_Action());
}

TEST(RemoteActionRequest, ActionRunsToTheEndWhenNothingFollows) {
    EXPECT_EQ("getFileFromPartition",
              RemoteActionRequest({"-c", "ZOR.ServiceEvent::::getFileFromPartition"}).get_Action());
    EXPECT_EQ("", RemoteActionRequest({"-c", "ZOR.ServiceEvent::::"}).get_Action());
}

TEST(RemoteActionRequest, NoPartitionMeansTheDefaultSection) {
    EXPECT_EQ("*", RemoteActionRequest({"-c", "ZOR.ServiceEvent::::runCmdOnPartition::CallerID::0"})
                       .get_PartitionID());
}

TEST(RemoteActionRequest, EmptyValuesAreKept) {
    RemoteActionRequest const request(
        {"ZOR.ServiceEvent::::getFileFromPartition::PartitionId::::LocalFN::"});
    EXPECT_EQ("", request.get_PartitionID());
    ASSERT_TRUE(request.has_LocalFN());
    EXPECT_EQ("", request.get_LocalFN());
}

TEST(RemoteActionRequest, ValueEndsAtTheNextDoubleColon) {
    RemoteActionRequest const request(
        {"ZOR.ServiceEvent::::getFileFromPartition::PartitionId::2::3::LocalFN::a::b"});
    EXPECT_EQ("2", request.get_PartitionID());
    EXPECT_EQ("a", request.get_LocalFN());
}

TEST(RemoteActionRequest, KeyMustStandBetweenSeparators) {
    RemoteActionRequest const request(
        {"ZOR.ServiceEvent::::getFileFromPartition::XPartitionId::2::MyLocalFN::f"});
    EXPECT_EQ("*", request.get_PartitionID());
    EXPECT_FALSE(request.has_LocalFN());
}

TEST(RemoteActionRequest, HostileTextNeverThrows) {
    std::string const huge(200000, ':');
    EXPECT_NO_THROW(
        RemoteActionRequest({huge, "\"", "{", "}", "::PartitionArray::", "::LocalFN::"}));
    EXPECT_NO_THROW(RemoteActionRequest({"ZOR.ServiceEvent::::", "::PartitionArray::{"}));
    EXPECT_EQ("",
              RemoteActionRequest({"ZOR.ServiceEvent::::x::PartitionArray::{"}).get_PartitionID());
    EXPECT_EQ("",
              RemoteActionRequest({"ZOR.ServiceEvent::::x::PartitionArray::}"}).get_PartitionID());
}
