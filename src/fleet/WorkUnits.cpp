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
#include <cerrno>
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

// Why the trace piece did not open, right after the trace object tried: 0
// when it did.
int openError() {
    return Utility::Trace::ms_FileHandle.is_open() ? 0 : (errno != 0 ? errno : EIO);
}

// Why some of the unit's lines did not reach its piece, 0 when every one
// did: closing the piece writes out the lines still held, and fails when a
// write fails (a full Trace folder), as it does once any write has failed
// for good. Closed here, before the trace object goes, which would close
// it without a word.
int closedPieceError(int openError) {
    if (openError != 0) {
        return openError;
    }
    errno = 0;
    if (Utility::Trace::ms_FileHandle.close() != nullptr) {
        return 0;
    }
    return errno != 0 ? errno : EIO;
}

// A unit's result: a record of its trace piece's error first, then its own.
std::string withTraceError(int traceError, std::string const& records) {
    return encodeFields({std::to_string(traceError)}) + records;
}

// The unit's own records, after the trace piece's error; nullopt when the
// text is cut short.
std::optional<std::vector<FieldRecord>> unitRecords(std::string const& text) {
    auto records = decodeFields(text);
    if (!records || records->empty() || records->front().size() != 1) {
        return std::nullopt;
    }
    records->erase(records->begin());
    return records;
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
    int traceError = 0;
    removeWhenParentGone(tracePiece);
    {
        errno = 0;
        Utility::Trace trace(tracePiece);
        int const notOpened = openError();
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
        traceError = closedPieceError(notOpened);
    }
    return withTraceError(traceError, encoded);
}

std::optional<std::vector<Quorvex::System::Partition>> decodePartitions(std::string const& identity,
                                                                        std::string const& text) {
    auto const records = unitRecords(text);
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
    int traceError = 0;
    removeWhenParentGone(tracePiece);
    {
        errno = 0;
        Utility::Trace trace(tracePiece);
        int const notOpened = openError();
        keepDescriptorsFromActions();
        outcome = Quorvex::PYLON::VPD::Survey_ClientPartition::survey_Partition(
            partition, &ChildProcess::stopNote);
        traceError = closedPieceError(notOpened);
    }
    return withTraceError(traceError,
                          encodeFields({outcome.fileName, outcome.returnCode, outcome.statusText,
                                        std::to_string(static_cast<int>(outcome.kind)),
                                        optionalText(outcome.rc), optionalText(outcome.rcCmd),
                                        outcome.reason, std::to_string(outcome.documentError)}));
}

int decodeTraceError(std::string const& text) {
    auto const records = decodeFields(text);
    if (!records || records->empty() || records->front().size() != 1) {
        return 0;
    }
    return optionalNumber(records->front().front()).value_or(0);
}

std::optional<PartitionOutcome> decodeOutcome(std::string const& text) {
    auto const records = unitRecords(text);
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
