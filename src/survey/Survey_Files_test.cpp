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
