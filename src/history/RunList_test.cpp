#include "HistoryFixture.h"
#include "history/RunList.h"

#include <gtest/gtest.h>

namespace {

using QuorvexTest::ExampleHistory;

TEST(RunList, ListsEveryRunOldestFirstWithItsCounts) {
    ExampleHistory example;
    EXPECT_EQ(
        history::runListText(example.database(), {std::nullopt, 0}, 0),
        R"(Run  Console  Started             Took         Exit  Surveyed  Failed  New  Recov  Inv
  1  cons-a   2026-11-01 02:00  1m 12s            0       3/3       0    0      0    0
  2  cons-a   2026-11-02 02:00  3m 05s            4       2/3       1    1      0    1
  3  cons-b   2026-11-02 03:00      9s            0       1/1       0    0      0    0
  4  cons-a   2026-11-03 02:00     41s  143 SIGTERM       1/3       1    0      0    1
  5  cons-a   2026-11-04 02:00  2m 00s            0       3/3       0    0      1    2
)");
}

TEST(RunList, NarrowsTheConsoleAndCutsLinesToTheTerminal) {
    ExampleHistory example;
    EXPECT_EQ(history::runListText(example.database(), {std::nullopt, 0}, 50),
              R"(Run  Conso…  Started             Took         Exi…
  1  cons-a  2026-11-01 02:00  1m 12s            …
  2  cons-a  2026-11-02 02:00  3m 05s            …
  3  cons-b  2026-11-02 03:00      9s            …
  4  cons-a  2026-11-03 02:00     41s  143 SIGTER…
  5  cons-a  2026-11-04 02:00  2m 00s            …
)");
}

TEST(RunList, GivesTheNewestRunsOfOneConsole) {
    ExampleHistory example;
    EXPECT_EQ(
        history::runListText(example.database(), {"cons-a", 2}, 0),
        R"(Run  Console  Started             Took         Exit  Surveyed  Failed  New  Recov  Inv
  4  cons-a   2026-11-03 02:00     41s  143 SIGTERM       1/3       1    0      0    1
  5  cons-a   2026-11-04 02:00  2m 00s            0       3/3       0    0      1    2
)");
}

TEST(RunList, SaysWhenAConsoleHasNoRun) {
    ExampleHistory example;
    EXPECT_EQ(history::runListText(example.database(), {"cons-z", 0}, 0),
              "No run of cons-z recorded.\n");
}

TEST(RunList, JsonGivesEveryRunWithStableKeys) {
    ExampleHistory example;
    nlohmann::ordered_json const runs = history::runListJson(example.database(), {"cons-a", 1});
    EXPECT_EQ(runs, nlohmann::ordered_json::parse(R"({"runs": [{
        "id": 5, "console": "cons-a", "started": "2026-11-04T02:00:00+01:00",
        "ended": "2026-11-04T02:02:00+01:00", "seconds": 120, "exit_status": 0,
        "return_code": "0", "interrupted": null, "partitions": 3, "surveyed": 3, "failed": 0,
        "new_failures": 0, "recoveries": 1, "inventory_changes": 2}]})"));
}

} // namespace
