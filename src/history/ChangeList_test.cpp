#include "HistoryFixture.h"
#include "history/ChangeList.h"

#include <gtest/gtest.h>

namespace {

using QuorvexTest::ExampleHistory;

history::ChangeSelection ofRun(std::optional<long long> run) {
    history::ChangeSelection selection;
    selection.run = run;
    return selection;
}

TEST(ChangeList, ShowsTheNewestRunByDefault) {
    ExampleHistory example;
    EXPECT_EQ(history::changeListText(example.database(), ofRun(std::nullopt), 0),
              R"(Changes of run 5 of cons-a, started 2026-11-04 02:00, since run 4

Recoveries (1)
  Machine           Partition  Outcome
  8233-E8B_10ABCDE  lpar2      surveyed

Machine listing (1)
  Machine           Change             Reason
  9119-MHE_21ABCDE  listing recovered

Inventory changes (2)
  Machine           Partition  Change   Component                Name                   Detail
  8233-E8B_10ABCDE  lpar1      removed  U78AB.001.WZS0123-P1-C3  SAS controller
  8233-E8B_10ABCDE  lpar4      added    U78AB.001.WZS0123-P1-C9  Fibre channel adapter
)");
}

TEST(ChangeList, GroupsEveryKindOfChangeOfARun) {
    ExampleHistory example;
    EXPECT_EQ(history::changeListText(example.database(), ofRun(4), 0),
              R"(Changes of run 4 of cons-a, started 2026-11-03 02:00, since run 2

Still failing (1)
  Machine           Partition  Outcome         Since run  Runs  Reason
  8233-E8B_10ABCDE  lpar2      client_failure          2     2  the client ended with 12

Appeared (2)
  Machine           Partition
  8233-E8B_10ABCDE  lpar4
  9119-MHE_21ABCDE  (whole machine)

Disappeared (1)
  Machine           Partition
  8233-E8B_10ABCDE  lpar3

Machine listing (1)
  Machine           Change          Reason
  9119-MHE_21ABCDE  listing failed  lspartition ended with 1: no such machine

Inventory changes (1)
  Machine           Partition  Change            Component             Name             Detail
  8233-E8B_10ABCDE  lpar1      property changed  U78AB.001.WZS0123-P1  System firmware  FW: 1.0 → 1.1, "service pack"
)");
}

TEST(ChangeList, NarrowsNamesAndReasonsToTheTerminal) {
    ExampleHistory example;
    EXPECT_EQ(history::changeListText(example.database(), ofRun(4), 64),
              R"(Changes of run 4 of cons-a, started 2026-11-03 02:00, since run…

Still failing (1)
  Machine   Partiti…  Outcome         Since run  Runs  Reason
  8233-E8…  lpar2     client_failure          2     2  the clie…

Appeared (2)
  Machine           Partition
  8233-E8B_10ABCDE  lpar4
  9119-MHE_21ABCDE  (whole machine)

Disappeared (1)
  Machine           Partition
  8233-E8B_10ABCDE  lpar3

Machine listing (1)
  Machine           Change          Reason
  9119-MHE_21ABCDE  listing failed  lspartition ended with 1: n…

Inventory changes (1)
  Machine  Partit…  Change            Compon…  Name     Detail
  8233-E…  lpar1    property changed  U78AB.…  System…  FW: 1.0…
)");
}

TEST(ChangeList, SaysAConsolesFirstRunHasNothingToCompareWith) {
    ExampleHistory example;
    EXPECT_EQ(
        history::changeListText(example.database(), ofRun(1), 0),
        R"(Changes of run 1 of cons-a, started 2026-11-01 02:00: the console's first recorded run, nothing to compare with

No change.
)");
}

TEST(ChangeList, SinceADateShowsEachRunsEventsAndAStillFailingPartitionOnce) {
    ExampleHistory example;
    history::ChangeSelection selection;
    selection.sinceUnix = 0;
    selection.sinceText = "2026-10-01";
    selection.console = "cons-a";
    EXPECT_EQ(history::changeListText(example.database(), selection, 0),
              R"(Changes since 2026-10-01 on cons-a: 4 runs, 1 to 5

New failures (1)
  Run  Machine           Partition  Outcome    Reason
    2  8233-E8B_10ABCDE  lpar2      timed_out  no answer within 1800 s

Still failing (1)
  Run  Machine           Partition  Outcome         Since run  Runs  Reason
    4  8233-E8B_10ABCDE  lpar2      client_failure          2     2  the client ended with 12

Recoveries (1)
  Run  Machine           Partition  Outcome
    5  8233-E8B_10ABCDE  lpar2      surveyed

Appeared (2)
  Run  Machine           Partition
    4  8233-E8B_10ABCDE  lpar4
    4  9119-MHE_21ABCDE  (whole machine)

Disappeared (1)
  Run  Machine           Partition
    4  8233-E8B_10ABCDE  lpar3

Machine listing (2)
  Run  Machine           Change             Reason
    4  9119-MHE_21ABCDE  listing failed     lspartition ended with 1: no such machine
    5  9119-MHE_21ABCDE  listing recovered

Inventory changes (4)
  Run  Machine           Partition  Change            Component                Name                   Detail
    2  8233-E8B_10ABCDE  lpar1      replaced          U78AB.001.WZS0123-P1-C7  Ethernet adapter       serial YL10A → YL10B
    4  8233-E8B_10ABCDE  lpar1      property changed  U78AB.001.WZS0123-P1     System firmware        FW: 1.0 → 1.1, "service pack"
    5  8233-E8B_10ABCDE  lpar1      removed           U78AB.001.WZS0123-P1-C3  SAS controller
    5  8233-E8B_10ABCDE  lpar4      added             U78AB.001.WZS0123-P1-C9  Fibre channel adapter
)");
}

TEST(ChangeList, SinceALaterDateSaysNoRunWasRecorded) {
    ExampleHistory example;
    history::ChangeSelection selection;
    selection.sinceUnix = 4102444800;
    selection.sinceText = "2100-01-01";
    EXPECT_EQ(history::changeListText(example.database(), selection, 0),
              "Changes since 2100-01-01: no run recorded\n");
}

TEST(ChangeList, JsonGivesEveryGroupWithStableKeys) {
    ExampleHistory example;
    nlohmann::ordered_json const changes = history::changeListJson(example.database(), ofRun(5));
    nlohmann::ordered_json const expected = nlohmann::ordered_json::parse(R"({
        "run": {"id": 5, "console": "cons-a", "started": "2026-11-04T02:00:00+01:00",
                "previous_run": 4},
        "since": null, "runs": [5], "new_failures": [], "still_failing": [],
        "recoveries": [{"run": 5, "console": "cons-a", "scope": "partition",
            "kind": "recovered", "machine": "8233-E8B_10ABCDE", "partition": "lpar2",
            "component": null, "component_name": null, "property": null, "old_value": null,
            "new_value": null, "outcome": "surveyed", "reason": null,
            "failing_since_run": null, "runs_failing": null}],
        "newly_inactive": [], "appeared": [], "disappeared": [],
        "machine_listing": [{"run": 5, "console": "cons-a", "scope": "machine",
            "kind": "listing_recovered", "machine": "9119-MHE_21ABCDE", "partition": null,
            "component": null, "component_name": null, "property": null, "old_value": null,
            "new_value": null, "outcome": null, "reason": null,
            "failing_since_run": null, "runs_failing": null}],
        "inventory": [{"run": 5, "console": "cons-a", "scope": "component",
            "kind": "removed", "machine": "8233-E8B_10ABCDE", "partition": "lpar1",
            "component": "U78AB.001.WZS0123-P1-C3", "component_name": "SAS controller",
            "property": null, "old_value": null, "new_value": null, "outcome": null,
            "reason": null, "failing_since_run": null, "runs_failing": null},
            {"run": 5, "console": "cons-a", "scope": "component",
            "kind": "added", "machine": "8233-E8B_10ABCDE", "partition": "lpar4",
            "component": "U78AB.001.WZS0123-P1-C9", "component_name": "Fibre channel adapter",
            "property": null, "old_value": null, "new_value": null, "outcome": null,
            "reason": null, "failing_since_run": null, "runs_failing": null}]})");
    EXPECT_EQ(changes, expected);
}

TEST(ChangeList, JsonWithoutAnyRunHasNoRun) {
    QuorvexTest::TemporaryDirectory folder;
    QuorvexTest::HistoryFixture empty(folder.file("history.sqlite"));
    nlohmann::ordered_json const changes =
        history::changeListJson(empty.database(), ofRun(std::nullopt));
    EXPECT_TRUE(changes["run"].is_null());
    EXPECT_EQ(changes["runs"], nlohmann::ordered_json::array());
    EXPECT_EQ(changes["inventory"], nlohmann::ordered_json::array());
}

} // namespace
