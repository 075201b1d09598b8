#include "fleet/PartitionName.h"

namespace fleet {

std::string shownName(Quorvex::System::Partition const& partition) {
    return partition.get_HostName().empty() ? std::string(partition) : partition.get_HostName();
}

} // namespace fleet
