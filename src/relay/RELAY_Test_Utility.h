#pragma once

#include "system/MTMS.h"
#include "system/Partition.h"

#include <string>

namespace Quorvex::RELAY {

// Partitions the remote channel tests address: machine 1234-ABC, serial
// 10ABCDE, the given partition identifier.
inline Quorvex::System::Partition u_make_TestPartition(std::string const& partitionID = "3") {
    return Quorvex::System::Partition(Quorvex::System::MTMS("1234-ABC", "10ABCDE"), partitionID,
                                      "p" + partitionID + ".example");
}

} // namespace Quorvex::RELAY
