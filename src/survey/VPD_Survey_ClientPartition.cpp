#include "survey/VPD_Survey_ClientPartition.h"

#include "pylon/ListOf_Partitions.h"
#include "pylon/Machine.h"
#include "survey/Survey_ClientPartition.h"
#include "survey/Survey_Files.h"
#include "survey/calculate_ReturnCode.h"
#include "system/MTMS.h"

#include <fstream>
#include <iostream>
#include <vector>

namespace {

// Also when the listing failed. Kept for status-file scripts: see
// docs/compatibility.md#no-partition-found
constexpr char gc_NoPartitions[] = "No ACTIVE Partition Found.";
// Only machines of this object type have their partitions listed.
constexpr unsigned int gc_ManagedMachineType = 0;

// Per partition: the file name on standard output and the code on standard
// error when a file name was recorded, and in every case the status line.
void u_report_Partitions(Quorvex::PYLON::ListOf_Partitions const& partitions,
                         std::vector<std::string> const& fileNames,
                         std::vector<std::string> const& returnCodes,
                         std::vector<std::string> const& statusTexts, std::ostream& status) {
    for (std::size_t i = 0; i < fileNames.size(); ++i) {
        if (!fileNames[i].empty()) {
            // Flushed per line, so that names and codes interleave in order
            // when both streams go to one file.
            // Kept for the console's scripts: see docs/compatibility.md#streams-per-partition
            std::cout << fileNames[i] << std::endl;
            std::cerr << returnCodes[i] << std::endl;
        }
        // Host and IP as listed, the status text as recorded. Kept for status-file scripts: see
        // docs/compatibility.md#status-line
        // The status file is read once the run is over; it is flushed when closed.
        status << partitions[i].get_HostName() << " [" << partitions[i].get_IP()
               << "] - VPD Survey - " << statusTexts[i] << '\n';
    }
}

} // namespace

void VPD_Survey_ClientPartition(std::string const& machineIdentity) {
    // A status file that cannot be opened loses its lines silently.
    std::ofstream status(Quorvex::PYLON::VPD::get_StatusFileName(machineIdentity));
    Quorvex::System::MTMS const mtms(machineIdentity);
    Quorvex::PYLON::Machine const machine(gc_ManagedMachineType, mtms);
    Quorvex::PYLON::ListOf_Partitions partitions;
    partitions.getPartitions_FromMachine(machine);
    Quorvex::PYLON::VPD::Survey_ClientPartition const survey;

    if (partitions.empty()) {
        status << gc_NoPartitions << std::endl;
        calculate_ReturnCode({});
        return;
    }
    std::vector<std::string> fileNames;
    std::vector<std::string> returnCodes;
    std::vector<std::string> statusTexts;
    // The survey adds one entry of each per partition.
    fileNames.reserve(partitions.size());
    returnCodes.reserve(partitions.size());
    statusTexts.reserve(partitions.size());
    survey(partitions, fileNames, returnCodes, statusTexts);
    u_report_Partitions(partitions, fileNames, returnCodes, statusTexts, status);
    calculate_ReturnCode(returnCodes);
}
