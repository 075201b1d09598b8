#include "report/MachineDocuments.h"

#include <gtest/gtest.h>

namespace {

using report::DocumentFile;
using report::MachineDocuments;
using report::Outcome;
using report::RemoteAction;

DocumentFile fetched(std::string const& id, std::string const& host) {
    DocumentFile document;
    document.partitionText = "1-A_S-" + id;
    document.id = id;
    document.content.host = host;
    return document;
}

DocumentFile failed(std::string const& id, std::string const& host, RemoteAction action) {
    DocumentFile document = fetched(id, host);
    document.content.reason = "reason";
    document.failure = report::FailureReason{};
    document.failure->action = action;
    return document;
}

DocumentFile stoppedBySignal(std::string const& id, std::string const& host) {
    DocumentFile document = failed(id, host, RemoteAction::RunCommand);
    document.failure->stop = report::StopLine{report::Stopper::Signal, "SIGINT", 0.5};
    return document;
}

DocumentFile unnamed(DocumentFile document) {
    document.content.host = std::nullopt;
    return document;
}

std::string idOf(DocumentFile const* document) {
    return document == nullptr ? "(none)" : document->id;
}

std::string idsOf(std::vector<DocumentFile const*> const& documents) {
    std::string ids;
    for (DocumentFile const* document : documents) {
        ids += (ids.empty() ? "" : " ") + idOf(document);
    }
    return ids;
}

TEST(MachineDocuments, SurveyedPartitionTakesAFetchedDocumentOfItsHost) {
    MachineDocuments documents(
        {failed("1", "a", RemoteAction::RunCommand), fetched("2", "a"), fetched("3", "b")});
    EXPECT_EQ("2", idOf(documents.take("a", Outcome::Surveyed)));
    EXPECT_EQ("(none)", idOf(documents.take("a", Outcome::Surveyed)));
}

TEST(MachineDocuments, SameHostTakesItsDocumentsInNumericIdOrderThenTextOrder) {
    MachineDocuments documents({fetched("x", "a"), fetched("10", "a"), fetched("9", "a")});
    EXPECT_EQ("9", idOf(documents.take("a", Outcome::Surveyed)));
    EXPECT_EQ("10", idOf(documents.take("a", Outcome::Surveyed)));
    EXPECT_EQ("x", idOf(documents.take("a", Outcome::Surveyed)));
}

TEST(MachineDocuments, FailureTakesADefaultDocumentOfItsAction) {
    MachineDocuments documents(
        {failed("1", "a", RemoteAction::GetFile), failed("2", "a", RemoteAction::RunCommand)});
    EXPECT_EQ("2", idOf(documents.take("a", Outcome::ChannelFailure)));
    EXPECT_EQ("1", idOf(documents.take("a", Outcome::FetchFailure)));
}

TEST(MachineDocuments, OnlyAnInterruptedPartitionTakesADocumentASignalStopped) {
    MachineDocuments documents({stoppedBySignal("1", "a")});
    EXPECT_EQ("(none)", idOf(documents.take("a", Outcome::ClientFailure)));
    EXPECT_EQ("(none)", idOf(documents.take("a", std::nullopt)));
    EXPECT_EQ("1", idOf(documents.take("a", Outcome::Interrupted)));
}

TEST(MachineDocuments, InterruptedPartitionTakesNoDocumentWithoutASignal) {
    MachineDocuments documents({failed("1", "a", RemoteAction::RunCommand), fetched("2", "a")});
    EXPECT_EQ("(none)", idOf(documents.take("a", Outcome::Interrupted)));
}

TEST(MachineDocuments, UnknownStatusTakesAnyDefaultDocument) {
    MachineDocuments documents({fetched("1", "a"), failed("2", "a", RemoteAction::GetFile)});
    EXPECT_EQ("2", idOf(documents.take("a", std::nullopt)));
}

TEST(MachineDocuments, InactivePartitionAndUnknownHostTakeNothing) {
    MachineDocuments documents({fetched("1", "a"), failed("2", "a", RemoteAction::RunCommand)});
    EXPECT_EQ("(none)", idOf(documents.take("a", Outcome::Inactive)));
    EXPECT_EQ("(none)", idOf(documents.take("b", Outcome::Surveyed)));
    EXPECT_EQ("1", idOf(documents.take("a", Outcome::Surveyed)));
}

TEST(MachineDocuments, OnlyUnnamedDocumentOfItsKindGoesToTheOnlyPartitionItFits) {
    MachineDocuments documents({unnamed(fetched("3", "")), fetched("4", "a")});
    EXPECT_EQ("3", idsOf(documents.takeUnnamed({Outcome::Surveyed})));
    EXPECT_EQ("4", idOf(documents.take("a", Outcome::Surveyed)));
}

TEST(MachineDocuments, TwoAlikePartitionsAndTwoUnnamedDocumentsGetNone) {
    MachineDocuments documents({unnamed(fetched("1", "")), unnamed(fetched("2", ""))});
    EXPECT_EQ("(none) (none)",
              idsOf(documents.takeUnnamed({Outcome::Surveyed, Outcome::Surveyed})));
}

TEST(MachineDocuments, OneUnnamedDocumentFittingTwoPartitionsGoesToNeither) {
    MachineDocuments documents({unnamed(failed("5", "", RemoteAction::RunCommand))});
    EXPECT_EQ("(none) (none)",
              idsOf(documents.takeUnnamed({Outcome::ChannelFailure, std::nullopt})));
}

TEST(MachineDocuments, UnnamedDocumentsOfDifferentKindsGoEachToItsPartition) {
    MachineDocuments documents({unnamed(failed("1", "", RemoteAction::GetFile)),
                                unnamed(fetched("2", "")), unnamed(stoppedBySignal("3", ""))});
    EXPECT_EQ("3 2 1 (none)",
              idsOf(documents.takeUnnamed({Outcome::Interrupted, Outcome::Surveyed,
                                           Outcome::FetchFailure, Outcome::ClientFailure})));
}

TEST(MachineDocuments, InactivePartitionTakesNoUnnamedDocumentAndLeavesNoDoubt) {
    MachineDocuments documents({unnamed(failed("1", "", RemoteAction::RunCommand))});
    EXPECT_EQ("(none) 1",
              idsOf(documents.takeUnnamed({Outcome::Inactive, Outcome::ClientFailure})));
}

TEST(MachineDocuments, DocumentNamingAHostOrAlreadyTakenIsNotGivenByItsFileName) {
    MachineDocuments documents({fetched("1", "a"), fetched("2", "")});
    EXPECT_EQ("2", idOf(documents.take("", Outcome::Surveyed)));
    EXPECT_EQ("(none)", idsOf(documents.takeUnnamed({Outcome::Surveyed})));
}

} // namespace
