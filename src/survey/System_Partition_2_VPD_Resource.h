#pragma once

#include "system/Partition.h"
#include "vpd/Resource.h"

namespace Transform {

// A partition record as a VPD resource: named after its host name (its
// identity text when it has none), identified by its identity text, with the
// properties "HN", "OS", "PT", "SE" and "TM".
class System_Partition_2_VPD_Resource {
public:
    // Fills resource and returns it. Throws std::out_of_range when the
    // machine's type-model holds no "-".
    Quorvex::VPD::Resource& operator()(Quorvex::System::Partition const& partition,
                                       Quorvex::VPD::Resource& resource) const;
};

} // namespace Transform
