#include "relay/RELAY_Utility.h"

#include "relay/FileInfo.h"

#include <gtest/gtest.h>

#include <climits>
#include <string>

using Quorvex::RELAY::FileInfo;
using Quorvex::RELAY::RELAY_Utility;

TEST(RELAY_Utility, NumberParameterIsDecimalWithoutQuotes) {
    EXPECT_EQ(RELAY_Utility::create_Parameter("CmdID", 5L), "CmdID::5");
}

TEST(RELAY_Utility, NegativeNumberParameterKeepsItsSign) {
    EXPECT_EQ(RELAY_Utility::create_Parameter("CmdID", -1L), "CmdID::-1");
}

TEST(RELAY_Utility, LiteralIntegerPicksTheNumberForm) {
    EXPECT_EQ(RELAY_Utility::create_Parameter("CmdID", 5), "CmdID::5");
    EXPECT_EQ(RELAY_Utility::create_Parameter("CmdID", -1), "CmdID::-1");
    EXPECT_EQ(RELAY_Utility::create_Parameter("CmdID", 0), "CmdID::0");
}

TEST(RELAY_Utility, NumberParameterCoversTheWholeRangeOfLong) {
    EXPECT_EQ(RELAY_Utility::create_Parameter("N", LONG_MAX), "N::9223372036854775807");
    EXPECT_EQ(RELAY_Utility::create_Parameter("N", LONG_MIN), "N::-9223372036854775808");
}

TEST(RELAY_Utility, EmptyTextParameterGivesEmptyQuotes) {
    EXPECT_EQ(RELAY_Utility::create_Parameter("LocalFN", ""), "LocalFN::\"\"");
}

TEST(RELAY_Utility, TextParameterIsQuoted) {
    EXPECT_EQ(RELAY_Utility::create_Parameter("CecMT", "1234-ABC"), "CecMT::\"1234-ABC\"");
}

TEST(RELAY_Utility, TextWithQuoteAndDoubleColonIsWrittenUnescaped) {
    EXPECT_EQ(RELAY_Utility::create_Parameter("RemoteFN", "a\"b::c"), "RemoteFN::\"a\"b::c\"");
}

TEST(RELAY_Utility, AppendedParametersFollowTheTextAlreadyThere) {
    std::string text = "a::";
    RELAY_Utility::append_Parameter(text, "CmdOpts", "x\"::y");
    text += "::";
    RELAY_Utility::append_Parameter(text, "CmdID", LONG_MIN);
    EXPECT_EQ(text, "a::CmdOpts::\"x\"::y\"::CmdID::-9223372036854775808");
}

TEST(RELAY_Utility, AppendedParameterIsTheCreatedOne) {
    std::string text;
    RELAY_Utility::append_Parameter(text, "LocalFN", "");
    EXPECT_EQ(text, RELAY_Utility::create_Parameter("LocalFN", ""));
}

TEST(RELAY_Utility, ConsoleDefaultsAreQuorvexPylon660AndKeepTheFileName) {
    FileInfo info("/var/tmp/p3.out", "", "", "");
    RELAY_Utility::set_Default_PYLON_FileInfo(info);
    EXPECT_EQ(info.get_FileName(), "/var/tmp/p3.out");
    EXPECT_EQ(info.get_FileOwner(), "quorvex");
    EXPECT_EQ(info.get_FileGroup(), "pylon");
    EXPECT_EQ(info.get_FilePermission(), "660");
}

TEST(RELAY_Utility, ClientDefaultsSetTwiceKeepTheSameValuesAndTheFileName) {
    FileInfo info;
    info.set_FileName("/tmp/quorvex.out");
    RELAY_Utility::set_Default_Client_FileInfo(info);
    FileInfo const once = info;
    RELAY_Utility::set_Default_Client_FileInfo(info);
    EXPECT_EQ(info.get_FileName(), "/tmp/quorvex.out");
    EXPECT_EQ(info.get_FileOwner(), "quorvex");
    EXPECT_EQ(info.get_FileGroup(), "system");
    EXPECT_EQ(info.get_FilePermission(), "660");
    EXPECT_EQ(info.get_FileInfoString(), once.get_FileInfoString());
}

TEST(RELAY_Utility, DefaultsReplaceEarlierAttributes) {
    FileInfo info("f", "root", "wheel", "777");
    RELAY_Utility::set_Default_Client_FileInfo(info);
    EXPECT_EQ(info.get_FileInfoString(), "FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=system");
}
