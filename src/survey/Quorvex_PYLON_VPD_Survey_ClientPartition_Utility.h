#pragma once

#include "relay/ReturnCode.h"
#include "system/Partition.h"
#include "vpd/ResourceSet.h"

#include <string>

// The survey loop's small routines and the default VPD document that a
// partition gets when it was tried and could not be surveyed.
namespace Quorvex_PYLON_VPD_Survey_ClientPartition_Utility {

// The partition's active status read as an unsigned number; 0 when the text
// does not start with one (blanks before the digits are skipped).
unsigned int _u_get_ActiveStatus(Quorvex::System::Partition const& partition);

// Fills set with the default document of a failed partition: the machine as
// the set's resource, holding a "Partitions" list with the partition, whose
// last property "VD" carries the reason. Throws std::out_of_range when the
// machine's type-model holds no "-".
void u_create_VPD_ResourceSet_forFailedPartition(Quorvex::System::Partition const& partition,
                                                 std::string const& reason,
                                                 Quorvex::VPD::ResourceSet& set);

// Writes the default document of a failed partition to the path of the
// local result name localFileName (see Survey_Files.h), replacing an earlier
// file. Nothing is written when the file cannot be opened or the machine's
// identity cannot be put into the document. Returns errno of the open or
// write that failed, 0 otherwise; the survey tool itself says nothing about
// it, quorvex-survey reports it (its callers read the result, the bytes and
// the name of the file stay as they are).
[[nodiscard]] int
u_create_DefaultXML_forFailedPartition(Quorvex::System::Partition const& partition,
                                       std::string const& reason, std::string const& localFileName);

// "\n", the return code's pairs one a line as "[key] = value" with the keys
// right-aligned, then "\n" and a line end.
std::string u_transform_RELAY_ReturnCode_2_String(Quorvex::RELAY::ReturnCode const& returnCode);

} // namespace Quorvex_PYLON_VPD_Survey_ClientPartition_Utility
