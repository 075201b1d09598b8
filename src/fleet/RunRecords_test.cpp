#include "fleet/RunRecords.h"

#include "system/MTMS.h"

#include <gtest/gtest.h>

#include <sys/wait.h>

#include <csignal>

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

TEST(RunRecords, PartitionStoppedByASignalReadsInterruptedWhateverFailureItsSurveyLeft) {
    PartitionRecord record;
    record.stop = ActionStop{report::RemoteAction::GetFile, 0.4, true};
    fleet::settlePartition(record,
                           surveyResult(Kind::FetchFailure, "8", "0et result Failed, rc = "));
    EXPECT_EQ(record.outcome, Outcome::Interrupted);
    EXPECT_EQ(record.result.statusText, "Interrupted - not surveyed");
    EXPECT_EQ(record.result.returnCode, "8");
}

// The action answered in full as the signal fell: the survey is complete.
TEST(RunRecords, SurveyThatEndedSurveyedDespiteASignalStopIsSurveyedWithNoStopKept) {
    PartitionRecord record;
    record.stop = ActionStop{report::RemoteAction::GetFile, 0.4, true};
    fleet::settlePartition(record, surveyResult(Kind::Surveyed, "0", "Ok"));
    EXPECT_EQ(record.outcome, Outcome::Surveyed);
    EXPECT_EQ(record.result.statusText, "Ok");
    EXPECT_EQ(record.result.returnCode, "0");
    EXPECT_EQ(record.stop.has_value(), false);
}

// The action answered right at the limit: never timed out beside Ok and code 0.
TEST(RunRecords, SurveyThatEndedSurveyedDespiteATimeLimitStopIsSurveyedWithNoStopKept) {
    PartitionRecord record;
    record.stop = ActionStop{report::RemoteAction::RunCommand, 1.0, false};
    fleet::settlePartition(record, surveyResult(Kind::Surveyed, "0", "Ok"));
    EXPECT_EQ(record.outcome, Outcome::Surveyed);
    EXPECT_EQ(record.result.statusText, "Ok");
    EXPECT_EQ(record.result.returnCode, "0");
    EXPECT_EQ(record.stop.has_value(), false);
}

TEST(RunRecords, WorkerKilledBySignalReadsWorkerDiedWithItsSignalInTheReason) {
    PartitionRecord record;
    record.partition.set_MTMS(Quorvex::System::MTMS("1234-ABC_10ABCDE"));
    record.partition.set_PartitionID("3");
    fleet::settlePartition(record, fleet::WorkerDeath{SIGKILL, 3.24});
    EXPECT_EQ(record.outcome, Outcome::WorkerDied);
    EXPECT_EQ(record.result.statusText, "Worker died - not surveyed");
    EXPECT_EQ(record.result.returnCode, "8");
    EXPECT_EQ(record.result.reason, "The survey's worker was killed by SIGKILL after 3.2 s.\n");
    EXPECT_EQ(record.result.fileName,
              "VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE-3.VPD.xml");
}

TEST(RunRecords, WorkerThatExitedWithoutAResultSaysItsExitStatus) {
    PartitionRecord record;
    fleet::settlePartition(record, fleet::WorkerDeath{1 << 8, 0.04});
    EXPECT_EQ(record.outcome, Outcome::WorkerDied);
    EXPECT_EQ(record.result.reason, "The survey's worker ended with exit status 1 after 0.0 s.\n");
}

TEST(RunRecords, WorkerKilledByASignalWithoutANameSaysItsNumber) {
    PartitionRecord record;
    fleet::settlePartition(record, fleet::WorkerDeath{SIGRTMIN + 5, 1.0});
    EXPECT_EQ(record.result.reason, "The survey's worker was killed by signal " +
                                        std::to_string(SIGRTMIN + 5) + " after 1.0 s.\n");
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
