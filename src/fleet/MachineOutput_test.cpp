#include "fleet/MachineOutput.h"

#include "fleet/RunFiles.h"

#include <gtest/gtest.h>

#include <sstream>

namespace {

using fleet::MachineOutput;
using fleet::MachineRecord;
using fleet::ProgressLine;
using fleet::Scheduler;

// Machines whose listing has not ended write nothing and print nothing, so
// the order in which they are written shows without files being made.
std::vector<MachineRecord> unlistedMachines(std::size_t count) {
    std::vector<MachineRecord> machines(count);
    for (std::size_t index = 0; index < count; ++index) {
        machines[index].identity = "1234-ABC_1000" + std::to_string(index);
    }
    return machines;
}

void finishListing(Scheduler& scheduler, std::size_t machine) {
    scheduler.finish({machine, std::nullopt});
    scheduler.setListed(machine, {});
}

class MachineOutputTest : public ::testing::Test {
protected:
    std::ostringstream _terminal;
    ProgressLine _line{false, _terminal, -1};
};

TEST_F(MachineOutputTest, UnitTakesTheFirstFreeSlot) {
    std::vector<MachineRecord> const machines = unlistedMachines(1);
    MachineOutput output(machines, _line);
    EXPECT_EQ(output.takeSlot(), 0U);
    EXPECT_EQ(output.takeSlot(), 1U);
    EXPECT_EQ(output.takeSlot(), 2U);
    output.releaseSlot(1);
    output.releaseSlot(0);
    EXPECT_EQ(output.takeSlot(), 0U);
    EXPECT_EQ(output.takeSlot(), 1U);
    EXPECT_EQ(output.takeSlot(), 3U);
}

TEST_F(MachineOutputTest, SlotsPieceIsTheMachinesTracePieceOfThatSlot) {
    std::vector<MachineRecord> const machines = unlistedMachines(2);
    MachineOutput const output(machines, _line);
    EXPECT_EQ(output.tracePiece(1, 3), fleet::tracePiecePath(machines[1].identity, 3));
    EXPECT_NE(output.tracePiece(0, 3), output.tracePiece(1, 3));
}

// The second machine, done first, waits: nothing is written until the first
// is done, then both are.
TEST_F(MachineOutputTest, MachineDoneBeforeAnEarlierOneWaitsForIt) {
    std::vector<MachineRecord> const machines = unlistedMachines(2);
    Scheduler scheduler(machines.size(), 2);
    ASSERT_EQ(scheduler.takeStartable().size(), 2U);
    MachineOutput output(machines, _line);
    finishListing(scheduler, 1);
    output.writeReady(scheduler);
    EXPECT_FALSE(output.isAllWritten());
    finishListing(scheduler, 0);
    output.writeReady(scheduler);
    EXPECT_TRUE(output.isAllWritten());
}

TEST_F(MachineOutputTest, RunOverWritesEveryMachineLeftDoneOrNot) {
    std::vector<MachineRecord> const machines = unlistedMachines(2);
    Scheduler scheduler(machines.size(), 2);
    MachineOutput output(machines, _line);
    output.writeReady(scheduler);
    EXPECT_FALSE(output.isAllWritten());
    output.writeRest();
    EXPECT_TRUE(output.isAllWritten());
}

} // namespace
