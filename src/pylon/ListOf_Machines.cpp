#include "pylon/ListOf_Machines.h"

#include "pylon/Listing_Utility.h"
#include "system/MTMS.h"
#include "system/MTMS_Utility.h"
#include "utility/StringUtility.h"

#include <cstdint>
#include <sstream>

namespace Quorvex::PYLON {

namespace {

constexpr char gc_ListMachines_Tool[] = "/opt/lsvtc/bin/lsvtc";
constexpr char gc_ListMachines_Arguments[] = " -t0";
// An entry is object type ":" machine name; anything after a second ":" is ignored.
constexpr char gc_Field_Delimiter[] = ":";
constexpr int gc_Minimum_Fields = 2;

} // namespace

ListOf_Machines::ListOf_Machines() {
    _initialize();
}

void ListOf_Machines::_initialize() {
    for (auto const& entry : ::Quorvex::PYLON::Listing_Utility::u_run_Listing(
             gc_ListMachines_Tool, gc_ListMachines_Arguments)) {
        _insert_Machine(entry);
    }
}

void ListOf_Machines::_insert_Machine(std::string const& entry) {
    if (entry.empty()) {
        return;
    }
    std::vector<std::string> fields;
    if (::StringUtility::splitString(entry, gc_Field_Delimiter, fields) < gc_Minimum_Fields) {
        return;
    }
    // Read as 64 bits and narrowed, so "-1" gives 4294967295 and 4294967296 gives 0;
    // leading blanks are skipped and text after the digits is ignored.
    // Kept for the console's readers: see docs/compatibility.md#machine-listing
    unsigned long long objectType = 0;
    std::istringstream objectTypeText(fields[0]);
    if (!(objectTypeText >> objectType)) {
        return;
    }
    std::string typeModel;
    std::string serial;
    ::Quorvex::System::MTMS_Utility::u_split_TM_SE(fields[1], typeModel, serial);
    push_back(::Quorvex::PYLON::Machine(static_cast<std::uint32_t>(objectType),
                                        ::Quorvex::System::MTMS(typeModel, serial)));
}

} // namespace Quorvex::PYLON
