#include "system/Partition.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <stdexcept>
#include <string>
#include <vector>

using Quorvex::System::MTMS;
using Quorvex::System::Partition;

namespace {

MTMS machine() {
    return MTMS("1234-ABC", "10ABCDE");
}

Partition withIP(std::string const& id, std::string const& host, std::string const& ip) {
    Partition partition(machine(), id, host);
    partition.set_IP(ip);
    return partition;
}

} // namespace

TEST(Partition, DefaultConstructorLeavesEveryFieldEmpty) {
    Partition const partition;
    EXPECT_EQ(partition.get_MTMS().__StringValue(), "_");
    EXPECT_EQ(partition.get_PartitionID(), "");
    EXPECT_EQ(partition.get_HostName(), "");
    EXPECT_EQ(partition.get_IP(), "");
    EXPECT_EQ(partition.get_ActiveStatus(), "");
    EXPECT_EQ(partition.get_OperatingSystem_Name(), "");
    EXPECT_EQ(partition.get_OperatingSystem_Version(), "");
}

TEST(Partition, ThreeArgumentConstructorSetsIdentityAndLeavesTheRestEmpty) {
    Partition const partition(machine(), "3", "host3");
    EXPECT_EQ(partition.get_MTMS(), machine());
    EXPECT_EQ(partition.get_PartitionID(), "3");
    EXPECT_EQ(partition.get_HostName(), "host3");
    EXPECT_EQ(partition.get_IP(), "");
    EXPECT_EQ(partition.get_ActiveStatus(), "");
    EXPECT_EQ(partition.get_OperatingSystem_Name(), "");
    EXPECT_EQ(partition.get_OperatingSystem_Version(), "");
}

TEST(Partition, SettersAssignEachField) {
    Partition partition;
    partition.set_MTMS(MTMS("5678-DEF", "65XYZ12"));
    partition.set_PartitionID("7");
    partition.set_HostName("host7");
    partition.set_IP("10.1.1.17");
    partition.set_ActiveStatus("3");
    partition.set_OperatingSystem_Name("Zeph");
    partition.set_OperatingSystem_Version("5.3");
    EXPECT_EQ(std::string(partition.get_MTMS()), "5678-DEF_65XYZ12");
    EXPECT_EQ(partition.get_PartitionID(), "7");
    EXPECT_EQ(partition.get_HostName(), "host7");
    EXPECT_EQ(partition.get_IP(), "10.1.1.17");
    EXPECT_EQ(partition.get_ActiveStatus(), "3");
    EXPECT_EQ(partition.get_OperatingSystem_Name(), "Zeph");
    EXPECT_EQ(partition.get_OperatingSystem_Version(), "5.3");
}

TEST(Partition, StringValueIsMachineTextDashPartitionID) {
    Partition const partition(machine(), "3", "host3");
    EXPECT_EQ(partition.__StringValue(), "1234-ABC_10ABCDE-3");
    EXPECT_EQ(std::string(partition), "1234-ABC_10ABCDE-3");
}

TEST(Partition, ToStringReplacesDashAndJoinsWithSeparators) {
    EXPECT_EQ(Partition(machine(), "3", "h").to_String("*", "_", "_"), "1234*ABC_10ABCDE_3");
}

TEST(Partition, ToStringWithNullPointersEqualsToStringWithDashes) {
    Partition const partition(machine(), "3", "h");
    EXPECT_EQ(partition.to_String(nullptr, nullptr, nullptr), "1234-ABC-10ABCDE-3");
    EXPECT_EQ(partition.to_String(nullptr, nullptr, nullptr), partition.to_String("-", "-", "-"));
}

TEST(Partition, ToStringTakesEachNullPointerAsDash) {
    Partition const partition(machine(), "3", "h");
    EXPECT_EQ(partition.to_String("*", nullptr, "."), "1234*ABC-10ABCDE.3");
    EXPECT_EQ(partition.to_String(nullptr, "+", nullptr), "1234-ABC+10ABCDE-3");
}

TEST(Partition, ToStringOnMachineWithoutDashThrowsOutOfRange) {
    Partition const partition(MTMS(std::string("ABCDEFG")), "3", "h");
    EXPECT_THROW(partition.to_String("*", "_", "_"), std::out_of_range);
}

TEST(Partition, SortsPartitionIDAsTextSoTenComesBeforeTwo) {
    std::vector<Partition> partitions{Partition(machine(), "2", "a"),
                                      Partition(machine(), "10", "b")};
    std::sort(partitions.begin(), partitions.end());
    EXPECT_EQ(partitions[0].get_PartitionID(), "10");
    EXPECT_EQ(partitions[1].get_PartitionID(), "2");
}

TEST(Partition, EqualPartitionIDsSortByHostName) {
    std::vector<Partition> partitions{Partition(machine(), "4", "zulu"),
                                      Partition(machine(), "4", "alpha")};
    std::sort(partitions.begin(), partitions.end());
    EXPECT_EQ(partitions[0].get_HostName(), "alpha");
    EXPECT_EQ(partitions[1].get_HostName(), "zulu");
}

TEST(Partition, MachineIdentityDecidesBeforePartitionID) {
    Partition const first(MTMS("1234-ABC", "10ABCDE"), "9", "z");
    Partition const second(MTMS("1234-ABC", "20ABCDE"), "1", "a");
    EXPECT_TRUE(first < second);
    EXPECT_FALSE(second < first);
}

TEST(Partition, OtherFieldsTakeNoPartInTheOrder) {
    Partition a = withIP("4", "host", "10.0.0.1");
    Partition b = withIP("4", "host", "10.0.0.2");
    a.set_ActiveStatus("1");
    b.set_OperatingSystem_Name("Zeph");
    EXPECT_FALSE(a < b);
    EXPECT_FALSE(b < a);
}

TEST(Partition, CopyKeepsEveryField) {
    Partition original = withIP("4", "host", "10.0.0.1");
    original.set_OperatingSystem_Version("2.6");
    Partition copy;
    copy = original;
    EXPECT_EQ(copy.__StringValue(), "1234-ABC_10ABCDE-4");
    EXPECT_EQ(copy.get_IP(), "10.0.0.1");
    EXPECT_EQ(copy.get_OperatingSystem_Version(), "2.6");
}
