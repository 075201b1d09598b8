#pragma once
// Names the tests share: the folders the tool writes into, the machine the
// examples survey, and where the source tree lies.

#include "system/Partition.h"

#include <string>

namespace QuorvexTest {

// The result folders at the console's fixed paths; inside a sandbox they are
// fresh empty folders.
inline constexpr char gc_VPD_Folder[] = "/var/adm/quorvex/VPD";
inline constexpr char gc_TraceFolder[] = "/var/adm/quorvex/Trace";

// What the tool prints on standard error before the run's code.
inline constexpr char gc_ReturnCodeHeading[] =
    "\nquorvexPYLON_VPD_Survey_ClientPartition ReturnCode: \n";

// The machine most examples survey: type-model 1234-ABC, serial 10ABCDE.
inline constexpr char gc_ExampleTypeModel[] = "1234-ABC";
inline constexpr char gc_ExampleSerial[] = "10ABCDE";
inline constexpr char gc_ExampleIdentity[] = "1234-ABC_10ABCDE";

// A partition of the example machine with the given identifier, named
// "p<id>.example".
Quorvex::System::Partition examplePartition(std::string const& partitionID = "3");

// The exit status of tools/sandbox, and of a sandboxed test, when no sandbox
// can be made here; ctest counts it as skipped.
inline constexpr int gc_SandboxUnavailable = 77;

// Absolute path of the source tree.
std::string sourceRoot();

// Absolute path of an expected-output file kept under tests/expected/, named
// relative to that folder (see ExpectedOutput.h).
std::string expectedOutputFile(std::string const& relativePath);

} // namespace QuorvexTest
