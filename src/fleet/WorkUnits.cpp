#include "fleet/WorkUnits.h"

#include "fleet/ChildProcess.h"
#include "fleet/FieldCodec.h"
#include "fleet/WorkerLife.h"
#include "pylon/ListOf_Machines.h"
#include "pylon/ListOf_Partitions.h"
#include "pylon/Machine.h"
#include "survey/Survey_ClientPartition.h"
#include "system/MTMS.h"
#include "utility/Trace.h"

#include <algorithm>
#include <ostream>

namespace fleet {

namespace {

using Quorvex::PYLON::VPD::PartitionOutcome;
using Quorvex::PYLON::VPD::PartitionOutcomeKind;

// Only machines of this object type have their partitions listed.
constexpr unsigned int gc_ManagedMachineType = 0;
constexpr char gc_MainLine[] = "PYLON_VPD_Survey_ClientPartition::main";
constexpr std::size_t gc_PartitionFields = 6;
constexpr std::size_t gc_OutcomeFields = 8;

std::string optionalText(std::optional<int> const& value) {
    return value ? std::to_string(*value) : std::string();
}

std::optional<int> optionalNumber(std::string const& text) {
    if (text.empty()) {
        return std::nullopt;
    }
    try {
        return std::stoi(text);
    } catch (std::exception const&) {
        return std::nullopt;
    }
}

void closeTrace() {
    Utility::Trace::ms_FileHandle.close();
}

} // namespace

std::string listMachines(std::string const& tracePath) {
    FieldRecord identities;
    removeWhenParentGone(tracePath);
    {
        Utility::Trace trace(tracePath);
        // The trace was opened after the worker's descriptors were closed
        // to actions; the listing action must not hold it either.
        keepDescriptorsFromActions();
        Quorvex::PYLON::ListOf_Machines machines;
        std::sort(machines.begin(), machines.end());
        for (auto const& machine : machines) {
            std::string const identity = machine.get_MTMS();
            if (machine.get_ObjectType() == gc_ManagedMachineType &&
                std::find(identities.begin(), identities.end(), identity) == identities.end()) {
                identities.push_back(identity);
            }
        }
    }
    closeTrace();
    return encodeFields(identities);
}

std::vector<std::string> decodeMachines(std::string const& text) {
    auto const records = decodeFields(text);
    if (!records || records->size() != 1) {
        return {};
    }
    return records->front();
}

std::string listPartitions(std::string const& identity, std::string const& tracePiece) {
    std::string encoded;
    removeWhenParentGone(tracePiece);
    {
        Utility::Trace trace(tracePiece);
        keepDescriptorsFromActions();
        trace << gc_MainLine << std::endl;
        Quorvex::System::MTMS const mtms(identity);
        Quorvex::PYLON::ListOf_Partitions partitions;
        partitions.getPartitions_FromMachine(Quorvex::PYLON::Machine(gc_ManagedMachineType, mtms));
        for (auto const& partition : partitions) {
            encoded += encodeFields({partition.get_PartitionID(), partition.get_IP(),
                                     partition.get_ActiveStatus(), partition.get_HostName(),
                                     partition.get_OperatingSystem_Name(),
                                     partition.get_OperatingSystem_Version()});
        }
    }
    closeTrace();
    return encoded;
}

std::optional<std::vector<Quorvex::System::Partition>> decodePartitions(std::string const& identity,
                                                                        std::string const& text) {
    auto const records = decodeFields(text);
    if (!records) {
        return std::nullopt;
    }
    Quorvex::System::MTMS const mtms(identity);
    std::vector<Quorvex::System::Partition> partitions;
    for (auto const& fields : *records) {
        if (fields.size() != gc_PartitionFields) {
            return std::nullopt;
        }
        Quorvex::System::Partition partition;
        partition.set_MTMS(mtms);
        partition.set_PartitionID(fields[0]);
        partition.set_IP(fields[1]);
        partition.set_ActiveStatus(fields[2]);
        partition.set_HostName(fields[3]);
        partition.set_OperatingSystem_Name(fields[4]);
        partition.set_OperatingSystem_Version(fields[5]);
        partitions.push_back(partition);
    }
    return partitions;
}

std::string surveyPartition(Quorvex::System::Partition const& partition,
                            std::string const& tracePiece) {
    PartitionOutcome outcome;
    removeWhenParentGone(tracePiece);
    {
        Utility::Trace trace(tracePiece);
        keepDescriptorsFromActions();
        outcome = Quorvex::PYLON::VPD::Survey_ClientPartition::survey_Partition(
            partition, &ChildProcess::stopNote);
    }
    closeTrace();
    return encodeFields({outcome.fileName, outcome.returnCode, outcome.statusText,
                         std::to_string(static_cast<int>(outcome.kind)), optionalText(outcome.rc),
                         optionalText(outcome.rcCmd), outcome.reason,
                         std::to_string(outcome.documentError)});
}

std::optional<PartitionOutcome> decodeOutcome(std::string const& text) {
    auto const records = decodeFields(text);
    if (!records || records->size() != 1 || records->front().size() != gc_OutcomeFields) {
        return std::nullopt;
    }
    auto const& fields = records->front();
    std::optional<int> const kind = optionalNumber(fields[3]);
    if (!kind || *kind < 0 || *kind > static_cast<int>(PartitionOutcomeKind::FetchFailure)) {
        return std::nullopt;
    }
    PartitionOutcome outcome;
    outcome.fileName = fields[0];
    outcome.returnCode = fields[1];
    outcome.statusText = fields[2];
    outcome.kind = static_cast<PartitionOutcomeKind>(*kind);
    outcome.rc = optionalNumber(fields[4]);
    outcome.rcCmd = optionalNumber(fields[5]);
    outcome.reason = fields[6];
    outcome.documentError = optionalNumber(fields[7]).value_or(0);
    return outcome;
}

} // namespace fleet
