#include "pylon/Utility.h"

#include "pylon/ListOf_Machines.h"

#include <algorithm>

namespace Quorvex::PYLON::Utility {

int get_AllManagedPartitions(::Quorvex::PYLON::ListOf_Partitions& partitions) {
    ::Quorvex::PYLON::ListOf_Machines machines;
    if (!partitions.empty()) {
        partitions.erase(partitions.begin(), partitions.end());
    }
    // Stable, so equal keys keep the order in which the console printed them.
    std::stable_sort(machines.begin(), machines.end());
    for (auto const& machine : machines) {
        partitions.getPartitions_FromMachine(machine);
    }
    std::stable_sort(partitions.begin(), partitions.end());
    return static_cast<int>(partitions.size());
}

} // namespace Quorvex::PYLON::Utility
