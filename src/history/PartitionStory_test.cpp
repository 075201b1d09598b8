#include "HistoryFixture.h"
#include "history/PartitionStory.h"

#include <gtest/gtest.h>

namespace {

using QuorvexTest::ExampleHistory;

TEST(PartitionStory, GivesEachRunsOutcomeAndTheChangeItBrought) {
    ExampleHistory example;
    EXPECT_EQ(history::partitionStoryText(example.database(),
                                          {QuorvexTest::gc_HistoryMachine, "lpar2", "cons-a"}, 0),
              R"(lpar2 on 8233-E8B_10ABCDE (cons-a): listed by 4 runs

Runs
  Run  Started           Outcome         Change         Inventory  Reason
    1  2026-11-01 02:00  surveyed                       read
    2  2026-11-02 02:00  timed_out       newly failing  none       no answer within 1800 s
    4  2026-11-03 02:00  client_failure  still failing  none       the client ended with 12
    5  2026-11-04 02:00  surveyed        recovered      read
)");
}

TEST(PartitionStory, GivesTheComponentChangesFittedToTheTerminal) {
    ExampleHistory example;
    EXPECT_EQ(history::partitionStoryText(example.database(),
                                          {QuorvexTest::gc_HistoryMachine, "lpar1", "cons-a"}, 60),
              R"(lpar1 on 8233-E8B_10ABCDE (cons-a): listed by 4 runs

Runs
  Run  Started           Outcome   Change  Inventory  Reason
    1  2026-11-01 02:00  surveyed          read
    2  2026-11-02 02:00  surveyed          read
    4  2026-11-03 02:00  surveyed          read
    5  2026-11-04 02:00  surveyed          read

Component changes (3)
  Run  Change            Component   Name        Detail
    2  replaced          U78AB.001…  Ethernet …  serial YL1…
    4  property changed  U78AB.001…  System fi…  FW: 1.0 → …
    5  removed           U78AB.001…  SAS contr…
)");
}

TEST(PartitionStory, NamesTheConsolesThatListedAPartition) {
    ExampleHistory example;
    EXPECT_EQ(history::consolesListing(example.database(),
                                       {QuorvexTest::gc_HistoryOtherMachine, "web1", std::nullopt}),
              std::vector<std::string>{"cons-b"});
    EXPECT_TRUE(history::consolesListing(example.database(),
                                         {QuorvexTest::gc_HistoryMachine, "lpar9", std::nullopt})
                    .empty());
}

TEST(PartitionStory, JsonGivesRunsAndComponentEventsWithStableKeys) {
    ExampleHistory example;
    nlohmann::ordered_json const story = history::partitionStoryJson(
        example.database(), {QuorvexTest::gc_HistoryMachine, "lpar4", "cons-a"});
    EXPECT_EQ(story, nlohmann::ordered_json::parse(R"({
        "console": "cons-a", "machine": "8233-E8B_10ABCDE", "partition": "lpar4",
        "runs": [
          {"run": 4, "started": "2026-11-03T02:00:00+01:00", "outcome": "inactive",
           "status_text": "inactive", "reason": null, "inventory": "none",
           "inventory_problem": null, "failing_since_run": null, "runs_failing": null,
           "change": "appeared"},
          {"run": 5, "started": "2026-11-04T02:00:00+01:00", "outcome": "surveyed",
           "status_text": "surveyed", "reason": null, "inventory": "read",
           "inventory_problem": null, "failing_since_run": null, "runs_failing": null,
           "change": null}],
        "component_events": [
          {"run": 5, "kind": "added", "component": "U78AB.001.WZS0123-P1-C9",
           "component_name": "Fibre channel adapter", "property": null, "old_value": null,
           "new_value": null}]})"));
}

} // namespace
