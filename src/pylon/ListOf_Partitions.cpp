#include "pylon/ListOf_Partitions.h"

#include "pylon/Listing_Utility.h"
#include "utility/StringUtility.h"

#include <cstddef>
#include <utility>

namespace Quorvex::PYLON {

namespace {

constexpr char gc_ListPartitions_Tool[] = "/opt/vtc/bin/lspartition -ix";
constexpr char gc_ListPartitions_MachineOption[] = " -c ";
constexpr char gc_Field_Delimiter[] = ",";
// Only machines of this object type have their partitions listed.
constexpr unsigned int gc_PartitionedObjectType = 0;

using Partition_Setter = void (::Quorvex::System::Partition::*)(std::string const&);

// The record's fields in the order the listing tool prints them; later fields are ignored.
constexpr Partition_Setter gc_Field_Setters[] = {
    &::Quorvex::System::Partition::set_PartitionID,
    &::Quorvex::System::Partition::set_IP,
    &::Quorvex::System::Partition::set_ActiveStatus,
    &::Quorvex::System::Partition::set_HostName,
    &::Quorvex::System::Partition::set_OperatingSystem_Name,
    &::Quorvex::System::Partition::set_OperatingSystem_Version,
};
constexpr std::size_t gc_NumberOf_Fields = sizeof(gc_Field_Setters) / sizeof(gc_Field_Setters[0]);

} // namespace

void ListOf_Partitions::getPartitions_FromMachine(::Quorvex::PYLON::Machine const& machine) {
    if (machine.get_ObjectType() != gc_PartitionedObjectType) {
        return;
    }
    ::Quorvex::System::MTMS const& mtms = machine.get_MTMS();
    // The identity goes to the shell unquoted. Kept for the console's scripts: see
    // docs/compatibility.md#no-escaping-command-line
    std::string const arguments = gc_ListPartitions_MachineOption + std::string(mtms);
    auto const records =
        ::Quorvex::PYLON::Listing_Utility::u_run_Listing(gc_ListPartitions_Tool, arguments);
    // One allocation for the whole listing: growing by doubling would hold
    // the old and the new copy at once, the run's peak of memory.
    reserve(size() + records.size());
    for (auto const& record : records) {
        _insert_Partition(mtms, record);
    }
}

void ListOf_Partitions::_insert_Partition(::Quorvex::System::MTMS const& mtms,
                                          std::string const& record) {
    if (record.empty()) {
        return;
    }
    std::vector<std::string> fields;
    ::StringUtility::splitString(record, gc_Field_Delimiter, fields);
    ::Quorvex::System::Partition partition;
    partition.set_MTMS(mtms);
    // As far as the record goes, untrimmed. Kept for the console's readers: see
    // docs/compatibility.md#listing-records
    for (std::size_t i = 0; i < fields.size() && i < gc_NumberOf_Fields; ++i) {
        (partition.*gc_Field_Setters[i])(fields[i]);
    }
    push_back(std::move(partition));
}

} // namespace Quorvex::PYLON
