#include "fleet/MachineReport.h"

#include "survey/calculate_ReturnCode.h"

#include <algorithm>
#include <iostream>
#include <iterator>

namespace fleet {

namespace {

constexpr char gc_NoPartitions[] = "No ACTIVE Partition Found.\n";

} // namespace

void printMachineBlock(MachineRecord const& machine) {
    for (auto const& record : machine.partitions) {
        if (!record.result.fileName.empty()) {
            std::cout << record.result.fileName << std::endl;
            std::cerr << record.result.returnCode << std::endl;
        }
    }
    calculate_ReturnCode(machineReturnCodes(machine));
}

std::string machineStatusText(MachineRecord const& machine) {
    if (machine.partitions.empty()) {
        return gc_NoPartitions;
    }
    std::string text;
    for (auto const& record : machine.partitions) {
        text += record.partition.get_HostName() + " [" + record.partition.get_IP() +
                "] - VPD Survey - " + record.result.statusText + "\n";
    }
    return text;
}

std::vector<std::string> machineReturnCodes(MachineRecord const& machine) {
    std::vector<std::string> codes;
    codes.reserve(machine.partitions.size());
    std::transform(machine.partitions.begin(), machine.partitions.end(), std::back_inserter(codes),
                   [](PartitionRecord const& record) { return record.result.returnCode; });
    return codes;
}

std::optional<std::string> machineTraceText(MachineRecord const& machine) {
    std::optional<std::string> text;
    auto const append = [&text](std::optional<std::string> const& piece) {
        if (piece) {
            (text ? *text : text.emplace()).append(*piece);
        }
    };
    append(machine.listingTrace);
    for (auto const& record : machine.partitions) {
        append(record.trace);
    }
    return text;
}

} // namespace fleet
