#include "report/FolderReader.h"

#include "report/FailureReason.h"
#include "report/StatusText.h"
#include "report/SummaryTotals.h"
#include "report/VpdDocument.h"
#include "survey/Survey_Files.h"
#include "utility/FileText.h"
#include "utility/LocalTime.h"
#include "utility/SystemError.h"
#include "utility/TextChecks.h"
#include "utility/TextSafety.h"

#include <algorithm>
#include <chrono>
#include <filesystem>
#include <iterator>
#include <map>
#include <sstream>
#include <unistd.h>
#include <unordered_map>
#include <vector>

namespace report {

using util::endsWith;
using util::isDigits;
using util::localTimeText;
using util::startsWith;
using util::validUtf8;

namespace fs = std::filesystem;
using Json = nlohmann::ordered_json;

namespace {

constexpr char statusSuffix[] = ".status";
constexpr char documentSuffix[] = ".VPD.xml";
constexpr char noPartitionsLine[] = "No ACTIVE Partition Found.";
constexpr char statusSeparator[] = "] - VPD Survey - ";
constexpr char documentFolder[] = "VPD/";

// The stem of every file name the survey writes, with the "_" before the
// machine's identity.
std::string const& filePrefix() {
    static std::string const prefix = std::string(Quorvex::PYLON::VPD::gc_ProgramName) + "_";
    return prefix;
}

// name without prefix and suffix.
std::string middleOf(std::string const& name, std::string const& prefix,
                     std::string const& suffix) {
    return name.substr(prefix.size(), name.size() - prefix.size() - suffix.size());
}

struct DocumentFile {
    std::string name;
    std::string id;
    VpdDocument content;
    // The content's reason read once: a large console has thousands.
    std::optional<FailureReason> failure;
    bool used = false;
};

// A machine's documents by host name, each host's in ID order.
using DocumentsByHost = std::unordered_map<std::string, std::vector<DocumentFile*>>;

struct StatusLine {
    std::string host;
    std::string ip;
    std::string statusText;
};

// A file that is gone or unreadable since the folder was listed reads as
// empty: a run may still be writing there, and the rest is still reported.
std::string readText(fs::path const& path) {
    try {
        return util::readWholeFile(path.string());
    } catch (util::SystemError const&) {
        return "";
    }
}

// "<host> [<ip>] - VPD Survey - <status>": the host may hold anything, the
// status texts never hold the separator, so the last one splits.
std::optional<StatusLine> parseStatusLine(std::string const& line) {
    std::string::size_type const separator = line.rfind(statusSeparator);
    if (separator == std::string::npos) {
        return std::nullopt;
    }
    std::string::size_type const open = line.rfind(" [", separator);
    if (open == std::string::npos) {
        return std::nullopt;
    }
    return StatusLine{line.substr(0, open), line.substr(open + 2, separator - open - 2),
                      line.substr(separator + std::string(statusSeparator).size())};
}

std::vector<StatusLine> readStatusLines(fs::path const& path) {
    std::istringstream text(readText(path));
    std::vector<StatusLine> lines;
    std::string line;
    while (std::getline(text, line)) {
        if (line == noPartitionsLine) {
            continue;
        }
        if (auto parsed = parseStatusLine(line)) {
            lines.push_back(*parsed);
        }
    }
    return lines;
}

// Numeric IDs in numeric order, then the others in text order.
bool isBeforeInIdOrder(DocumentFile const& a, DocumentFile const& b) {
    auto const key = [](std::string const& id) {
        bool const numeric = id.size() < 19 && isDigits(id);
        return std::make_tuple(!numeric, numeric ? std::stoll(id) : 0LL, id);
    };
    return key(a.id) < key(b.id);
}

class FolderScan {
public:
    explicit FolderScan(fs::path folder) : _folder(std::move(folder)) {}

    Json summary() {
        std::map<std::string, fs::path> statusFiles;
        std::vector<fs::path> documents;
        listFolder(statusFiles, documents);
        std::map<std::string, std::vector<DocumentFile>> documentsByMachine;
        for (fs::path const& document : documents) {
            assignDocument(document, statusFiles, documentsByMachine);
        }
        Json machines = Json::array();
        Json identities = Json::array();
        for (auto const& [identity, path] : statusFiles) {
            noteTime(path);
            machines.push_back(machine(identity, path, documentsByMachine[identity]));
            identities.push_back(validUtf8(identity));
        }
        return runSummary(std::move(machines), std::move(identities));
    }

private:
    void listFolder(std::map<std::string, fs::path>& statusFiles,
                    std::vector<fs::path>& documents) const {
        std::error_code error;
        for (fs::directory_iterator entry(_folder, error), end; !error && entry != end;
             entry.increment(error)) {
            std::string const name = entry->path().filename().string();
            if (!startsWith(name, filePrefix()) || !entry->is_regular_file(error)) {
                continue;
            }
            if (endsWith(name, statusSuffix)) {
                std::string const identity = middleOf(name, filePrefix(), statusSuffix);
                statusFiles.emplace(identity, entry->path());
            } else if (endsWith(name, documentSuffix)) {
                documents.push_back(entry->path());
            }
        }
    }

    // A document belongs to the machine with the longest identity its name
    // starts with, followed by "-" and the partition ID.
    void assignDocument(fs::path const& path, std::map<std::string, fs::path> const& statusFiles,
                        std::map<std::string, std::vector<DocumentFile>>& byMachine) {
        std::string const name = path.filename().string();
        std::string const stem = middleOf(name, filePrefix(), documentSuffix);
        std::string const* owner = nullptr;
        for (auto const& entry : statusFiles) {
            if (startsWith(stem, entry.first + "-") &&
                (owner == nullptr || entry.first.size() > owner->size())) {
                owner = &entry.first;
            }
        }
        if (owner == nullptr) {
            return;
        }
        VpdDocument content = parseVpdDocument(readText(path));
        std::optional<FailureReason> failure;
        if (content.reason) {
            failure = parseFailureReason(*content.reason);
        }
        byMachine[*owner].push_back(
            {name, stem.substr(owner->size() + 1), std::move(content), std::move(failure), false});
        noteTime(path);
    }

    void noteTime(fs::path const& path) {
        std::error_code error;
        auto const time = fs::last_write_time(path, error);
        if (error) {
            return;
        }
        long long const seconds = std::chrono::duration_cast<std::chrono::seconds>(
                                      time - fs::file_time_type::clock::now() +
                                      std::chrono::system_clock::now().time_since_epoch())
                                      .count();
        _oldest = std::min(_oldest.value_or(seconds), seconds);
        _newest = std::max(_newest.value_or(seconds), seconds);
    }

    Json machine(std::string const& identity, fs::path const& statusFile,
                 std::vector<DocumentFile>& documents) {
        std::sort(documents.begin(), documents.end(), isBeforeInIdOrder);
        DocumentsByHost byHost;
        for (DocumentFile& document : documents) {
            if (document.content.host) {
                byHost[*document.content.host].push_back(&document);
            }
        }
        std::vector<StatusLine> const lines = readStatusLines(statusFile);
        Json partitions = Json::array();
        std::transform(lines.begin(), lines.end(), std::back_inserter(partitions),
                       [&](StatusLine const& line) { return partition(line, byHost); });
        Json counts = countOutcomes(partitions);
        Json entry;
        entry["identity"] = validUtf8(identity);
        entry["return_code"] = overallCode(counts);
        entry["status_file"] = validUtf8(fs::absolute(statusFile).lexically_normal().string());
        entry["trace_file"] = traceFile(identity);
        entry["counts"] = std::move(counts);
        entry["partitions"] = std::move(partitions);
        return entry;
    }

    // The machine's own trace, as quorvex-survey writes it beside the VPD
    // folder; the single-machine tool's one trace holds only the last
    // machine it ran for, so it is named for none.
    Json traceFile(std::string const& identity) const {
        fs::path vpd = fs::absolute(_folder).lexically_normal();
        if (!vpd.has_filename()) {
            vpd = vpd.parent_path();
        }
        fs::path const trace = vpd.parent_path() / "Trace" / (filePrefix() + identity + ".Trace");
        std::error_code error;
        if (!fs::is_regular_file(trace, error)) {
            return nullptr;
        }
        return validUtf8(trace.string());
    }

    Json partition(StatusLine const& line, DocumentsByHost& byHost) {
        std::optional<std::string> outcome = outcomeOfStatusText(line.statusText);
        DocumentFile* document = matchDocument(line, outcome, byHost);
        std::optional<FailureReason> reason;
        if (document != nullptr) {
            reason = document->failure;
        }
        if (!outcome) {
            outcome = reason && reason->action == "getFileFromPartition" ? "fetch_failure"
                                                                         : "client_failure";
        }
        if (reason && reason->stoppedBy == "time limit" && *outcome != "interrupted") {
            outcome = "timed_out";
        }
        if (reason && reason->stoppedBy && *reason->stoppedBy != "time limit") {
            _signal = *reason->stoppedBy;
        }
        Json entry;
        entry["id"] = document ? Json(validUtf8(document->id)) : Json(nullptr);
        entry["host"] = validUtf8(line.host);
        entry["ip"] = validUtf8(line.ip);
        entry["active_status"] = nullptr;
        entry["outcome"] = *outcome;
        entry["status_text"] = validUtf8(line.statusText);
        entry["return_code"] = *outcome == "surveyed" ? "0" : "8";
        entry["rc"] = reason && reason->rc ? Json(*reason->rc) : Json(nullptr);
        bool const clientRun = reason && reason->action == "runCmdOnPartition";
        entry["rc_cmd"] = clientRun && reason->rcCmd ? Json(*reason->rcCmd) : Json(nullptr);
        entry["document"] =
            document ? Json(validUtf8(documentFolder + document->name)) : Json(nullptr);
        entry["reason"] = reason ? Json(validUtf8(*document->content.reason)) : Json(nullptr);
        entry["seconds"] = nullptr;
        if (reason && reason->stoppedAfterSeconds && !reason->action.empty()) {
            entry["time_limit"] = {{"action", reason->action},
                                   {"stopped_after_seconds", *reason->stoppedAfterSeconds}};
        }
        return entry;
    }

    // The first unused document in ID order for the same host whose kind
    // fits the status: fetched for a surveyed partition, a default one for a
    // failure, one stopped by a signal for an interrupted partition; none for
    // an inactive partition, which gets no document.
    static DocumentFile* matchDocument(StatusLine const& line,
                                       std::optional<std::string> const& outcome,
                                       DocumentsByHost& byHost) {
        auto const sameHost = byHost.find(line.host);
        if (outcome == "inactive" || sameHost == byHost.end()) {
            return nullptr;
        }
        auto const& candidates = sameHost->second;
        auto const found =
            std::find_if(candidates.begin(), candidates.end(), [&](DocumentFile const* document) {
                return !document->used && fitsOutcome(document->failure, outcome);
            });
        if (found == candidates.end()) {
            return nullptr;
        }
        (*found)->used = true;
        return *found;
    }

    static bool fitsOutcome(std::optional<FailureReason> const& failure,
                            std::optional<std::string> const& outcome) {
        if (outcome == "surveyed") {
            return !failure;
        }
        if (!failure) {
            return false;
        }
        bool const bySignal = failure->stoppedBy && *failure->stoppedBy != "time limit";
        if (outcome == "interrupted") {
            return bySignal;
        }
        std::string const& action = failure->action;
        if (outcome == "fetch_failure") {
            return action == "getFileFromPartition" && !bySignal;
        }
        if (outcome == "channel_failure" || outcome == "client_failure") {
            return action == "runCmdOnPartition" && !bySignal;
        }
        return !bySignal;
    }

    Json runSummary(Json machines, Json identities) const {
        Json run;
        run["schema_version"] = 1;
        run["tool"] = "quorvex-survey report";
        run["version"] = QUORVEX_VERSION;
        run["console_host"] = validUtf8(consoleHost());
        long long const started = _oldest.value_or(0);
        long long const ended = _newest.value_or(0);
        run["started"] = localTimeText(started);
        run["ended"] = localTimeText(ended);
        run["elapsed_seconds"] = ended - started;
        run["options"] = {{"jobs", nullptr},
                          {"timeout_seconds", nullptr},
                          {"all", false},
                          {"identities", std::move(identities)}};
        run["interrupted"] = _signal ? Json(*_signal) : Json(nullptr);
        Json totals = totalCounts(machines);
        run["return_code"] = overallCode(totals);
        run["exit_status"] = nullptr;
        run["totals"] = std::move(totals);
        run["machines"] = std::move(machines);
        return run;
    }

    static std::string consoleHost() {
        char name[256] = {};
        if (gethostname(name, sizeof name - 1) != 0) {
            return "";
        }
        return name;
    }

    fs::path _folder;
    std::optional<long long> _oldest;
    std::optional<long long> _newest;
    std::optional<std::string> _signal;
};

} // namespace

Json readSummaryFromFolder(std::string const& vpdFolder) {
    return FolderScan(vpdFolder).summary();
}

} // namespace report
