#include "history/PartitionNames.h"

#include <gtest/gtest.h>

namespace {

std::vector<report::PartitionSummary> hosts(std::vector<std::string> const& names) {
    std::vector<report::PartitionSummary> partitions;
    for (std::string const& name : names) {
        report::PartitionSummary partition;
        partition.host = name;
        partitions.push_back(partition);
    }
    return partitions;
}

TEST(PartitionNames, HostNamesAsListed) {
    EXPECT_EQ(history::partitionNames(hosts({"db1", "app1"})),
              (std::vector<std::string>{"db1", "app1"}));
}

TEST(PartitionNames, HostListedAgainIsNumberedFromTwoInListingOrder) {
    EXPECT_EQ(history::partitionNames(hosts({"db1", "app1", "db1", "db1"})),
              (std::vector<std::string>{"db1", "app1", "db1 #2", "db1 #3"}));
}

TEST(PartitionNames, PartitionsWithoutHostNameAreNumberedToo) {
    EXPECT_EQ(history::partitionNames(hosts({"", ""})), (std::vector<std::string>{"", " #2"}));
}

TEST(PartitionNames, HostNamedLikeANumberedOneStillGetsANameOfItsOwn) {
    EXPECT_EQ(history::partitionNames(hosts({"db1 #2", "db1", "db1"})),
              (std::vector<std::string>{"db1 #2", "db1", "db1 #3"}));
}

TEST(PartitionNames, NoPartitionsNoNames) {
    EXPECT_TRUE(history::partitionNames({}).empty());
}

} // namespace
