#include "report/StatusText.h"

#include <gtest/gtest.h>

namespace {

using report::Outcome;
using report::outcomeOfStatusText;

TEST(StatusText, FixedTextsOfSurveyedInactiveAndInterrupted) {
    EXPECT_EQ(Outcome::Surveyed, outcomeOfStatusText("Ok"));
    EXPECT_EQ(Outcome::Inactive, outcomeOfStatusText("Failed - Active Status < 3"));
    EXPECT_EQ(Outcome::Interrupted, outcomeOfStatusText("Interrupted - not surveyed"));
}

TEST(StatusText, FixedTextOfADeadWorker) {
    EXPECT_EQ(Outcome::WorkerDied, outcomeOfStatusText("Worker died - not surveyed"));
    EXPECT_EQ(std::nullopt, outcomeOfStatusText("Worker died"));
}

TEST(StatusText, ChannelFailureWithItsCode) {
    EXPECT_EQ(Outcome::ChannelFailure, outcomeOfStatusText("RELAY Failed, rc = 4"));
    EXPECT_EQ(Outcome::ChannelFailure, outcomeOfStatusText("RELAY Failed, rc = 4294967295"));
}

TEST(StatusText, ClientFailureWithItsCode) {
    EXPECT_EQ(Outcome::ClientFailure, outcomeOfStatusText("Partition Failed, RcCmd = 9"));
}

TEST(StatusText, FetchFailureCodeWrittenOverTheSeed) {
    EXPECT_EQ(Outcome::FetchFailure, outcomeOfStatusText("2et result Failed, rc = "));
    EXPECT_EQ(Outcome::FetchFailure, outcomeOfStatusText("0et result Failed, rc = "));
    EXPECT_EQ(Outcome::FetchFailure, outcomeOfStatusText("42t result Failed, rc = "));
    EXPECT_EQ(Outcome::FetchFailure, outcomeOfStatusText("4294967295 Failed, rc = "));
}

TEST(StatusText, FetchSeedWithoutCodeOrWithWrongRestIsNotRecognised) {
    EXPECT_EQ(std::nullopt, outcomeOfStatusText("get result Failed, rc = "));
    EXPECT_EQ(std::nullopt, outcomeOfStatusText("2get result Failed, rc = "));
    EXPECT_EQ(std::nullopt, outcomeOfStatusText("2et result Failed, rc = 5"));
}

TEST(StatusText, FailurePrefixWithoutCodeIsNotRecognised) {
    EXPECT_EQ(std::nullopt, outcomeOfStatusText("RELAY Failed, rc = "));
    EXPECT_EQ(std::nullopt, outcomeOfStatusText("Partition Failed, RcCmd = x"));
}

TEST(StatusText, UnknownAndEmptyTextsAreNotRecognised) {
    EXPECT_EQ(std::nullopt, outcomeOfStatusText(""));
    EXPECT_EQ(std::nullopt, outcomeOfStatusText("ok"));
    EXPECT_EQ(std::nullopt, outcomeOfStatusText("Ok "));
}

} // namespace
