#include "survey/Quorvex_PYLON_VPD_Survey_ClientPartition_Utility.h"

#include "survey/Survey_Files.h"
#include "survey/System_Partition_2_VPD_Resource.h"
#include "survey/Utility_VPD_XML.h"
#include "transform/VPD_2_OStream.h"
#include "utility/Print.h"
#include "vpd/Property.h"
#include "vpd/Resource.h"
#include "vpd/ResourceList.h"

#include <algorithm>
#include <cctype>
#include <cerrno>
#include <cstdint>
#include <fstream>
#include <limits>
#include <stdexcept>

namespace Quorvex_PYLON_VPD_Survey_ClientPartition_Utility {

namespace {

// The list of the machine resource that holds the partition.
constexpr char gc_PartitionsList[] = "Partitions";
// The keyword of the failure reason.
constexpr char gc_ReasonKeyword[] = "VD";

// Builds the default document into set; false when the machine's identity
// cannot be put into it (a type-model without "-").
// Kept for the inventory importers: see docs/compatibility.md#no-document-without-dash
bool _u_build_DefaultDocument(Quorvex::System::Partition const& partition,
                              std::string const& reason, Quorvex::VPD::ResourceSet& set) {
    try {
        u_create_VPD_ResourceSet_forFailedPartition(partition, reason, set);
    } catch (std::out_of_range const&) {
        return false;
    }
    return true;
}

// errno of the call a stream saw fail; a stream that failed without one
// (it does not say why) reads as an input/output error.
int _u_get_FailedCallError() {
    return errno != 0 ? errno : EIO;
}

} // namespace

// Unreadable reads 0, not active. Kept for status-file scripts: see
// docs/compatibility.md#inactive-partition
unsigned int _u_get_ActiveStatus(Quorvex::System::Partition const& partition) {
    // Read as an unsigned stream would read it, without building one per
    // partition: leading blanks skipped, an optional sign ("-1" wraps around),
    // digits up to the first other character; no digits or a value beyond 32
    // bits reads 0.
    std::string const& text = partition.get_ActiveStatus();
    auto next = std::find_if_not(text.begin(), text.end(),
                                 [](unsigned char c) { return std::isspace(c) != 0; });
    bool const negative = next != text.end() && *next == '-';
    if (next != text.end() && (*next == '-' || *next == '+')) {
        ++next;
    }
    auto const digitsEnd =
        std::find_if_not(next, text.end(), [](unsigned char c) { return std::isdigit(c) != 0; });
    if (next == digitsEnd) {
        return 0;
    }
    std::uint64_t magnitude = 0;
    for (; next != digitsEnd; ++next) {
        magnitude = magnitude * 10 + static_cast<std::uint64_t>(*next - '0');
        if (magnitude > std::numeric_limits<unsigned int>::max()) {
            return 0;
        }
    }
    auto const value = static_cast<unsigned int>(magnitude);
    return negative ? 0u - value : value;
}

void u_create_VPD_ResourceSet_forFailedPartition(Quorvex::System::Partition const& partition,
                                                 std::string const& reason,
                                                 Quorvex::VPD::ResourceSet& set) {
    Quorvex::PYLON::Utility_VPD_XML::initialize_Default_VPD_ResourceSet(set, partition.get_MTMS());
    Quorvex::VPD::Resource resource;
    Transform::System_Partition_2_VPD_Resource()(partition, resource);
    resource.insert_Property(Quorvex::VPD::Property(gc_ReasonKeyword, reason));
    Quorvex::VPD::ResourceList partitions(gc_PartitionsList);
    partitions.insert(resource);
    set.get_Resource().insert_ResourceList(partitions);
}

int u_create_DefaultXML_forFailedPartition(Quorvex::System::Partition const& partition,
                                           std::string const& reason,
                                           std::string const& localFileName) {
    Quorvex::VPD::ResourceSet set;
    if (!_u_build_DefaultDocument(partition, reason, set)) {
        return 0;
    }
    errno = 0;
    // Written in place, as the console places a fetched document. Kept for the
    // inventory importers: see docs/compatibility.md#document-in-place
    std::ofstream document(Quorvex::PYLON::VPD::get_LocalResultPath(localFileName));
    if (!document) {
        return _u_get_FailedCallError();
    }
    Transform::VPD_2_OStream{document}(set);
    document.flush();
    // The first failing write leaves its errno; the stream writes nothing after it.
    int const writeError = document ? 0 : _u_get_FailedCallError();
    document.close();
    if (writeError == 0 && !document) {
        return _u_get_FailedCallError();
    }
    return writeError;
}

// Kept for the inventory importers: see docs/compatibility.md#failure-reason
std::string u_transform_RELAY_ReturnCode_2_String(Quorvex::RELAY::ReturnCode const& returnCode) {
    std::ostringstream text;
    text << "\n";
    DEBUG::STL::Print{text}(returnCode.get_Values());
    text << "\n" << std::endl;
    return text.str();
}

} // namespace Quorvex_PYLON_VPD_Survey_ClientPartition_Utility
