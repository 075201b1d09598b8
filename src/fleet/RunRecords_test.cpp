#include "fleet/RunRecords.h"

#include <gtest/gtest.h>

using fleet::ActionStop;
using fleet::PartitionRecord;
using report::Outcome;
using Kind = Quorvex::PYLON::VPD::PartitionOutcomeKind;

namespace {

Quorvex::PYLON::VPD::PartitionOutcome surveyResult(Kind kind, std::string const& code,
                                                   std::string const& status) {
    Quorvex::PYLON::VPD::PartitionOutcome result;
    result.kind = kind;
    result.returnCode = code;
    result.statusText = status;
    return result;
}

} // namespace

TEST(RunRecords, UnstoppedPartitionTakesItsSurveysOutcome) {
    PartitionRecord record;
    EXPECT_EQ(record.outcome, std::nullopt);
    fleet::settlePartition(record,
                           surveyResult(Kind::FetchFailure, "8", "2et result Failed, rc = "));
    EXPECT_EQ(record.outcome, Outcome::FetchFailure);
    EXPECT_EQ(record.result.statusText, "2et result Failed, rc = ");
}

TEST(RunRecords, PartitionStoppedByTheTimeLimitKeepsItsStatusTextAndIsTimedOut) {
    PartitionRecord record;
    record.stop = ActionStop{report::RemoteAction::RunCommand, 2.04, false};
    fleet::settlePartition(record,
                           surveyResult(Kind::ClientFailure, "8", "Partition Failed, RcCmd = 9"));
    EXPECT_EQ(record.outcome, Outcome::TimedOut);
    EXPECT_EQ(record.result.statusText, "Partition Failed, RcCmd = 9");
    EXPECT_EQ(record.result.returnCode, "8");
}

TEST(RunRecords, PartitionStoppedByASignalReadsInterruptedWhateverItsSurveyLeft) {
    PartitionRecord record;
    record.stop = ActionStop{report::RemoteAction::GetFile, 0.4, true};
    fleet::settlePartition(record, surveyResult(Kind::Surveyed, "0", "Ok"));
    EXPECT_EQ(record.outcome, Outcome::Interrupted);
    EXPECT_EQ(record.result.statusText, "Interrupted - not surveyed");
    EXPECT_EQ(record.result.returnCode, "8");
}

TEST(RunRecords, UnfinishedPartitionIsInterruptedWithCodeEight) {
    PartitionRecord record;
    fleet::settleUnfinished(record);
    EXPECT_EQ(record.outcome, Outcome::Interrupted);
    EXPECT_EQ(record.result.statusText, "Interrupted - not surveyed");
    EXPECT_EQ(record.result.returnCode, "8");
}

TEST(RunRecords, InterruptedRunSettlesOnlyThePartitionsThatHadNotEnded) {
    std::vector<fleet::MachineRecord> machines(2);
    machines[0].partitions.resize(2);
    machines[1].partitions.resize(1);
    fleet::settlePartition(machines[0].partitions[0], surveyResult(Kind::Surveyed, "0", "Ok"));
    fleet::settleUnfinished(machines);
    EXPECT_EQ(machines[0].partitions[0].outcome, Outcome::Surveyed);
    EXPECT_EQ(machines[0].partitions[0].result.statusText, "Ok");
    EXPECT_EQ(machines[0].partitions[1].outcome, Outcome::Interrupted);
    EXPECT_EQ(machines[1].partitions[0].outcome, Outcome::Interrupted);
    EXPECT_EQ(machines[1].partitions[0].result.returnCode, "8");
}
