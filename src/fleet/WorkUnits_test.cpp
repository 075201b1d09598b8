#include "fleet/WorkUnits.h"

#include "fleet/FieldCodec.h"

#include <gtest/gtest.h>

namespace {

using fleet::encodeFields;

// A unit's result: the record of its trace piece's error, then its own.
std::string result(std::string const& records, std::string const& traceError = "0") {
    return encodeFields({traceError}) + records;
}
using Kind = Quorvex::PYLON::VPD::PartitionOutcomeKind;

TEST(WorkUnits, PartitionsAreRebuiltWithTheMachineAndEveryField) {
    std::string const text = result(encodeFields({"7", "", "3", "aurora", "Zeph", "7.2"}) +
                                    encodeFields({"7", "10.0.0.1", " 3x", "", "", ""}));
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
    EXPECT_FALSE(fleet::decodePartitions("A-1_B", result("6:1:7")).has_value());
    EXPECT_FALSE(fleet::decodePartitions("A-1_B", result(encodeFields({"7"}))).has_value());
    EXPECT_FALSE(fleet::decodePartitions("A-1_B", "").has_value()) << "no trace record";
}

TEST(WorkUnits, EmptyListingGivesNoPartitions) {
    auto const partitions = fleet::decodePartitions("A-1_B", result(""));
    ASSERT_TRUE(partitions.has_value());
    EXPECT_TRUE(partitions->empty());
}

TEST(WorkUnits, OutcomeFieldsAreReadBack) {
    std::string const text = result(encodeFields(
        {"VPD/f.VPD.xml", "8", "get result Failed, rc = 3", "4", "3", "0", "reason\n", "28"}));
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
    auto const outcome =
        fleet::decodeOutcome(result(encodeFields({"", "8", "x", "1", "", "", "", "0"})));
    ASSERT_TRUE(outcome.has_value());
    EXPECT_EQ(outcome->kind, Kind::Inactive);
    EXPECT_FALSE(outcome->rc.has_value());
    EXPECT_FALSE(outcome->rcCmd.has_value());
}

TEST(WorkUnits, OutcomeOfAChildThatDiedIsRejected) {
    EXPECT_FALSE(fleet::decodeOutcome("").has_value());
    EXPECT_FALSE(fleet::decodeOutcome(result(encodeFields({"a", "b"}))).has_value());
    EXPECT_FALSE(fleet::decodeOutcome(result(encodeFields({"", "8", "x", "9", "", "", "", "0"})))
                     .has_value());
    EXPECT_FALSE(
        fleet::decodeOutcome(encodeFields({"", "8", "x", "1", "", "", "", "0"})).has_value())
        << "no trace record";
}

TEST(WorkUnits, TraceErrorIsReadFromTheResult) {
    std::string const outcome = encodeFields({"", "8", "x", "1", "", "", "", "0"});
    EXPECT_EQ(fleet::decodeTraceError(result(outcome, "28")), 28);
    EXPECT_EQ(fleet::decodeTraceError(result(outcome)), 0);
    EXPECT_EQ(fleet::decodeTraceError(result("", "5")), 5) << "a listing's result";
    EXPECT_EQ(fleet::decodeTraceError("2:1:"), 0) << "cut short";
}

TEST(WorkUnits, MachineListIsOneRecordOfIdentities) {
    EXPECT_EQ(fleet::decodeMachines(encodeFields({"A-1_B", "C-2_D"})),
              (std::vector<std::string>{"A-1_B", "C-2_D"}));
    EXPECT_TRUE(fleet::decodeMachines("").empty());
}

} // namespace
