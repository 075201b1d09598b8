#include "report/Outcome.h"

#include <gtest/gtest.h>

#include <set>

using report::Outcome;
using Kind = Quorvex::PYLON::VPD::PartitionOutcomeKind;

TEST(Outcome, TableListsEveryOutcomeInEnumeratorOrder) {
    auto const& table = report::outcomeTable();
    for (std::size_t i = 0; i < table.size(); ++i) {
        EXPECT_EQ(static_cast<std::size_t>(table[i].outcome), i) << table[i].name;
    }
    EXPECT_EQ(table.back().outcome, Outcome::WorkerDied);
}

TEST(Outcome, NamesLabelsAndPageClassesAreDistinct) {
    std::set<std::string> names, labels, classes;
    for (auto const& row : report::outcomeTable()) {
        names.insert(row.name);
        labels.insert(row.label);
        classes.insert(row.pageClass);
    }
    EXPECT_EQ(names.size(), report::gc_OutcomeCount);
    EXPECT_EQ(labels.size(), report::gc_OutcomeCount);
    EXPECT_EQ(classes.size(), report::gc_OutcomeCount);
}

TEST(Outcome, SummaryNamesReadBackToTheirOutcome) {
    for (auto const& row : report::outcomeTable()) {
        EXPECT_EQ(report::outcomeNamed(row.name), row.outcome);
        EXPECT_STREQ(report::outcomeName(row.outcome), row.name);
    }
    EXPECT_EQ(report::outcomeNamed("timed_out"), Outcome::TimedOut);
    EXPECT_EQ(report::outcomeNamed("partitions"), std::nullopt);
    EXPECT_EQ(report::outcomeNamed(""), std::nullopt);
}

TEST(Outcome, SurveyKindsMapToTheirOutcomes) {
    EXPECT_EQ(report::outcomeOf(Kind::Surveyed), Outcome::Surveyed);
    EXPECT_EQ(report::outcomeOf(Kind::Inactive), Outcome::Inactive);
    EXPECT_EQ(report::outcomeOf(Kind::ChannelFailure), Outcome::ChannelFailure);
    EXPECT_EQ(report::outcomeOf(Kind::ClientFailure), Outcome::ClientFailure);
    EXPECT_EQ(report::outcomeOf(Kind::FetchFailure), Outcome::FetchFailure);
}

TEST(Outcome, EveryOutcomeButSurveyedAndInactiveIsAFailure) {
    for (auto const& row : report::outcomeTable()) {
        bool const isFine = row.outcome == Outcome::Surveyed || row.outcome == Outcome::Inactive;
        EXPECT_EQ(report::isFailure(row.outcome), !isFine) << row.name;
    }
}
