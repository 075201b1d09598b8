#include "survey/Survey_Files.h"

#include <gtest/gtest.h>

// The names are part of what the console's scripts and importers read: each
// is pinned byte for byte.

namespace VPD = Quorvex::PYLON::VPD;

TEST(Survey_Files, TraceFileIsInTheTraceFolderNamedAfterTheTool) {
    EXPECT_EQ(VPD::get_TraceFileName(),
              "/var/adm/quorvex/Trace/quorvexPYLON_VPD_Survey_ClientPartition.Trace");
}

TEST(Survey_Files, MachineTraceIsTheRunTraceNamedAfterTheIdentityAsGiven) {
    EXPECT_EQ(VPD::get_MachineTraceFileName("1234-ABC_10ABCDE"),
              "/var/adm/quorvex/Trace/"
              "quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE.Trace");
}

TEST(Survey_Files, StatusFileIsInTheVPDFolderNamedAfterTheIdentityAsGiven) {
    EXPECT_EQ(
        VPD::get_StatusFileName("1234-ABC_10ABCDE"),
        "/var/adm/quorvex/VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE.status");
    EXPECT_EQ(VPD::get_StatusFileName("a b;c"),
              "/var/adm/quorvex/VPD/quorvexPYLON_VPD_Survey_ClientPartition_a b;c.status");
}

TEST(Survey_Files, LocalResultNameIsRelativeToTheConsoleFolder) {
    EXPECT_EQ(VPD::get_LocalResultName("1234-ABC_10ABCDE-3"),
              "VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE-3.VPD.xml");
}

TEST(Survey_Files, LocalResultPathPutsTheNameUnderTheConsoleFolder) {
    EXPECT_EQ(VPD::get_LocalResultPath(VPD::get_LocalResultName("1234-ABC_10ABCDE-3")),
              "/var/adm/quorvex/VPD/"
              "quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE-3.VPD.xml");
}

TEST(Survey_Files, PartitionSideNamesAreThePartitionTextWithTheirSuffixes) {
    EXPECT_EQ(VPD::get_RemoteResultName("1234-ABC_10ABCDE-3"), "1234-ABC_10ABCDE-3.VPD.xml");
    EXPECT_EQ(VPD::get_ClientOutputName("1234-ABC_10ABCDE-3"), "1234-ABC_10ABCDE-3.QuorvexOutput");
}

TEST(Survey_Files, MachineTraceNameIsTheMachineTraceRelativeToTheConsoleFolder) {
    EXPECT_EQ(VPD::get_MachineTraceName("1234-ABC_10ABCDE"),
              "Trace/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE.Trace");
    EXPECT_EQ("/var/adm/quorvex/" + VPD::get_MachineTraceName("1234-ABC_10ABCDE"),
              VPD::get_MachineTraceFileName("1234-ABC_10ABCDE"));
}

namespace {

// The name as a folder listing gives it: the part after the last "/".
std::string u_listed_Name(std::string const& path) {
    return path.substr(path.rfind('/') + 1);
}

} // namespace

TEST(Survey_Files, IdentityOfAStatusFileNameIsTheIdentityItWasBuiltFrom) {
    for (std::string const identity : {"1234-ABC_10ABCDE", "a b;c", "", "x.status"}) {
        EXPECT_EQ(
            VPD::get_IdentityOfStatusFileName(u_listed_Name(VPD::get_StatusFileName(identity))),
            identity);
    }
}

TEST(Survey_Files, NamesThatNoStatusFileHasGiveNoIdentity) {
    for (std::string const name :
         {"notes.txt", "quorvexPYLON_VPD_Survey_ClientPartition_1-A_S.VPD.xml",
          "quorvexPYLON_VPD_Survey_ClientPartition.status", "other_1-A_S.status",
          "quorvexPYLON_VPD_Survey_ClientPartition_1-A_S.status.tmp",
          "/var/adm/quorvex/VPD/quorvexPYLON_VPD_Survey_ClientPartition_1-A_S.status"}) {
        EXPECT_EQ(VPD::get_IdentityOfStatusFileName(name), std::nullopt) << name;
    }
}

TEST(Survey_Files, PartitionTextOfAResultNameIsThePartitionTextItWasBuiltFrom) {
    for (std::string const text : {"1234-ABC_10ABCDE-3", "a b;c-x", "-"}) {
        EXPECT_EQ(VPD::get_PartitionTextOfResultName(u_listed_Name(VPD::get_LocalResultName(text))),
                  text);
    }
}

TEST(Survey_Files, NamesThatNoResultHasGiveNoPartitionText) {
    for (std::string const name :
         {"notes.txt", "quorvexPYLON_VPD_Survey_ClientPartition_1-A_S.status",
          "1234-ABC_10ABCDE-3.VPD.xml", "quorvexPYLON_VPD_Survey_ClientPartition_1-A_S-1.VPD.xml~",
          "VPD/quorvexPYLON_VPD_Survey_ClientPartition_1-A_S-1.VPD.xml"}) {
        EXPECT_EQ(VPD::get_PartitionTextOfResultName(name), std::nullopt) << name;
    }
}
