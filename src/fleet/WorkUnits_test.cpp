#include "fleet/WorkUnits.h"

#include "fleet/FieldCodec.h"

#include <gtest/gtest.h>

namespace {

using Fleet::FieldCodec;
using Kind = Quorvex::PYLON::VPD::PartitionOutcomeKind;

TEST(WorkUnits, PartitionsAreRebuiltWithTheMachineAndEveryField) {
    std::string const text = FieldCodec::encode({"7", "", "3", "aurora", "Zeph", "7.2"}) +
                             FieldCodec::encode({"7", "10.0.0.1", " 3x", "", "", ""});
    auto const partitions = Fleet::decodePartitions("9119-MHE_21ABCDE", text);
    ASSERT_TRUE(partitions.has_value());
    ASSERT_EQ(partitions->size(), 2U);
    auto const& first = (*partitions)[0];
    EXPECT_EQ(std::string(first), "9119-MHE_21ABCDE-7");
    EXPECT_EQ(first.get_IP(), "");
    EXPECT_EQ(first.get_ActiveStatus(), "3");
    EXPECT_EQ(first.get_HostName(), "aurora");
    EXPECT_EQ(first.get_OperatingSystem_Name(), "Zeph");
    EXPECT_EQ(first.get_OperatingSystem_Version(), "7.2");
    EXPECT_EQ((*partitions)[1].get_ActiveStatus(), " 3x");
}

TEST(WorkUnits, ListingCutShortIsRejected) {
    EXPECT_FALSE(Fleet::decodePartitions("A-1_B", "6:1:7").has_value());
    EXPECT_FALSE(Fleet::decodePartitions("A-1_B", FieldCodec::encode({"7"})).has_value());
}

TEST(WorkUnits, EmptyListingGivesNoPartitions) {
    auto const partitions = Fleet::decodePartitions("A-1_B", "");
    ASSERT_TRUE(partitions.has_value());
    EXPECT_TRUE(partitions->empty());
}

TEST(WorkUnits, OutcomeFieldsAreReadBack) {
    std::string const text = FieldCodec::encode(
        {"VPD/f.VPD.xml", "8", "get result Failed, rc = 3", "4", "3", "0", "reason\n"});
    auto const outcome = Fleet::decodeOutcome(text);
    ASSERT_TRUE(outcome.has_value());
    EXPECT_EQ(outcome->fileName, "VPD/f.VPD.xml");
    EXPECT_EQ(outcome->returnCode, "8");
    EXPECT_EQ(outcome->statusText, "get result Failed, rc = 3");
    EXPECT_EQ(outcome->kind, Kind::FetchFailure);
    EXPECT_EQ(outcome->rc, 3);
    EXPECT_EQ(outcome->rcCmd, 0);
    EXPECT_EQ(outcome->reason, "reason\n");
}

TEST(WorkUnits, MissingCodesStayUnknown) {
    auto const outcome = Fleet::decodeOutcome(FieldCodec::encode({"", "8", "x", "1", "", "", ""}));
    ASSERT_TRUE(outcome.has_value());
    EXPECT_EQ(outcome->kind, Kind::Inactive);
    EXPECT_FALSE(outcome->rc.has_value());
    EXPECT_FALSE(outcome->rcCmd.has_value());
}

TEST(WorkUnits, OutcomeOfAChildThatDiedIsRejected) {
    EXPECT_FALSE(Fleet::decodeOutcome("").has_value());
    EXPECT_FALSE(Fleet::decodeOutcome(FieldCodec::encode({"a", "b"})).has_value());
    EXPECT_FALSE(
        Fleet::decodeOutcome(FieldCodec::encode({"", "8", "x", "9", "", "", ""})).has_value());
}

TEST(WorkUnits, MachineListIsOneRecordOfIdentities) {
    EXPECT_EQ(Fleet::decodeMachines(FieldCodec::encode({"A-1_B", "C-2_D"})),
              (std::vector<std::string>{"A-1_B", "C-2_D"}));
    EXPECT_TRUE(Fleet::decodeMachines("").empty());
}

} // namespace
