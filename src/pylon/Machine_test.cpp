#include "pylon/Machine.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <vector>

using Quorvex::PYLON::Machine;
using Quorvex::System::MTMS;

TEST(Machine, DefaultConstructorGivesObjectTypeZeroAndEmptyIdentity) {
    Machine const machine;
    EXPECT_EQ(machine.get_ObjectType(), 0U);
    EXPECT_EQ(std::string(machine.get_MTMS()), "_");
}

TEST(Machine, ConstructorStoresObjectTypeAndIdentity) {
    Machine const machine(2U, MTMS("1234-ABC", "10ABCDE"));
    EXPECT_EQ(machine.get_ObjectType(), 2U);
    EXPECT_EQ(std::string(machine.get_MTMS()), "1234-ABC_10ABCDE");
}

TEST(Machine, CopyAndAssignmentCopyBothFields) {
    Machine const original(4294967295U, MTMS("1234-ABC", "10ABCDE"));
    Machine assigned;
    assigned = Machine(original);
    EXPECT_EQ(assigned.get_ObjectType(), 4294967295U);
    EXPECT_EQ(std::string(assigned.get_MTMS()), "1234-ABC_10ABCDE");
}

TEST(Machine, SmallerObjectTypeSortsFirstWhateverTheIdentity) {
    EXPECT_TRUE(Machine(0U, MTMS("Z", "9")) < Machine(1U, MTMS("A", "1")));
    EXPECT_FALSE(Machine(1U, MTMS("A", "1")) < Machine(0U, MTMS("Z", "9")));
}

TEST(Machine, EqualObjectTypesSortByIdentityText) {
    EXPECT_TRUE(Machine(0U, MTMS("A", "2")) < Machine(0U, MTMS("Z", "9")));
    EXPECT_FALSE(Machine(0U, MTMS("Z", "9")) < Machine(0U, MTMS("A", "2")));
    EXPECT_FALSE(Machine(0U, MTMS("A_B", "C")) < Machine(0U, MTMS("A", "B_C")));
}

TEST(Machine, SortingByTypeThenIdentity) {
    std::vector<Machine> machines{Machine(1U, MTMS("B", "1")), Machine(0U, MTMS("Z", "9")),
                                  Machine(0U, MTMS("A", "2"))};
    std::sort(machines.begin(), machines.end());
    std::vector<std::string> order(machines.size());
    std::transform(machines.begin(), machines.end(), order.begin(), [](Machine const& machine) {
        return std::to_string(machine.get_ObjectType()) + ":" + std::string(machine.get_MTMS());
    });
    EXPECT_EQ(order, (std::vector<std::string>{"0:A_2", "0:Z_9", "1:B_1"}));
}
