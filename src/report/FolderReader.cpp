#include "report/FolderReader.h"

#include "report/FailureReason.h"
#include "report/MachineDocuments.h"
#include "report/StatusText.h"
#include "report/VpdDocument.h"
#include "survey/Survey_Files.h"
#include "utility/FileText.h"
#include "utility/LocalTime.h"
#include "utility/SystemError.h"
#include "utility/TextChecks.h"
#include "utility/TextSafety.h"

#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <filesystem>
#include <map>
#include <sstream>
#include <vector>

namespace report {

using util::localTimeText;
using util::startsWith;
using util::validUtf8;

namespace fs = std::filesystem;
namespace VPD = Quorvex::PYLON::VPD;

namespace {

constexpr char gc_ToolName[] = "quorvex-survey report";
constexpr char gc_NoPartitionsLine[] = "No ACTIVE Partition Found.";
constexpr char gc_StatusSeparator[] = "] - VPD Survey - ";
// Between the machine identity and the partition ID in a partition text.
constexpr char gc_PartitionIdSeparator[] = "-";
// The survey's codes of a partition.

struct StatusLine {
    std::string host;
    std::string ip;
    std::string statusText;
};

// The files of the folder that surveys write: status files by identity, and
// documents.
struct FolderFiles {
    std::map<std::string, fs::path> statusFiles;
    std::vector<fs::path> documents;
};

// What reading the files tells about the run besides its machines.
struct RunTraces {
    // The modification times of the oldest and the newest file read, in
    // seconds since the epoch.
    std::optional<long long> oldest;
    std::optional<long long> newest;
    // The signal that stopped a partition's action, if one did.
    std::optional<std::string> interruptedBy;
};

void noteFileTime(fs::path const& path, RunTraces& traces) {
    std::error_code error;
    auto const time = fs::last_write_time(path, error);
    if (error) {
        return;
    }
    long long const seconds = std::chrono::duration_cast<std::chrono::seconds>(
                                  time - fs::file_time_type::clock::now() +
                                  std::chrono::system_clock::now().time_since_epoch())
                                  .count();
    traces.oldest = std::min(traces.oldest.value_or(seconds), seconds);
    traces.newest = std::max(traces.newest.value_or(seconds), seconds);
}

// "<host> [<ip>] - VPD Survey - <status>": the host may hold anything, the
// status texts never hold the separator, so the last one splits.
std::optional<StatusLine> parseStatusLine(std::string const& line) {
    std::string::size_type const separator = line.rfind(gc_StatusSeparator);
    if (separator == std::string::npos) {
        return std::nullopt;
    }
    std::string::size_type const open = line.rfind(" [", separator);
    if (open == std::string::npos) {
        return std::nullopt;
    }
    return StatusLine{line.substr(0, open), line.substr(open + 2, separator - open - 2),
                      line.substr(separator + std::string(gc_StatusSeparator).size())};
}

std::vector<StatusLine> readStatusLines(fs::path const& path) {
    std::istringstream text(util::readWholeFileOrEmpty(path.string()));
    std::vector<StatusLine> lines;
    std::string line;
    while (std::getline(text, line)) {
        if (line == gc_NoPartitionsLine) {
            continue;
        }
        if (auto parsed = parseStatusLine(line)) {
            lines.push_back(*parsed);
        }
    }
    return lines;
}

void addFolderEntry(fs::directory_entry const& entry, FolderFiles& files) {
    std::string const name = entry.path().filename().string();
    std::optional<std::string> const identity = VPD::get_IdentityOfStatusFileName(name);
    bool const document = VPD::get_PartitionTextOfResultName(name).has_value();
    std::error_code error;
    if ((!identity && !document) || !entry.is_regular_file(error)) {
        return;
    }
    if (identity) {
        files.statusFiles.emplace(*identity, entry.path());
    } else {
        files.documents.push_back(entry.path());
    }
}

// A folder that cannot be listed, wholly, is no run's files: reading it as
// empty would report a console with no machines.
FolderFiles listFolder(fs::path const& folder) {
    FolderFiles files;
    std::error_code error;
    for (fs::directory_iterator entry(folder, error), end; !error && entry != end;
         entry.increment(error)) {
        addFolderEntry(*entry, files);
    }
    if (error) {
        throw util::SystemError("read", folder.string(), error.value());
    }
    return files;
}

// The machine a partition text belongs to: the one with the longest identity
// the text starts with, followed by the separator and the partition ID.
std::string const* ownerOf(std::string const& partitionText,
                           std::map<std::string, fs::path> const& statusFiles) {
    std::string const* owner = nullptr;
    for (auto const& entry : statusFiles) {
        if (startsWith(partitionText, entry.first + gc_PartitionIdSeparator) &&
            (owner == nullptr || entry.first.size() > owner->size())) {
            owner = &entry.first;
        }
    }
    return owner;
}

DocumentFile readDocument(fs::path const& path, std::string partitionText, std::string id) {
    VpdDocument content = parseVpdDocument(util::readWholeFileOrEmpty(path.string()));
    std::optional<FailureReason> failure;
    if (content.reason) {
        failure = parseFailureReason(*content.reason);
    }
    return {std::move(partitionText), std::move(id), std::move(content), std::move(failure)};
}

// Every document whose machine has a status file, by the machine's identity.
std::map<std::string, std::vector<DocumentFile>> readDocuments(FolderFiles const& files,
                                                               RunTraces& traces) {
    std::map<std::string, std::vector<DocumentFile>> byMachine;
    for (fs::path const& path : files.documents) {
        std::string const partitionText =
            *VPD::get_PartitionTextOfResultName(path.filename().string());
        std::string const* owner = ownerOf(partitionText, files.statusFiles);
        if (owner == nullptr) {
            continue;
        }
        std::string id =
            partitionText.substr(owner->size() + std::string(gc_PartitionIdSeparator).size());
        byMachine[*owner].push_back(readDocument(path, partitionText, std::move(id)));
        noteFileTime(path, traces);
    }
    return byMachine;
}

// The outcome a status line and its document's reason give: a text the
// survey never writes is a failure of the document's kind; a failure the
// time limit stopped is timed out.
Outcome outcomeOf(std::optional<Outcome> statusOutcome, FailureReason const* reason) {
    Outcome outcome = statusOutcome.value_or(reason && reason->action == RemoteAction::GetFile
                                                 ? Outcome::FetchFailure
                                                 : Outcome::ClientFailure);
    if (reason && reason->isStoppedByTimeLimit() && outcome != Outcome::Interrupted) {
        outcome = Outcome::TimedOut;
    }
    return outcome;
}

// What a partition's default document adds to its summary.
void addFailure(PartitionSummary& partition, FailureReason const& failure,
                std::string const& reasonText) {
    partition.rc = failure.rc;
    if (failure.action == RemoteAction::RunCommand) {
        partition.rcCmd = failure.rcCmd;
    }
    partition.reason = validUtf8(reasonText);
    if (failure.stop && failure.action) {
        partition.stoppedAction = StoppedAction{*failure.action, failure.stop->afterSeconds};
    }
}

// Each status line's document: first by the host its content names, then,
// for the lines left without one, a document that names no host, its file
// name giving the partition's ID.
std::vector<DocumentFile const*> documentsOfLines(std::vector<StatusLine> const& lines,
                                                  MachineDocuments& documents) {
    std::vector<DocumentFile const*> found;
    std::vector<std::size_t> without;
    std::vector<std::optional<Outcome>> withoutOutcomes;
    for (StatusLine const& line : lines) {
        std::optional<Outcome> const statusOutcome = outcomeOfStatusText(line.statusText);
        found.push_back(documents.take(line.host, statusOutcome));
        if (found.back() == nullptr) {
            without.push_back(found.size() - 1);
            withoutOutcomes.push_back(statusOutcome);
        }
    }
    std::vector<DocumentFile const*> const unnamed = documents.takeUnnamed(withoutOutcomes);
    for (std::size_t i = 0; i < without.size(); ++i) {
        found[without[i]] = unnamed[i];
    }
    return found;
}

PartitionSummary partitionSummary(StatusLine const& line, DocumentFile const* document,
                                  RunTraces& traces) {
    std::optional<Outcome> const statusOutcome = outcomeOfStatusText(line.statusText);
    FailureReason const* failure =
        document != nullptr && document->failure ? &*document->failure : nullptr;
    PartitionSummary partition;
    partition.host = validUtf8(line.host);
    partition.ip = validUtf8(line.ip);
    partition.outcome = outcomeOf(statusOutcome, failure);
    partition.statusText = validUtf8(line.statusText);
    partition.returnCode =
        partition.outcome == Outcome::Surveyed ? gc_SurveyedCode : gc_NotSurveyedCode;
    if (document != nullptr) {
        partition.id = validUtf8(document->id);
        partition.document = validUtf8(VPD::get_LocalResultName(document->partitionText));
    }
    if (failure != nullptr) {
        addFailure(partition, *failure, *document->content.reason);
    }
    if (failure != nullptr && failure->isStoppedBySignal()) {
        traces.interruptedBy = failure->stop->signalName;
    }
    return partition;
}

// The machine's own trace, as quorvex-survey writes it in the Trace folder
// beside the VPD folder; the single-machine tool's one trace holds only the
// last machine it ran for, so it is named for none.
std::optional<std::string> traceFileOf(fs::path const& vpdFolder, std::string const& identity) {
    fs::path vpd = fs::absolute(vpdFolder).lexically_normal();
    if (!vpd.has_filename()) {
        vpd = vpd.parent_path();
    }
    fs::path const trace = vpd.parent_path() / VPD::get_MachineTraceName(identity);
    std::error_code error;
    if (!fs::is_regular_file(trace, error)) {
        return std::nullopt;
    }
    return validUtf8(trace.string());
}

// A machine's trace starts with its partition listing, so a machine that
// lists no partition and has a trace of quorvex-survey tells whether its
// listing failed; the single-machine tool's one trace is named for no machine.
std::optional<ListingFailure> listingFailureOf(std::optional<std::string> const& traceFile) {
    std::string const trace = traceFile ? util::readWholeFileOrEmpty(*traceFile) : std::string();
    return trace.empty() ? std::nullopt : listingFailureInTrace(trace);
}

MachineSummary machineSummary(fs::path const& vpdFolder, std::string const& identity,
                              fs::path const& statusFile, MachineDocuments documents,
                              RunTraces& traces) {
    noteFileTime(statusFile, traces);
    MachineSummary machine;
    machine.identity = validUtf8(identity);
    machine.statusFile = validUtf8(fs::absolute(statusFile).lexically_normal().string());
    machine.traceFile = traceFileOf(vpdFolder, identity);
    std::vector<StatusLine> const lines = readStatusLines(statusFile);
    std::vector<DocumentFile const*> const found = documentsOfLines(lines, documents);
    for (std::size_t i = 0; i < lines.size(); ++i) {
        machine.partitions.push_back(partitionSummary(lines[i], found[i], traces));
    }
    if (lines.empty()) {
        machine.listingFailure = listingFailureOf(machine.traceFile);
    }
    return machine;
}

std::string consoleHost() {
    char name[256] = {};
    if (gethostname(name, sizeof name - 1) != 0) {
        return "";
    }
    return name;
}

// The run's facts that the files tell, or that a summary read from files
// gives as unknown.
void addRunFacts(RunSummary& run, RunTraces const& traces) {
    run.tool = gc_ToolName;
    run.consoleHost = validUtf8(consoleHost());
    long long const started = traces.oldest.value_or(0);
    long long const ended = traces.newest.value_or(0);
    run.started = localTimeText(started);
    run.ended = localTimeText(ended);
    run.elapsedSeconds = ended - started;
    run.interruptedBy = traces.interruptedBy;
}

} // namespace

RunSummary readRunSummaryFromFolder(std::string const& vpdFolder) {
    FolderFiles const files = listFolder(vpdFolder);
    RunTraces traces;
    auto documentsByMachine = readDocuments(files, traces);
    RunSummary run;
    for (auto const& [identity, path] : files.statusFiles) {
        run.machines.push_back(
            machineSummary(vpdFolder, identity, path,
                           MachineDocuments(std::move(documentsByMachine[identity])), traces));
        run.options.identities.push_back(validUtf8(identity));
    }
    addRunFacts(run, traces);
    return run;
}

nlohmann::ordered_json readSummaryFromFolder(std::string const& vpdFolder) {
    return summaryDocument(readRunSummaryFromFolder(vpdFolder));
}

} // namespace report
