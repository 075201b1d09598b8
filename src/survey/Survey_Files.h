#pragma once

namespace Quorvex::PYLON::VPD {

// Names of the files a survey run writes. Constant arrays, so they are ready
// before any other unit's start-up code runs.

// The tool's name: the stem of its trace, status and result file names.
inline constexpr char gc_ProgramName[] = "quorvexPYLON_VPD_Survey_ClientPartition";
// The console folder under which the VPD and Trace folders lie; result file
// names are relative to it.
inline constexpr char gc_QuorvexDirectory[] = "/var/adm/quorvex/";
// The folder of the status and result files, relative to gc_QuorvexDirectory.
inline constexpr char gc_VPD_Folder[] = "VPD/";

} // namespace Quorvex::PYLON::VPD
