#include "fleet/Scheduler.h"

#include <gtest/gtest.h>

namespace {

using fleet::Scheduler;
using Unit = Scheduler::Unit;

Unit listing(std::size_t machine) {
    return {machine, std::nullopt};
}

Unit partition(std::size_t machine, std::size_t index) {
    return {machine, index};
}

TEST(Scheduler, ListingsStartFirstInMachineOrderWithinTheBound) {
    Scheduler scheduler(3, 2);
    EXPECT_EQ(scheduler.takeStartable(), (std::vector<Unit>{listing(0), listing(1)}));
    EXPECT_EQ(scheduler.runningCount(), 2U);
    EXPECT_TRUE(scheduler.takeStartable().empty());
}

TEST(Scheduler, PartitionsOfEarlierMachinesStartBeforeLaterListings) {
    Scheduler scheduler(2, 3);
    scheduler.takeStartable();
    scheduler.finish(listing(0));
    scheduler.setListed(0, {"1", "2", "3"});
    EXPECT_EQ(scheduler.takeStartable(), (std::vector<Unit>{partition(0, 0), partition(0, 1)}));
}

TEST(Scheduler, NeverMoreThanJobsRunAtOnce) {
    Scheduler scheduler(1, 4);
    scheduler.takeStartable();
    scheduler.finish(listing(0));
    std::vector<std::string> ids;
    ids.reserve(10);
    for (int i = 0; i < 10; ++i) {
        ids.push_back(std::to_string(i));
    }
    scheduler.setListed(0, ids);
    std::vector<Unit> running = scheduler.takeStartable();
    EXPECT_EQ(running.size(), 4U);
    std::size_t started = running.size();
    while (!running.empty()) {
        EXPECT_EQ(scheduler.runningCount(), running.size());
        EXPECT_LE(running.size(), 4U);
        scheduler.finish(running.front());
        running.erase(running.begin());
        for (auto const& unit : scheduler.takeStartable()) {
            running.push_back(unit);
            ++started;
        }
    }
    EXPECT_EQ(started, 10U);
    EXPECT_TRUE(scheduler.isFinished());
}

TEST(Scheduler, OneJobRunsPartitionsOneAfterTheOtherInListingOrder) {
    Scheduler scheduler(1, 1);
    scheduler.takeStartable();
    scheduler.finish(listing(0));
    scheduler.setListed(0, {"a", "b", "c"});
    std::vector<Unit> order;
    while (!scheduler.isFinished()) {
        auto const units = scheduler.takeStartable();
        ASSERT_EQ(units.size(), 1U);
        order.push_back(units.front());
        scheduler.finish(units.front());
    }
    EXPECT_EQ(order, (std::vector<Unit>{partition(0, 0), partition(0, 1), partition(0, 2)}));
}

TEST(Scheduler, DuplicatePartitionWaitsUntilEveryEarlierOccurrenceFinished) {
    Scheduler scheduler(1, 8);
    scheduler.takeStartable();
    scheduler.finish(listing(0));
    scheduler.setListed(0, {"7", "8", "7", "7"});
    EXPECT_EQ(scheduler.takeStartable(), (std::vector<Unit>{partition(0, 0), partition(0, 1)}));
    scheduler.finish(partition(0, 1));
    EXPECT_TRUE(scheduler.takeStartable().empty());
    scheduler.finish(partition(0, 0));
    EXPECT_EQ(scheduler.takeStartable(), (std::vector<Unit>{partition(0, 2)}));
    scheduler.finish(partition(0, 2));
    EXPECT_EQ(scheduler.takeStartable(), (std::vector<Unit>{partition(0, 3)}));
}

TEST(Scheduler, SameIdOnTwoMachinesRunsSideBySide) {
    Scheduler scheduler(2, 8);
    scheduler.takeStartable();
    scheduler.finish(listing(0));
    scheduler.finish(listing(1));
    scheduler.setListed(0, {"1"});
    scheduler.setListed(1, {"1"});
    EXPECT_EQ(scheduler.takeStartable(), (std::vector<Unit>{partition(0, 0), partition(1, 0)}));
}

TEST(Scheduler, MachineIsDoneOnlyWhenListedAndEveryPartitionFinished) {
    Scheduler scheduler(1, 8);
    EXPECT_FALSE(scheduler.isMachineDone(0));
    scheduler.takeStartable();
    scheduler.finish(listing(0));
    scheduler.setListed(0, {"1", "2"});
    scheduler.takeStartable();
    scheduler.finish(partition(0, 0));
    EXPECT_FALSE(scheduler.isMachineDone(0));
    scheduler.finish(partition(0, 1));
    EXPECT_TRUE(scheduler.isMachineDone(0));
    EXPECT_TRUE(scheduler.isFinished());
}

TEST(Scheduler, MachineWithoutPartitionsIsDoneOnceListed) {
    Scheduler scheduler(1, 8);
    scheduler.takeStartable();
    scheduler.finish(listing(0));
    scheduler.setListed(0, {});
    EXPECT_TRUE(scheduler.isMachineDone(0));
    EXPECT_TRUE(scheduler.isFinished());
}

TEST(Scheduler, AfterStopNothingStartsAndTheRunEndsWhenTheRunningFinish) {
    Scheduler scheduler(2, 8);
    scheduler.takeStartable();
    scheduler.stopStarting();
    scheduler.finish(listing(0));
    scheduler.setListed(0, {"1"});
    EXPECT_TRUE(scheduler.takeStartable().empty());
    EXPECT_FALSE(scheduler.isFinished());
    scheduler.finish(listing(1));
    EXPECT_TRUE(scheduler.isFinished());
}

TEST(Scheduler, ZeroJobsStillRunsOneAtATime) {
    Scheduler scheduler(2, 0);
    EXPECT_EQ(scheduler.takeStartable().size(), 1U);
}

} // namespace
