#include "survey/Survey_ClientPartition.h"

#include "relay/Interface.h"
#include "relay/ReturnCode.h"
#include "relay/TargetPartition.h"
#include "survey/Quorvex_PYLON_VPD_Survey_ClientPartition_Utility.h"
#include "survey/Survey_Files.h"
#include "system/DEBUG_System.h"
#include "utility/Trace.h"

#include <optional>
#include <ostream>
#include <sstream>
#include <utility>

namespace Quorvex::PYLON::VPD {

namespace {

namespace Survey_Utility = ::Quorvex_PYLON_VPD_Survey_ClientPartition_Utility;

// This unit's trace; it writes into the file that main opens.
::Utility::Trace g_Trace("");

constexpr char gc_Surveyed[] = "0";
constexpr char gc_NotSurveyed[] = "8";
constexpr char gc_Ok[] = "Ok";
// Kept for status-file scripts: see docs/compatibility.md#inactive-partition
constexpr char gc_Inactive[] = "Failed - Active Status < 3";
// Statuses 0, 1 and 2 mean the partition is not running.
constexpr unsigned int gc_HighestInactiveStatus = 2;

// The client's options: verbose, and the result file to write. Kept for
// the partition's client: see docs/compatibility.md#client-options
constexpr char gc_ClientOptions[] = " -v  -of ";

// The status text is written over its seed from the seed's first character.
// Kept for status-file scripts: see docs/compatibility.md#status-overwrite
constexpr char gc_ClientFailedSeed[] = "survey Failed : ";
constexpr char gc_FetchFailedSeed[] = "get result Failed, rc = ";
constexpr char gc_ChannelFailed[] = "RELAY Failed, rc = ";
constexpr char gc_ClientFailed[] = "Partition Failed, RcCmd = ";

constexpr char gc_NotSurveyedReason[] = "Partition not surveyed, reason: \n";
constexpr char gc_ChannelFailedReason[] = "RELAY Failed.\n";
constexpr char gc_ClientFailedReason[] = "Partition Failed.\n";
constexpr char gc_FetchFailedReason[] = "Unable to get File From Partition : \n";

// The names of one partition's files, P being its identity text.
struct ResultNames {
    // Written by the client on the partition.
    ::std::string remoteResult;
    // The document's name on the console, as standard output shows it.
    ::std::string localResult;
    ::std::string clientArguments;
    // The client's own output on the partition.
    ::std::string clientOutput;
};

ResultNames u_form_ResultNames(::Quorvex::System::Partition const& partition) {
    ::std::string const identity = partition;
    ResultNames names;
    names.remoteResult = get_RemoteResultName(identity);
    names.localResult = get_LocalResultName(identity);
    names.clientArguments = gc_ClientOptions + names.remoteResult;
    names.clientOutput = get_ClientOutputName(identity);
    return names;
}

// The text of a stream seeded with seed into which message and the code (as
// an unsigned 32-bit number, so -1 reads 4294967295) are written from the
// seed's first character on: what is written replaces that many characters
// of the seed, and the rest of the seed stays.
// Kept for status-file scripts: see docs/compatibility.md#unsigned-codes
::std::string u_write_OverSeed(char const* seed, char const* message, int const& code) {
    ::std::stringstream status(seed);
    status << message << static_cast<unsigned int>(code);
    return status.str();
}

// Written in one piece: the banner is the same for every partition.
void u_trace_Banner() {
    static ::std::string const banner =
        "\n\n" + ::std::string(80, '+') + "\nPYLON_VPD_Survey_ClientPartition\n\n";
    g_Trace << banner;
}

void u_trace_Partition(::Quorvex::System::Partition const& partition) {
    static ::std::string const closingRule = "    " + ::std::string(40, '-') + "\n";
    ::DEBUG::Quorvex::System::print_Partition(g_Trace, partition, 4);
    g_Trace << closingRule << ::std::flush;
}

bool u_has_ClientFailed(int const& result, ::Quorvex::RELAY::ReturnCode const& returnCode) {
    return result != 0 || returnCode.get_Rc() != 0 || returnCode.get_RcCmd() != 0;
}

// The status shows Rc even when only the exit code failed. Kept for status-file scripts: see
// docs/compatibility.md#status-shows-rc
bool u_has_ChannelFailed(int const& result, ::Quorvex::RELAY::ReturnCode const& returnCode) {
    return result != 0 || returnCode.get_Rc() != 0;
}

using Outcome = PartitionOutcome;
using OutcomeKind = PartitionOutcomeKind;
using StopNote = Survey_ClientPartition::StopNote;

::std::optional<int> u_get_Rc(::Quorvex::RELAY::ReturnCode const& returnCode) {
    return returnCode.contains("Rc") ? ::std::optional<int>(returnCode.get_Rc()) : ::std::nullopt;
}

::std::optional<int> u_get_RcCmd(::Quorvex::RELAY::ReturnCode const& returnCode) {
    return returnCode.contains("RcCmd") ? ::std::optional<int>(returnCode.get_RcCmd())
                                        : ::std::nullopt;
}

// The stop note, when there is one, is one more line of the reason and ends
// the partition's trace block.
::std::string u_get_StopNote(StopNote const& stopNote) {
    return stopNote ? stopNote() : ::std::string();
}

void u_write_DefaultDocument(::Quorvex::System::Partition const& partition,
                             ResultNames const& names, ::std::string const& note,
                             Outcome& outcome) {
    if (!note.empty()) {
        outcome.reason += note + "\n";
    }
    outcome.documentError = Survey_Utility::u_create_DefaultXML_forFailedPartition(
        partition, outcome.reason, names.localResult);
    if (!note.empty()) {
        g_Trace << note << ::std::endl;
    }
}

Outcome u_record_ClientFailure(::Quorvex::System::Partition const& partition,
                               ResultNames const& names, int const& result,
                               ::Quorvex::RELAY::ReturnCode const& returnCode,
                               StopNote const& stopNote) {
    bool const channelFailed = u_has_ChannelFailed(result, returnCode);
    Outcome outcome;
    outcome.reason = ::std::string(gc_NotSurveyedReason) +
                     (channelFailed ? gc_ChannelFailedReason : gc_ClientFailedReason) +
                     Survey_Utility::u_transform_RELAY_ReturnCode_2_String(returnCode);
    u_write_DefaultDocument(partition, names, u_get_StopNote(stopNote), outcome);
    outcome.statusText =
        channelFailed
            ? u_write_OverSeed(gc_ClientFailedSeed, gc_ChannelFailed, returnCode.get_Rc())
            : u_write_OverSeed(gc_ClientFailedSeed, gc_ClientFailed, returnCode.get_RcCmd());
    outcome.fileName = names.localResult;
    outcome.returnCode = gc_NotSurveyed;
    outcome.kind = channelFailed ? OutcomeKind::ChannelFailure : OutcomeKind::ClientFailure;
    outcome.rc = u_get_Rc(returnCode);
    outcome.rcCmd = u_get_RcCmd(returnCode);
    return outcome;
}

Outcome u_record_FetchFailure(::Quorvex::System::Partition const& partition,
                              ResultNames const& names, ::std::optional<int> const& clientRcCmd,
                              ::Quorvex::RELAY::ReturnCode const& returnCode,
                              StopNote const& stopNote) {
    Outcome outcome;
    outcome.reason = ::std::string(gc_FetchFailedReason) +
                     Survey_Utility::u_transform_RELAY_ReturnCode_2_String(returnCode);
    u_write_DefaultDocument(partition, names, u_get_StopNote(stopNote), outcome);
    outcome.statusText = u_write_OverSeed(gc_FetchFailedSeed, "", returnCode.get_Rc());
    outcome.fileName = names.localResult;
    outcome.returnCode = gc_NotSurveyed;
    outcome.kind = OutcomeKind::FetchFailure;
    outcome.rc = u_get_Rc(returnCode);
    outcome.rcCmd = clientRcCmd;
    return outcome;
}

// Runs the client survey on the partition, then fetches its result.
Outcome u_survey_ActivePartition(::Quorvex::System::Partition const& partition,
                                 StopNote const& stopNote) {
    u_trace_Banner();
    ::Quorvex::RELAY::Interface relay{::Quorvex::RELAY::TargetPartition(partition)};
    u_trace_Partition(partition);
    ResultNames const names = u_form_ResultNames(partition);

    g_Trace << "\n\t 1.  > > > VPD Survey Client < < < \n";
    int const clientResult =
        relay.execute_PartitionQuorvex(names.clientArguments, names.clientOutput);
    // Read only before the next operation, which replaces the interface's
    // return codes: only the client's RcCmd is kept, not a copy of them.
    ::Quorvex::RELAY::ReturnCode const& clientCode = relay.get_ReturnCode();
    if (u_has_ClientFailed(clientResult, clientCode)) {
        return u_record_ClientFailure(partition, names, clientResult, clientCode, stopNote);
    }
    ::std::optional<int> const clientRcCmd = u_get_RcCmd(clientCode);

    g_Trace << "\n\n\t 2.  > > > Get VPD Survey Result < < < \n";
    int const fetchResult = relay.getFileFromPartition(names.remoteResult, names.localResult);
    ::Quorvex::RELAY::ReturnCode const& fetchCode = relay.get_ReturnCode();
    if (u_has_ChannelFailed(fetchResult, fetchCode)) {
        return u_record_FetchFailure(partition, names, clientRcCmd, fetchCode, stopNote);
    }
    Outcome outcome;
    outcome.fileName = names.localResult;
    outcome.returnCode = gc_Surveyed;
    outcome.statusText = gc_Ok;
    outcome.kind = OutcomeKind::Surveyed;
    outcome.rc = u_get_Rc(fetchCode);
    outcome.rcCmd = clientRcCmd;
    return outcome;
}

} // namespace

// An inactive partition is skipped: no trace text, no file.
PartitionOutcome
Survey_ClientPartition::survey_Partition(::Quorvex::System::Partition const& partition,
                                         StopNote const& stopNote) {
    if (Survey_Utility::_u_get_ActiveStatus(partition) <= gc_HighestInactiveStatus) {
        Outcome outcome;
        outcome.returnCode = gc_NotSurveyed;
        outcome.statusText = gc_Inactive;
        return outcome;
    }
    return u_survey_ActivePartition(partition, stopNote);
}

void Survey_ClientPartition::operator()(::Quorvex::PYLON::ListOf_Partitions const& partitions,
                                        ::std::vector<::std::string>& fileNames,
                                        ::std::vector<::std::string>& returnCodes,
                                        ::std::vector<::std::string>& statusTexts) const {
    for (::Quorvex::System::Partition const& partition : partitions) {
        Outcome outcome = survey_Partition(partition);
        fileNames.push_back(::std::move(outcome.fileName));
        returnCodes.push_back(::std::move(outcome.returnCode));
        statusTexts.push_back(::std::move(outcome.statusText));
    }
}

} // namespace Quorvex::PYLON::VPD
