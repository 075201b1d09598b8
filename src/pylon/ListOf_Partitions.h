#pragma once

#include "pylon/Machine.h"
#include "system/MTMS.h"
#include "system/Partition.h"

#include <string>
#include <vector>

namespace Quorvex::PYLON {

// Partition records as the console's partition listing tool prints them.
class ListOf_Partitions : public std::vector<::Quorvex::System::Partition> {
public:
    ListOf_Partitions() = default;

    // Appends the partitions of one machine; only machines of object type 0
    // have their partitions listed.
    void getPartitions_FromMachine(::Quorvex::PYLON::Machine const& machine);

private:
    void _insert_Partition(::Quorvex::System::MTMS const& mtms, std::string const& record);
};

} // namespace Quorvex::PYLON
