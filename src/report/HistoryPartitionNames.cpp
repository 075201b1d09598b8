#include "report/HistoryPartitionNames.h"

#include "report/JsonMember.h"

#include <map>

namespace report {

std::vector<std::string> historyPartitionNames(nlohmann::ordered_json const& partitions) {
    std::vector<std::string> names;
    std::map<std::string, int> listed;
    for (nlohmann::ordered_json const& partition : partitions) {
        nlohmann::ordered_json const& host = member(partition, "host");
        std::string const name = host.is_string() ? host.get<std::string>() : "";
        int const times = ++listed[name];
        names.push_back(times == 1 ? name : name + " #" + std::to_string(times));
    }
    return names;
}

std::string historyMachineName(nlohmann::ordered_json const& machine) {
    nlohmann::ordered_json const& identity = member(machine, "identity");
    return identity.is_string() ? identity.get<std::string>() : "";
}

} // namespace report
