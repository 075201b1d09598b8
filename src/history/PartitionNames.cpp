#include "history/PartitionNames.h"

#include <map>
#include <set>

namespace history {

std::vector<std::string> partitionNames(std::vector<report::PartitionSummary> const& partitions) {
    std::vector<std::string> names;
    names.reserve(partitions.size());
    std::map<std::string, int> timesSeen;
    std::set<std::string> taken;
    for (report::PartitionSummary const& partition : partitions) {
        std::string name = partition.host;
        // A console that names a host "db1 #2" beside db1 listed twice
        // still gives every partition a name of its own.
        while (!taken.insert(name).second) {
            name = partition.host + " #" + std::to_string(++timesSeen[partition.host] + 1);
        }
        names.push_back(name);
    }
    return names;
}

} // namespace history
