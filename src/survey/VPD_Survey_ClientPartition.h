#pragma once

#include <string>

// Surveys every partition of the managed machine whose identity (type-model
// "_" serial) is given: writes the machine's status file (see Survey_Files.h),
// one line per listed partition; prints each local VPD file name on standard
// output and its code on standard error; and ends with the overall code on
// standard error.
void VPD_Survey_ClientPartition(std::string const& machineIdentity);
