#include "fleet/Recap.h"

#include <gtest/gtest.h>

namespace {

using fleet::MachineRecord;
using fleet::PartitionRecord;
using fleet::Recap;
using fleet::RecapEnding;
using report::Outcome;

constexpr char gc_ClientRunFailure[] = "Partition not surveyed, reason: \nRELAY Failed.\n"
                                       "\n[     Rc] = 1\n[  RcCmd] = 0\n"
                                       "[RetStr1] = timeout\n[RetStr2] = \n\n\n";
constexpr char gc_ClientFailure[] = "Partition not surveyed, reason: \nPartition Failed.\n"
                                    "\n[     Rc] = 0\n[  RcCmd] = 4\n"
                                    "[RetStr1] = \n[RetStr2] = \n\n\n";

PartitionRecord partition(std::string const& host, Outcome outcome, double seconds) {
    PartitionRecord record;
    record.partition.set_PartitionID(host.empty() ? "9" : host.substr(host.size() - 1));
    record.partition.set_HostName(host);
    record.outcome = outcome;
    record.seconds = seconds;
    return record;
}

PartitionRecord failed(std::string const& host, Outcome outcome, std::string const& reason) {
    PartitionRecord record = partition(host, outcome, 1);
    record.result.returnCode = "8";
    record.result.reason = reason;
    return record;
}

PartitionRecord timedOut(std::string const& host, double seconds) {
    PartitionRecord record = failed(host, Outcome::TimedOut, gc_ClientRunFailure);
    record.stop = fleet::ActionStop{report::RemoteAction::RunCommand, seconds, false};
    record.seconds = seconds;
    return record;
}

MachineRecord machine(std::string const& identity, std::vector<PartitionRecord> partitions) {
    MachineRecord record;
    record.identity = identity;
    record.listed = true;
    record.partitions = std::move(partitions);
    return record;
}

// Two machines: five surveyed, one inactive, two timed out, one channel
// failure and one client failure.
std::vector<MachineRecord> mixedRun() {
    return {
        machine("9119-MHE_21ABCDE",
                {partition("host1", Outcome::Surveyed, 2.5), timedOut("host2", 30.2),
                 partition("host3", Outcome::Surveyed, 3), partition("", Outcome::Inactive, 0.1),
                 failed("host5", Outcome::ChannelFailure, gc_ClientRunFailure)}),
        machine("8286-42A_10FGHIJ",
                {partition("db1", Outcome::Surveyed, 4), timedOut("db2", 30.1),
                 failed("db3", Outcome::ClientFailure, gc_ClientFailure),
                 partition("db4", Outcome::Surveyed, 1), partition("db5", Outcome::Surveyed, 1)})};
}

RecapEnding endingAfter(double seconds) {
    RecapEnding ending;
    ending.elapsedSeconds = seconds;
    return ending;
}

TEST(Recap, MixedRunShowsTotalsFailuresByReasonAndTheLongest) {
    RecapEnding ending = endingAfter(65.7);
    ending.summaryFile = "out/summary.json";
    ending.reportFolder = "out/report";
    EXPECT_EQ(Recap(mixedRun()).text(ending, 200),
              "quorvex-survey: 10 partitions of 2 machines in 00:01:05\n"
              "  5 surveyed, 1 inactive, 1 channel failure, 1 client failure, 2 timed out\n"
              "  failed, by reason:\n"
              "    2 timed out: runCmdOnPartition stopped by the time limit\n"
              "      host2, db2\n"
              "    1 channel failure: runCmdOnPartition failed, Rc 1, RcCmd 0: timeout\n"
              "      host5\n"
              "    1 client failure: runCmdOnPartition failed, Rc 0, RcCmd 4\n"
              "      db3\n"
              "  longest: host2 30 s, db2 30 s, db1 4 s\n"
              "  summary: out/summary.json\n"
              "  report: out/report\n");
}

TEST(Recap, RunWithoutFailuresHasNoFailureLines) {
    EXPECT_EQ(Recap({machine("9119-MHE_21ABCDE", {partition("host1", Outcome::Surveyed, 2)})})
                  .text(endingAfter(3), 80),
              "quorvex-survey: 1 partition of 1 machine in 00:00:03\n"
              "  1 surveyed\n"
              "  longest: host1 2 s\n");
}

TEST(Recap, RunWithoutPartitionsSaysSoInOneLine) {
    EXPECT_EQ(Recap({machine("9119-MHE_21ABCDE", {})}).text(endingAfter(0.4), 80),
              "quorvex-survey: 0 partitions of 1 machine in 00:00:00\n");
}

// The console's answer about the identity comes first: a narrow terminal
// still shows it.
TEST(Recap, MachineWhosePartitionListingFailedIsAFailureWithTheConsolesAnswer) {
    MachineRecord unknown = machine("9119-MHE_21ABCDX", {});
    unknown.listingFailure =
        report::ListingFailure{"/opt/vtc/bin/lspartition -ix -c 9119-MHE_21ABCDX", 1,
                               "lspartition: managed system not found"};
    EXPECT_EQ(Recap({unknown}).text(endingAfter(0.4), 80),
              "quorvex-survey: 0 partitions of 1 machine in 00:00:00\n"
              "  failed, by reason:\n"
              "    1 listing failed: lspartition: managed system not found (exit status 1)\n"
              "      9119-MHE_21ABCDX\n");
}

TEST(Recap, InterruptedRunSaysBySignalAndAfterHowLong) {
    PartitionRecord stopped = failed("host2", Outcome::Interrupted, gc_ClientRunFailure);
    stopped.stop = fleet::ActionStop{report::RemoteAction::GetFile, 4, true};
    PartitionRecord neverStarted;
    neverStarted.partition.set_HostName("host3");
    neverStarted.result.statusText = "Interrupted - not surveyed";
    RecapEnding ending = endingAfter(12.9);
    ending.interruptedBy = "SIGINT";
    EXPECT_EQ(Recap({machine("9119-MHE_21ABCDE",
                             {partition("host1", Outcome::Surveyed, 2), stopped, neverStarted})})
                  .text(ending, 100),
              "quorvex-survey: 3 partitions of 1 machine in 00:00:12\n"
              "  interrupted by SIGINT after 12 s\n"
              "  1 surveyed, 2 interrupted\n"
              "  failed, by reason:\n"
              "    1 interrupted: getFileFromPartition stopped when the run was interrupted\n"
              "      host2\n"
              "    1 interrupted: Interrupted - not surveyed\n"
              "      host3\n"
              "  longest: host1 2 s, host2 1 s\n");
}

// Twelve partitions of one machine, all failing alike.
std::vector<MachineRecord> twelveFailing() {
    std::vector<PartitionRecord> partitions;
    for (int number = 10; number < 22; ++number) {
        partitions.push_back(
            failed("lpar" + std::to_string(number), Outcome::ChannelFailure, gc_ClientRunFailure));
    }
    return {machine("9119-MHE_21ABCDE", partitions)};
}

TEST(Recap, HostListIsCutShortToTheWidthWithHowManyMore) {
    EXPECT_EQ(Recap(twelveFailing()).text(endingAfter(5), 80),
              "quorvex-survey: 12 partitions of 1 machine in 00:00:05\n"
              "  12 channel failure\n"
              "  failed, by reason:\n"
              "    12 channel failure: runCmdOnPartition failed, Rc 1, RcCmd 0: timeout\n"
              "      lpar10, lpar11, lpar12, lpar13, lpar14, lpar15, lpar16, lpar17 and 4 more\n"
              "  longest: lpar10 1 s, lpar11 1 s, lpar12 1 s\n");
}

TEST(Recap, WiderTerminalShowsEveryHostThatFits) {
    std::string const text = Recap(twelveFailing()).text(endingAfter(5), 200);
    EXPECT_NE(
        text.find("\n      lpar10, lpar11, lpar12, lpar13, lpar14, lpar15, lpar16, lpar17, lpar18, "
                  "lpar19, lpar20, lpar21\n"),
        std::string::npos)
        << text;
}

TEST(Recap, UnknownWidthIsTakenAsEightyColumns) {
    EXPECT_EQ(Recap(twelveFailing()).text(endingAfter(5), 0),
              Recap(twelveFailing()).text(endingAfter(5), 80));
}

TEST(Recap, ReasonTooLongForTheWidthIsCutLeavingTheLastColumnFree) {
    std::string const text = Recap(twelveFailing()).text(endingAfter(5), 40);
    EXPECT_NE(text.find("\n    12 channel failure: runCmdOnPartiti\n"
                        "      lpar10, lpar11, lpar12 and 9 more\n"),
              std::string::npos)
        << text;
}

TEST(Recap, PathsAreKeptWholeOnANarrowTerminal) {
    RecapEnding ending = endingAfter(1);
    ending.summaryFile = "/var/adm/quorvex/runs/2026-11-24/summary-of-the-night.json";
    std::string const text = Recap({machine("9119-MHE_21ABCDE", {})}).text(ending, 30);
    EXPECT_NE(text.find("  summary: /var/adm/quorvex/runs/2026-11-24/summary-of-the-night.json\n"),
              std::string::npos)
        << text;
}

TEST(Recap, LargerGroupsComeFirstAndEqualOnesInRunOrder) {
    std::vector<MachineRecord> run = {
        machine("9119-MHE_21ABCDE", {failed("a1", Outcome::ClientFailure, gc_ClientFailure),
                                     failed("a2", Outcome::ChannelFailure, gc_ClientRunFailure),
                                     failed("a3", Outcome::ChannelFailure, gc_ClientRunFailure),
                                     failed("a4", Outcome::FetchFailure,
                                            "Unable to get File From Partition : \n"
                                            "\n[     Rc] = 2\n")})};
    std::string const text = Recap(run).text(endingAfter(1), 200);
    EXPECT_NE(text.find("  failed, by reason:\n"
                        "    2 channel failure: runCmdOnPartition failed, Rc 1, RcCmd 0: timeout\n"
                        "      a2, a3\n"
                        "    1 client failure: runCmdOnPartition failed, Rc 0, RcCmd 4\n"
                        "      a1\n"
                        "    1 fetch failure: getFileFromPartition failed, Rc 2\n"
                        "      a4\n"),
              std::string::npos)
        << text;
}

TEST(Recap, FailureOutsideTheSurveysReasonsShowsItsFirstLine) {
    PartitionRecord notStarted = failed("host1", Outcome::ChannelFailure,
                                        "cannot fork: Resource temporarily unavailable\nmore");
    notStarted.result.statusText = "Failed - not started";
    notStarted.seconds.reset();
    std::string const text =
        Recap({machine("9119-MHE_21ABCDE", {notStarted})}).text(endingAfter(1), 200);
    EXPECT_EQ(text, "quorvex-survey: 1 partition of 1 machine in 00:00:01\n"
                    "  1 channel failure\n"
                    "  failed, by reason:\n"
                    "    1 channel failure: cannot fork: Resource temporarily unavailable\n"
                    "      host1\n");
}

TEST(Recap, PartitionWithoutHostNameIsNamedByItsIdentity) {
    PartitionRecord record = failed("", Outcome::ChannelFailure, gc_ClientRunFailure);
    record.partition.set_MTMS(Quorvex::System::MTMS("9119-MHE_21ABCDE"));
    std::string const text =
        Recap({machine("9119-MHE_21ABCDE", {record})}).text(endingAfter(1), 200);
    EXPECT_NE(text.find("timeout\n      9119-MHE_21ABCDE-9\n"), std::string::npos) << text;
}

TEST(Recap, PartitionLeftUnsettledCountsAsInterrupted) {
    PartitionRecord unsettled;
    unsettled.partition.set_HostName("host1");
    unsettled.result.statusText = "Interrupted - not surveyed";
    std::string const text =
        Recap({machine("9119-MHE_21ABCDE", {unsettled})}).text(endingAfter(1), 200);
    EXPECT_NE(text.find("\n  1 interrupted\n"), std::string::npos) << text;
}

} // namespace
