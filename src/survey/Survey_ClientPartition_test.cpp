#include "survey/Survey_ClientPartition.h"

#include "pylon/ListOf_Partitions.h"
#include "system/MTMS.h"
#include "system/Partition.h"

#include "QuorvexTest.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <iostream>
#include <iterator>
#include <optional>
#include <string>
#include <vector>

namespace {

using QuorvexTest::Invocation;

using QuorvexTest::gc_VPD_Folder;
constexpr char gc_LocalPrefix[] = "VPD/quorvexPYLON_VPD_Survey_ClientPartition_1234-ABC_10ABCDE-";

Quorvex::System::Partition u_make_Partition(std::string const& id, std::string const& activeStatus,
                                            std::string const& hostName) {
    Quorvex::System::Partition partition(Quorvex::System::MTMS("1234-ABC_10ABCDE"), id, hostName);
    partition.set_IP("10.1.1.1" + id);
    partition.set_ActiveStatus(activeStatus);
    partition.set_OperatingSystem_Name("Zeph");
    partition.set_OperatingSystem_Version("7." + id);
    return partition;
}

std::string u_local_File(std::string const& id) {
    return gc_LocalPrefix + id + ".VPD.xml";
}

std::string u_document(std::string const& id) {
    return QuorvexTest::readFile(std::string("/var/adm/quorvex/") + u_local_File(id));
}

// What one call of the survey loop left behind.
struct LoopRun {
    // One line per output entry: file name, code and status text joined by "|".
    std::string outcomes;
    // The trace text, temporary file names normalised.
    std::string trace;
    // The console calls.
    std::vector<Invocation> calls;
};

// Runs the loop over partitions in a child process, against a console
// answering as scenario says, with a fresh trace file.
LoopRun u_run_Loop(std::string const& scenario,
                   Quorvex::PYLON::ListOf_Partitions const& partitions) {
    QuorvexTest::SimulatedConsole const console(scenario);
    QuorvexTest::TemporaryDirectory const traceFolder;
    std::string const tracePath = traceFolder.file("survey.Trace");
    QuorvexTest::CommandResult const child =
        QuorvexTest::runTracedInChild(tracePath, [&partitions]() {
            std::vector<std::string> fileNames;
            std::vector<std::string> returnCodes;
            std::vector<std::string> statusTexts;
            Quorvex::PYLON::VPD::Survey_ClientPartition()(partitions, fileNames, returnCodes,
                                                          statusTexts);
            for (std::size_t i = 0; i < fileNames.size(); ++i) {
                std::cout << fileNames[i] << "|" << returnCodes[i] << "|" << statusTexts[i] << "\n";
            }
            bool const aligned = fileNames.size() == partitions.size() &&
                                 returnCodes.size() == partitions.size() &&
                                 statusTexts.size() == partitions.size();
            return aligned ? 0 : 1;
        });
    EXPECT_EQ(child.exitStatus, 0) << "the three outputs are not aligned with the listing";
    EXPECT_EQ(child.stderrText, "");
    return {child.stdoutText,
            QuorvexTest::normaliseTemporaryNames(QuorvexTest::readFile(tracePath),
                                                 QuorvexTest::TemporaryNames::Numbered),
            console.invocations()};
}

class Survey_ClientPartition : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(QuorvexTest::isInsideSandbox());
        QuorvexTest::clearFolder(gc_VPD_Folder);
    }
};

constexpr char gc_ClientOk[] = "[runCmdOnPartition *]\n"
                               "stdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n";
constexpr char gc_FetchOk[] = "[getFileFromPartition *]\n"
                              "stdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
                              "document-nolf <fetched/>\n";

TEST_F(Survey_ClientPartition, EmptyListingLeavesAllThreeOutputsEmpty) {
    LoopRun const run = u_run_Loop("", Quorvex::PYLON::ListOf_Partitions());
    EXPECT_EQ(run.outcomes, "");
    EXPECT_EQ(run.trace, "");
    EXPECT_TRUE(run.calls.empty());
}

TEST_F(Survey_ClientPartition, OutputsAreAppendedToWhatTheyHeld) {
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.push_back(u_make_Partition("1", "1", "host1"));
    std::vector<std::string> fileNames{"earlier"};
    std::vector<std::string> returnCodes{"0"};
    std::vector<std::string> statusTexts{"Ok"};
    Quorvex::PYLON::VPD::Survey_ClientPartition()(partitions, fileNames, returnCodes, statusTexts);
    EXPECT_EQ(fileNames, (std::vector<std::string>{"earlier", ""}));
    EXPECT_EQ(returnCodes, (std::vector<std::string>{"0", "8"}));
    EXPECT_EQ(statusTexts, (std::vector<std::string>{"Ok", "Failed - Active Status < 3"}));
}

TEST_F(Survey_ClientPartition, PartitionWithActiveStatusTwoIsSkippedWithNoTraceTextAtAll) {
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.push_back(u_make_Partition("1", "2", "host1"));
    LoopRun const run = u_run_Loop(gc_ClientOk, partitions);
    EXPECT_EQ(run.outcomes, "|8|Failed - Active Status < 3\n");
    EXPECT_EQ(run.trace, "");
    EXPECT_TRUE(run.calls.empty());
    EXPECT_TRUE(QuorvexTest::listFolder(gc_VPD_Folder).empty());
}

TEST_F(Survey_ClientPartition, UnreadableActiveStatusesAreSkipped) {
    std::vector<std::string> const statuses{"", "abc", "0", "1", "4294967296"};
    Quorvex::PYLON::ListOf_Partitions partitions;
    std::transform(
        statuses.begin(), statuses.end(), std::back_inserter(partitions),
        [](std::string const& status) { return u_make_Partition("1", status, "host1"); });
    LoopRun const run = u_run_Loop(gc_ClientOk, partitions);
    std::string const skipped = "|8|Failed - Active Status < 3\n";
    EXPECT_EQ(run.outcomes, skipped + skipped + skipped + skipped + skipped);
    EXPECT_TRUE(run.calls.empty());
}

TEST_F(Survey_ClientPartition, PartitionWithActiveStatusThreeIsTried) {
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.push_back(u_make_Partition("1", "3", "host1"));
    LoopRun const run = u_run_Loop(std::string(gc_ClientOk) + gc_FetchOk, partitions);
    EXPECT_EQ(run.outcomes, u_local_File("1") + "|0|Ok\n");
    ASSERT_EQ(run.calls.size(), 2u);
    EXPECT_EQ(u_document("1"), "<fetched/>");
}

TEST_F(Survey_ClientPartition, BlankLedAndSignedActiveStatusesAreTried) {
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.push_back(u_make_Partition("1", " 3", "host1"));
    partitions.push_back(u_make_Partition("2", "+3", "host2"));
    partitions.push_back(u_make_Partition("3", "-1", "host3"));
    LoopRun const run = u_run_Loop(std::string(gc_ClientOk) + gc_FetchOk, partitions);
    EXPECT_EQ(run.outcomes, u_local_File("1") + "|0|Ok\n" + u_local_File("2") + "|0|Ok\n" +
                                u_local_File("3") + "|0|Ok\n");
    EXPECT_EQ(run.calls.size(), 6u);
}

TEST_F(Survey_ClientPartition, ClientExitCodeFiveGivesPartitionFailedAndItsReason) {
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.push_back(u_make_Partition("5", "3", "host5"));
    LoopRun const run = u_run_Loop("[runCmdOnPartition 5]\n"
                                   "stdout Rc::0::RcCmd::5::RetStr1::client failed::RetStr2::\n",
                                   partitions);
    EXPECT_EQ(run.outcomes, u_local_File("5") + "|8|Partition Failed, RcCmd = 5\n");
    EXPECT_NE(u_document("5").find("<Value type=\"string\">Partition not surveyed, reason: \n"
                                   "Partition Failed.\n"
                                   "\n[     Rc] = 0\n[  RcCmd] = 5\n[RetStr1] = client failed\n"
                                   "[RetStr2] = \n\n\n</Value>"),
              std::string::npos)
        << u_document("5");
    ASSERT_EQ(run.calls.size(), 1u) << "a failed client run is not followed by a fetch";
}

TEST_F(Survey_ClientPartition, FetchFailingWithChannelCodeThreeReplacesTheSeedsFirstLetter) {
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.push_back(u_make_Partition("6", "3", "host6"));
    LoopRun const run = u_run_Loop(std::string(gc_ClientOk) +
                                       "[getFileFromPartition 6]\n"
                                       "stdout Rc::3::RcCmd::0::RetStr1::not found::RetStr2::\n"
                                       "exit 1\n",
                                   partitions);
    EXPECT_EQ(run.outcomes, u_local_File("6") + "|8|3et result Failed, rc = \n");
    EXPECT_NE(u_document("6").find("<Value type=\"string\">Unable to get File From Partition : \n"
                                   "\n[     Rc] = 3\n[  RcCmd] = 0\n[RetStr1] = not found\n"
                                   "[RetStr2] = \n\n\n</Value>"),
              std::string::npos)
        << u_document("6");
}

TEST_F(Survey_ClientPartition, FetchCodeTwelveReplacesTheSeedsFirstTwoLetters) {
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.push_back(u_make_Partition("6", "3", "host6"));
    LoopRun const run =
        u_run_Loop(std::string(gc_ClientOk) + "[getFileFromPartition 6]\n"
                                              "stdout Rc::12::RcCmd::0::RetStr1::x::RetStr2::\n",
                   partitions);
    EXPECT_EQ(run.outcomes, u_local_File("6") + "|8|12t result Failed, rc = \n");
}

TEST_F(Survey_ClientPartition, FetchExitCodeWithRcZeroStillFailsAndShowsRc) {
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.push_back(u_make_Partition("6", "3", "host6"));
    LoopRun const run =
        u_run_Loop(std::string(gc_ClientOk) + "[getFileFromPartition 6]\n"
                                              "stdout Rc::0::RcCmd::0::RetStr1::x::RetStr2::\n"
                                              "exit 1\n",
                   partitions);
    EXPECT_EQ(run.outcomes, u_local_File("6") + "|8|0et result Failed, rc = \n");
}

TEST_F(Survey_ClientPartition, ChannelCodeMinusOneIsShownAs4294967295) {
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.push_back(u_make_Partition("4", "3", "host4"));
    partitions.push_back(u_make_Partition("6", "3", "host6"));
    LoopRun const run = u_run_Loop("[runCmdOnPartition 4]\nexit 1\n"
                                   "[runCmdOnPartition 6]\n"
                                   "stdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n"
                                   "[getFileFromPartition 6]\nexit 1\n",
                                   partitions);
    EXPECT_EQ(run.outcomes, u_local_File("4") + "|8|RELAY Failed, rc = 4294967295\n" +
                                u_local_File("6") + "|8|4294967295 Failed, rc = \n");
    EXPECT_NE(u_document("4").find("<Value type=\"string\">Partition not surveyed, reason: \n"
                                   "RELAY Failed.\n\n\n\n</Value>"),
              std::string::npos)
        << u_document("4");
    EXPECT_NE(u_document("6").find(
                  "<Value type=\"string\">Unable to get File From Partition : \n\n\n\n</Value>"),
              std::string::npos)
        << u_document("6");
}

TEST_F(Survey_ClientPartition, ChannelFailureShowsTheChannelCodeNotTheExitCode) {
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.push_back(u_make_Partition("4", "3", "host4"));
    LoopRun const run = u_run_Loop("[runCmdOnPartition 4]\n"
                                   "stdout Rc::0::RcCmd::0::RetStr1::x::RetStr2::\n"
                                   "exit 3\n",
                                   partitions);
    EXPECT_EQ(run.outcomes, u_local_File("4") + "|8|RELAY Failed, rc = 0\n");
    EXPECT_NE(u_document("4").find("reason: \nRELAY Failed.\n"), std::string::npos);
}

TEST_F(Survey_ClientPartition, NonZeroChannelCodeWithExitZeroIsAChannelFailure) {
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.push_back(u_make_Partition("4", "3", "host4"));
    LoopRun const run = u_run_Loop("[runCmdOnPartition 4]\n"
                                   "stdout Rc::7::RcCmd::5::RetStr1::x::RetStr2::\n",
                                   partitions);
    EXPECT_EQ(run.outcomes, u_local_File("4") + "|8|RELAY Failed, rc = 7\n");
}

TEST_F(Survey_ClientPartition, MissingClientCodeIsAClientFailureOf4294967295) {
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.push_back(u_make_Partition("5", "3", "host5"));
    LoopRun const run = u_run_Loop("[runCmdOnPartition 5]\nstdout Rc::0\n", partitions);
    EXPECT_EQ(run.outcomes, u_local_File("5") + "|8|Partition Failed, RcCmd = 4294967295\n");
}

TEST_F(Survey_ClientPartition, NegativeClientCodeIsShownUnsigned) {
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.push_back(u_make_Partition("5", "3", "host5"));
    LoopRun const run = u_run_Loop("[runCmdOnPartition 5]\nstdout Rc::0::RcCmd::-2\n", partitions);
    EXPECT_EQ(run.outcomes, u_local_File("5") + "|8|Partition Failed, RcCmd = 4294967294\n");
}

TEST_F(Survey_ClientPartition, SuccessIsRecordedWithoutTheToolWritingTheFile) {
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.push_back(u_make_Partition("3", "3", "host3"));
    LoopRun const run =
        u_run_Loop(std::string(gc_ClientOk) + "[getFileFromPartition 3]\n"
                                              "stdout Rc::0::RcCmd::0::RetStr1::done::RetStr2::\n",
                   partitions);
    EXPECT_EQ(run.outcomes, u_local_File("3") + "|0|Ok\n");
    EXPECT_TRUE(QuorvexTest::listFolder(gc_VPD_Folder).empty());
}

TEST_F(Survey_ClientPartition, OutputIndexBelongsToListingIndexIncludingSkippedPartitions) {
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.push_back(u_make_Partition("9", "1", "host9"));
    partitions.push_back(u_make_Partition("3", "3", "host3"));
    partitions.push_back(u_make_Partition("8", "0", "host8"));
    partitions.push_back(u_make_Partition("4", "3", "host4"));
    partitions.push_back(u_make_Partition("7", "", "host7"));
    LoopRun const run = u_run_Loop(std::string(gc_ClientOk) + gc_FetchOk +
                                       "[runCmdOnPartition 4]\n"
                                       "stdout Rc::1::RcCmd::0::RetStr1::timeout::RetStr2::\n"
                                       "exit 1\n",
                                   partitions);
    EXPECT_EQ(run.outcomes, "|8|Failed - Active Status < 3\n" + u_local_File("3") + "|0|Ok\n" +
                                "|8|Failed - Active Status < 3\n" + u_local_File("4") +
                                "|8|RELAY Failed, rc = 1\n" + "|8|Failed - Active Status < 3\n");
}

TEST_F(Survey_ClientPartition, ConsoleReceivesTheClientRunAndTheFetchOfEachPartition) {
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.push_back(u_make_Partition("3", "3", "host3"));
    partitions.push_back(u_make_Partition("4", "3", "host4"));
    LoopRun const run = u_run_Loop(std::string(gc_ClientOk) + gc_FetchOk, partitions);
    std::string const target = "ZOR.ServiceEvent::::";
    std::string const machine = "::CallerID::0::CecMT::1234-ABC::CecMS::10ABCDE::PartitionId::";
    std::string const client = "::CmdID::0::CmdOpts:: -v  -of 1234-ABC_10ABCDE-";
    std::string const options = ".VPD.xml -c 1234-ABC_10ABCDE -pylonv 4.0.11::RemoteFN::";
    std::string const clientFile =
        ".QuorvexOutput::RemoteFileInfo::FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=system";
    std::string const consoleFile =
        "::LocalFileInfo::FILE_PERM=660;FILE_OWNER=quorvex;FILE_GROUP=pylon";
    std::vector<Invocation> const expected{
        {"runact-api", "-c",
         target + "runCmdOnPartition" + machine + "3" + client + "3" + options +
             "1234-ABC_10ABCDE-3" + clientFile},
        {"runact-api", "-c",
         target + "getFileFromPartition" + machine + "3" +
             "::RemoteFN::1234-ABC_10ABCDE-3.VPD.xml::LocalFN::" + u_local_File("3") + consoleFile},
        {"runact-api", "-c",
         target + "runCmdOnPartition" + machine + "4" + client + "4" + options +
             "1234-ABC_10ABCDE-4" + clientFile},
        {"runact-api", "-c",
         target + "getFileFromPartition" + machine + "4" +
             "::RemoteFN::1234-ABC_10ABCDE-4.VPD.xml::LocalFN::" + u_local_File("4") + consoleFile},
    };
    EXPECT_EQ(run.calls, expected);
}

// The expected trace lies in tests/expected/; rewrite it from a run with
// QUORVEX_UPDATE_EXPECTED=1 when the trace changes on purpose.
TEST_F(Survey_ClientPartition, TraceOfAFailedAndASurveyedPartitionIsExact) {
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.push_back(u_make_Partition("2", "3", "host2"));
    partitions.push_back(u_make_Partition("3", "3", "host3"));
    LoopRun const run = u_run_Loop(std::string(gc_ClientOk) + gc_FetchOk +
                                       "[runCmdOnPartition 2]\n"
                                       "stdout Rc::1::RcCmd::0::RetStr1::timeout::RetStr2::\n"
                                       "exit 1\n",
                                   partitions);
    EXPECT_TRUE(QuorvexTest::matchesExpectedFile(
        run.trace, QuorvexTest::expectedOutputFile(
                       "Survey_ClientPartition/TraceOfAFailedAndASurveyedPartition.trace")));
}

TEST_F(Survey_ClientPartition, DefaultDocumentReplacesAnEarlierResult) {
    QuorvexTest::writeFile(std::string("/var/adm/quorvex/") + u_local_File("6"),
                           std::string(5000, '#'));
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.push_back(u_make_Partition("6", "3", "host6"));
    u_run_Loop(std::string(gc_ClientOk) + "[getFileFromPartition 6]\nexit 1\n", partitions);
    std::string const document = u_document("6");
    EXPECT_EQ(document.find('#'), std::string::npos);
    EXPECT_EQ(document.rfind("<?xml version=\"1.0\" encoding=\"UTF-8\"?>", 0), 0u);
    EXPECT_EQ(document.substr(document.size() - 20), "</com.zor.inventory>");
}

TEST_F(Survey_ClientPartition, InactivePartitionLeavesAnEarlierFileUntouched) {
    QuorvexTest::writeFile(std::string("/var/adm/quorvex/") + u_local_File("1"), "earlier run");
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.push_back(u_make_Partition("1", "1", "host1"));
    u_run_Loop(gc_ClientOk, partitions);
    EXPECT_EQ(u_document("1"), "earlier run");
}

TEST_F(Survey_ClientPartition, MachineWithoutDashListsTheFailedPartitionButWritesNoDocument) {
    Quorvex::System::Partition partition(Quorvex::System::MTMS("1234MMA_10ABCDE"), "2", "host2");
    partition.set_ActiveStatus("3");
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.push_back(partition);
    LoopRun const run = u_run_Loop("[runCmdOnPartition 2]\nexit 1\n", partitions);
    EXPECT_EQ(run.outcomes,
              "VPD/quorvexPYLON_VPD_Survey_ClientPartition_"
              "1234MMAERROR_10ABCDEERROR-2.VPD.xml|8|RELAY Failed, rc = 4294967295\n");
    EXPECT_TRUE(QuorvexTest::listFolder(gc_VPD_Folder).empty());
}

TEST_F(Survey_ClientPartition, TwoPartitionsOfOneIdentityShareTheirLocalFile) {
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.push_back(u_make_Partition("3", "3", "first"));
    partitions.push_back(u_make_Partition("3", "3", "second"));
    LoopRun const run =
        u_run_Loop(std::string(gc_ClientOk) + "[getFileFromPartition 3]\nexit 1\n", partitions);
    std::string const failed = u_local_File("3") + "|8|4294967295 Failed, rc = \n";
    EXPECT_EQ(run.outcomes, failed + failed);
    EXPECT_NE(u_document("3").find("displayName=\"second\""), std::string::npos);
    EXPECT_EQ(u_document("3").find("displayName=\"first\""), std::string::npos);
}

// What surveying one partition on its own left: the outcome's kind and
// codes ("-" when unknown), whether the stop note was asked for, the reason,
// and the trace.
struct OneRun {
    std::string outcome;
    std::string reason;
    std::string trace;
};

OneRun u_run_One(std::string const& scenario, Quorvex::System::Partition const& partition,
                 std::string const& note) {
    QuorvexTest::SimulatedConsole const console(scenario);
    QuorvexTest::TemporaryDirectory const traceFolder;
    std::string const tracePath = traceFolder.file("survey.Trace");
    QuorvexTest::CommandResult const child =
        QuorvexTest::runTracedInChild(tracePath, [&partition, &note]() {
            bool asked = false;
            Quorvex::PYLON::VPD::PartitionOutcome const outcome =
                Quorvex::PYLON::VPD::Survey_ClientPartition::survey_Partition(partition,
                                                                              [&asked, &note] {
                                                                                  asked = true;
                                                                                  return note;
                                                                              });
            auto const code = [](std::optional<int> const& value) {
                return value ? std::to_string(*value) : std::string("-");
            };
            std::cout << outcome.fileName << "|" << outcome.returnCode << "|" << outcome.statusText
                      << "|" << static_cast<int>(outcome.kind) << "|" << code(outcome.rc) << "|"
                      << code(outcome.rcCmd) << "|" << (asked ? "asked" : "not asked") << "\n"
                      << outcome.reason;
            return 0;
        });
    EXPECT_EQ(child.exitStatus, 0);
    std::size_t const lineEnd = child.stdoutText.find('\n');
    return {child.stdoutText.substr(0, lineEnd), child.stdoutText.substr(lineEnd + 1),
            QuorvexTest::normaliseTemporaryNames(QuorvexTest::readFile(tracePath),
                                                 QuorvexTest::TemporaryNames::Numbered)};
}

constexpr char gc_Note[] = "Stopped by the time limit of 2 s after 2.0 s.";

TEST_F(Survey_ClientPartition, OnePartitionSurveyedGivesBothCodesAndNoReason) {
    OneRun const run =
        u_run_One(std::string(gc_ClientOk) + gc_FetchOk, u_make_Partition("1", "3", "h1"), "");
    EXPECT_EQ(run.outcome, u_local_File("1") + "|0|Ok|0|0|0|not asked");
    EXPECT_EQ(run.reason, "");
}

TEST_F(Survey_ClientPartition, OneInactivePartitionHasNoCodesAndNoTrace) {
    OneRun const run = u_run_One(gc_ClientOk, u_make_Partition("1", "1", "h1"), gc_Note);
    EXPECT_EQ(run.outcome, "|8|Failed - Active Status < 3|1|-|-|not asked");
    EXPECT_EQ(run.trace, "");
}

TEST_F(Survey_ClientPartition, OnePartitionWithChannelFailureGivesTheClientRunsCodes) {
    OneRun const run = u_run_One("[runCmdOnPartition *]\n"
                                 "stdout Rc::1::RcCmd::0::RetStr1::timeout::RetStr2::\n",
                                 u_make_Partition("1", "3", "h1"), "");
    EXPECT_EQ(run.outcome, u_local_File("1") + "|8|RELAY Failed, rc = 1|2|1|0|asked");
    EXPECT_EQ(run.reason.rfind("Partition not surveyed, reason: \nRELAY Failed.\n", 0), 0U);
}

TEST_F(Survey_ClientPartition, OnePartitionWithClientFailureGivesItsRcCmd) {
    OneRun const run = u_run_One("[runCmdOnPartition *]\n"
                                 "stdout Rc::0::RcCmd::5::RetStr1::x::RetStr2::\n",
                                 u_make_Partition("1", "3", "h1"), "");
    EXPECT_EQ(run.outcome, u_local_File("1") + "|8|Partition Failed, RcCmd = 5|3|0|5|asked");
}

TEST_F(Survey_ClientPartition, OnePartitionWithFetchFailureGivesTheFetchRcAndTheClientRcCmd) {
    OneRun const run =
        u_run_One(std::string(gc_ClientOk) + "[getFileFromPartition *]\n"
                                             "stdout Rc::3::RcCmd::7::RetStr1::x::RetStr2::\n",
                  u_make_Partition("1", "3", "h1"), "");
    EXPECT_EQ(run.outcome, u_local_File("1") + "|8|3et result Failed, rc = |4|3|0|asked");
    EXPECT_EQ(run.reason.rfind("Unable to get File From Partition : \n", 0), 0U);
}

TEST_F(Survey_ClientPartition, StopNoteEndsTheReasonTheDocumentAndTheTraceBlock) {
    // A client run stopped from outside ends without printing anything.
    OneRun const run =
        u_run_One("[runCmdOnPartition *]\n", u_make_Partition("1", "3", "h1"), gc_Note);
    EXPECT_EQ(run.outcome, u_local_File("1") + "|8|RELAY Failed, rc = 4294967295|2|-|-|asked");
    EXPECT_EQ(run.reason, std::string("Partition not surveyed, reason: \nRELAY Failed.\n\n\n\n") +
                              gc_Note + "\n");
    EXPECT_NE(u_document("1").find(std::string("\n") + gc_Note + "\n"), std::string::npos);
    std::string const lastLine = std::string(gc_Note) + "\n";
    ASSERT_GE(run.trace.size(), lastLine.size());
    EXPECT_EQ(run.trace.substr(run.trace.size() - lastLine.size()), lastLine);
}

TEST_F(Survey_ClientPartition, EmptyStopNoteChangesNothing) {
    OneRun const withEmptyNote =
        u_run_One("[runCmdOnPartition *]\n", u_make_Partition("1", "3", "h1"), "");
    std::string const document = u_document("1");
    LoopRun const loop = u_run_Loop("[runCmdOnPartition *]\n", [] {
        Quorvex::PYLON::ListOf_Partitions partitions;
        partitions.push_back(u_make_Partition("1", "3", "h1"));
        return partitions;
    }());
    EXPECT_EQ(withEmptyNote.trace, loop.trace);
    EXPECT_EQ(withEmptyNote.reason, "Partition not surveyed, reason: \nRELAY Failed.\n\n\n\n");
    EXPECT_EQ(document.size(), u_document("1").size());
}

} // namespace
