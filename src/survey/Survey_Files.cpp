#include "survey/Survey_Files.h"

#include "utility/StringUtility.h"

namespace Quorvex::PYLON::VPD {

namespace {

// The console folder under which the VPD and Trace folders lie: the only
// place in the tool that names it. The tool never creates the two folders;
// the installation does.
// Kept for the console's readers: see docs/compatibility.md#file-names
// and docs/compatibility.md#result-folders
constexpr char gc_QuorvexDirectory[] = "/var/adm/quorvex/";
// The folder of the status and result files, relative to gc_QuorvexDirectory.
constexpr char gc_VPD_Folder[] = "VPD/";
constexpr char gc_Trace_Folder[] = "Trace/";

constexpr char gc_TraceSuffix[] = ".Trace";
constexpr char gc_StatusSuffix[] = ".status";
constexpr char gc_ResultSuffix[] = ".VPD.xml";
constexpr char gc_ClientOutputSuffix[] = ".QuorvexOutput";
// Between the program name and the identity in the status and result names.
constexpr char gc_NameSeparator[] = "_";

// What lies between the program name with its separator and suffix in a file
// name; nothing when the name does not have both.
std::optional<std::string> u_strip_FileName(std::string const& fileName,
                                            std::string const& suffix) {
    std::string const prefix = std::string(gc_ProgramName) + gc_NameSeparator;
    if (fileName.size() < prefix.size() + suffix.size() ||
        fileName.compare(0, prefix.size(), prefix) != 0 ||
        fileName.compare(fileName.size() - suffix.size(), suffix.size(), suffix) != 0) {
        return std::nullopt;
    }
    return fileName.substr(prefix.size(), fileName.size() - prefix.size() - suffix.size());
}

} // namespace

std::string get_TraceFileName() {
    return std::string(gc_QuorvexDirectory) + gc_Trace_Folder + gc_ProgramName + gc_TraceSuffix;
}

std::string get_MachineTraceFileName(std::string const& machineIdentity) {
    return gc_QuorvexDirectory + get_MachineTraceName(machineIdentity);
}

std::string get_MachineTraceName(std::string const& machineIdentity) {
    return StringUtility::concatenate(
        {gc_Trace_Folder, gc_ProgramName, gc_NameSeparator, machineIdentity, gc_TraceSuffix});
}

std::string get_StatusFileName(std::string const& machineIdentity) {
    return std::string(gc_QuorvexDirectory) + gc_VPD_Folder + gc_ProgramName + gc_NameSeparator +
           machineIdentity + gc_StatusSuffix;
}

std::optional<std::string> get_IdentityOfStatusFileName(std::string const& fileName) {
    return u_strip_FileName(fileName, gc_StatusSuffix);
}

// Two listed partitions of one identity share it. Kept for the inventory importers: see
// docs/compatibility.md#shared-result-file
std::string get_LocalResultName(std::string const& partitionText) {
    return StringUtility::concatenate(
        {gc_VPD_Folder, gc_ProgramName, gc_NameSeparator, partitionText, gc_ResultSuffix});
}

std::optional<std::string> get_PartitionTextOfResultName(std::string const& fileName) {
    return u_strip_FileName(fileName, gc_ResultSuffix);
}

std::string get_LocalResultPath(std::string const& localResultName) {
    return gc_QuorvexDirectory + localResultName;
}

std::string get_RemoteResultName(std::string const& partitionText) {
    return StringUtility::concatenate({partitionText, gc_ResultSuffix});
}

std::string get_ClientOutputName(std::string const& partitionText) {
    return StringUtility::concatenate({partitionText, gc_ClientOutputSuffix});
}

} // namespace Quorvex::PYLON::VPD
