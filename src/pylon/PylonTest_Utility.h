#pragma once
// Helpers of the console listing tests: readable forms of the parsed records
// and the command lines that the shell command runner traced.

#include "pylon/ListOf_Machines.h"
#include "pylon/ListOf_Partitions.h"

#include <functional>
#include <string>
#include <vector>

namespace PylonTest_Utility {

// "objectType|typeModel|serial" for every machine, in list order.
std::vector<std::string> u_describe(::Quorvex::PYLON::ListOf_Machines const& machines);

// "MTMS|PartitionID|IP|ActiveStatus|HostName|OS name|OS version" for every
// record, in list order.
std::vector<std::string> u_describe(::Quorvex::PYLON::ListOf_Partitions const& partitions);

// Runs work in a freshly started copy of the test program whose trace file is
// traceName in the trace folder, and returns the command lines traced there,
// with the generated part of each temporary file name replaced by "XXXXXX".
std::vector<std::string> u_tracedCommandLines(std::string const& traceName,
                                              std::function<void()> const& work);

// For use as the statement of EXPECT_EXIT: in a mount namespace of its own,
// makes /tmp read-only (its files stay readable), so that no shell command can
// make its output files, then exits with 0 when check() holds, 1 when it does
// not and 2 when /tmp could not be made read-only.
void u_exitWithReadOnlyTmp(std::function<bool()> const& check);

} // namespace PylonTest_Utility
