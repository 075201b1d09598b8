#include "fleet/WorkUnits.h"

#include "fleet/FieldCodec.h"

#include <gtest/gtest.h>

namespace {

using fleet::encodeFields;
using Kind = Quorvex::PYLON::VPD::PartitionOutcomeKind;

TEST(WorkUnits, PartitionsAreRebuiltWithTheMachineAndEveryField) {
    std::string const text = encodeFields({"7", "", "3", "aurora", "Zeph", "7.2"}) +
                             encodeFields({"7", "10.0.0.1", " 3x", "", "", ""});
    auto const partitions = fleet::decodePartitions("9119-MHE_21ABCDE", text);
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
    EXPECT_FALSE(fleet::decodePartitions("A-1_B", "6:1:7").has_value());
    EXPECT_FALSE(fleet::decodePartitions("A-1_B", encodeFields({"7"})).has_value());
}

TEST(WorkUnits, EmptyListingGivesNoPartitions) {
    auto const partitions = fleet::decodePartitions("A-1_B", "");
    ASSERT_TRUE(partitions.has_value());
    EXPECT_TRUE(partitions->empty());
}

TEST(WorkUnits, OutcomeFieldsAreReadBack) {
    std::string const text = encodeFields(
        {"VPD/f.VPD.xml", "8", "get result Failed, rc = 3", "4", "3", "0", "reason\n", "28"});
    auto const outcome = fleet::decodeOutcome(text);
    ASSERT_TRUE(outcome.has_value());
    EXPECT_EQ(outcome->fileName, "VPD/f.VPD.xml");
    EXPECT_EQ(outcome->returnCode, "8");
    EXPECT_EQ(outcome->statusText, "get result Failed, rc = 3");
    EXPECT_EQ(outcome->kind, Kind::FetchFailure);
    EXPECT_EQ(outcome->rc, 3);
    EXPECT_EQ(outcome->rcCmd, 0);
    EXPECT_EQ(outcome->reason, "reason\n");
    EXPECT_EQ(outcome->documentError, 28) << "the default document could not be written";
}

TEST(WorkUnits, MissingCodesStayUnknown) {
    auto const outcome = fleet::decodeOutcome(encodeFields({"", "8", "x", "1", "", "", "", "0"}));
    ASSERT_TRUE(outcome.has_value());
    EXPECT_EQ(outcome->kind, Kind::Inactive);
    EXPECT_FALSE(outcome->rc.has_value());
    EXPECT_FALSE(outcome->rcCmd.has_value());
}

TEST(WorkUnits, OutcomeOfAChildThatDiedIsRejected) {
    EXPECT_FALSE(fleet::decodeOutcome("").has_value());
    EXPECT_FALSE(fleet::decodeOutcome(encodeFields({"a", "b"})).has_value());
    EXPECT_FALSE(
        fleet::decodeOutcome(encodeFields({"", "8", "x", "9", "", "", "", "0"})).has_value());
}

TEST(WorkUnits, MachineListIsOneRecordOfIdentities) {
    EXPECT_EQ(fleet::decodeMachines(encodeFields({"A-1_B", "C-2_D"})),
              (std::vector<std::string>{"A-1_B", "C-2_D"}));
    EXPECT_TRUE(fleet::decodeMachines("").empty());
}

} // namespace
