#include "survey/Utility_VPD_XML.h"

#include "utility/Trace.h"
#include "vpd/Resource.h"

#include <string>

namespace Quorvex::PYLON::Utility_VPD_XML {

namespace {

constexpr char gc_HardwareClass[] = "com.zor.inventory.Hardware";
constexpr char gc_HardwareType[] = "Hardware";
constexpr char gc_DocumentVersion[] = "1.0";

} // namespace

void initialize_Default_VPD_ResourceSet(::Quorvex::VPD::ResourceSet& set,
                                        ::Quorvex::System::MTMS const& mtms) {
    // Kept for the inventory importers: see docs/compatibility.md#default-document
    ::std::string const machine = mtms.to_String("-", "-");
    ::Quorvex::VPD::Resource const resource(machine, machine);
    set.set_TimeStamp(::Utility::get_TimeStamp());
    set.set_Class(gc_HardwareClass);
    set.set_Type(gc_HardwareType);
    set.set_Version(gc_DocumentVersion);
    set.set_Resource(resource);
}

} // namespace Quorvex::PYLON::Utility_VPD_XML
