#pragma once

#include "system/MTMS.h"
#include "vpd/ResourceSet.h"

namespace Quorvex::PYLON::Utility_VPD_XML {

// Gives set the attributes of a hardware survey (current time stamp, class
// "com.zor.inventory.Hardware", type "Hardware", version "1.0") and the
// machine as its resource, named and identified by its type-model and serial
// joined by "-". Throws std::out_of_range, leaving set unchanged, when the
// type-model holds no "-".
void initialize_Default_VPD_ResourceSet(::Quorvex::VPD::ResourceSet& set,
                                        ::Quorvex::System::MTMS const& mtms);

} // namespace Quorvex::PYLON::Utility_VPD_XML
