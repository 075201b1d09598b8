#include "RecordChecks.h"

#include "QuorvexTest.h"

#include <nlohmann/json.hpp>

#include <filesystem>
#include <map>

namespace FleetFaultTest {

char const gc_FetchedDocument[] = "<fetched/>";

namespace {

using Json = nlohmann::json;

constexpr char gc_ResultRoot[] = "/var/adm/quorvex/";
// Signals a run ends by, with the names the summary gives them.
std::map<int, std::string> const gc_SignalNames{
    {129, "SIGHUP"}, {130, "SIGINT"}, {141, "SIGPIPE"}, {143, "SIGTERM"}};

Json readSummary(std::string const& path) {
    if (!QuorvexTest::fileExists(path)) {
        return Json();
    }
    Json document = Json::parse(QuorvexTest::readFile(path), nullptr, false);
    return document.is_discarded() ? Json() : document;
}

bool isTemporaryName(std::string const& name) {
    return (name.size() > 1 && name[0] == '.' && name != "..") ||
           name.find(".piece-") != std::string::npos;
}

std::string textOr(Json const& value, std::string const& fallback) {
    return value.is_string() ? value.get<std::string>() : fallback;
}

// What is wrong with one partition's outcome, code, reason and document.
std::vector<std::string> partitionProblems(Json const& partition) {
    std::string const outcome = textOr(partition["outcome"], "?");
    std::string const code = textOr(partition["return_code"], "?");
    std::string const status = textOr(partition["status_text"], "?");
    bool const hasDocument = partition["document"].is_string();
    std::string const path = gc_ResultRoot + textOr(partition["document"], "");
    bool const fetched = hasDocument && QuorvexTest::fileExists(path) &&
                         QuorvexTest::readFile(path) == gc_FetchedDocument;
    std::vector<std::string> problems;
    auto require = [&](bool holds, std::string const& what) {
        if (!holds) {
            problems.push_back(outcome + " with " + what + ": " + partition.dump());
        }
    };
    bool const surveyed = outcome == "surveyed";
    require(surveyed == (code == "0"), "return code " + code);
    require(surveyed == (status == "Ok"), "status text '" + status + "'");
    require(surveyed == fetched, fetched ? "a fetched document" : "no fetched document");
    bool const hasReason = !partition["reason"].is_null();
    require(!(surveyed && hasReason), "reason " + partition["reason"].dump());
    require(surveyed || !hasDocument || hasReason, "a default document and no reason");
    require(!hasDocument || QuorvexTest::fileExists(path), "a missing document file " + path);
    bool const needsDocument = outcome == "timed_out" || outcome == "worker_died";
    require(!needsDocument || hasDocument, "no default document");
    return problems;
}

std::vector<std::string> machineProblems(Json const& machine) {
    std::string const statusFile = textOr(machine["status_file"], "");
    std::vector<std::string> const lines =
        QuorvexTest::fileExists(statusFile)
            ? QuorvexTest::linesOf(QuorvexTest::readFile(statusFile))
            : std::vector<std::string>{};
    Json const& partitions = machine["partitions"];
    std::vector<std::string> problems;
    if (lines.size() != partitions.size()) {
        problems.push_back(statusFile + " holds " + std::to_string(lines.size()) +
                           " status lines for " + std::to_string(partitions.size()) +
                           " listed partitions");
    }
    for (std::size_t i = 0; i < partitions.size(); ++i) {
        Json const& partition = partitions[i];
        std::string const expected = textOr(partition["host"], "") + " [" +
                                     textOr(partition["ip"], "") + "] - VPD Survey - " +
                                     textOr(partition["status_text"], "");
        if (i < lines.size() && lines[i] != expected) {
            problems.push_back("status line '" + lines[i] + "' where the summary says '" +
                               expected + "'");
        }
        std::vector<std::string> const found = partitionProblems(partition);
        problems.insert(problems.end(), found.begin(), found.end());
    }
    return problems;
}

} // namespace

std::vector<std::string> temporaryFilesLeft(std::string const& workFolder) {
    std::vector<std::string> left;
    for (std::string const& name : QuorvexTest::listFolder("/tmp")) {
        if (name.rfind("ShellCommand.", 0) == 0 || name.rfind("quorvex-survey-listing-", 0) == 0) {
            left.push_back("/tmp/" + name);
        }
    }
    for (std::string const& folder : {std::string(QuorvexTest::gc_VPD_Folder),
                                      std::string(QuorvexTest::gc_TraceFolder), workFolder}) {
        for (std::string const& name : QuorvexTest::listFolder(folder)) {
            if (isTemporaryName(name)) {
                left.push_back((std::filesystem::path(folder) / name).string());
            }
        }
    }
    return left;
}

std::vector<std::string> recordProblems(std::string const& summaryPath) {
    Json const summary = readSummary(summaryPath);
    if (!summary.is_object()) {
        return {"no readable summary at " + summaryPath};
    }
    std::vector<std::string> problems;
    for (Json const& machine : summary["machines"]) {
        std::vector<std::string> const found = machineProblems(machine);
        problems.insert(problems.end(), found.begin(), found.end());
    }
    return problems;
}

std::vector<std::string> exitStatusProblems(std::string const& summaryPath, int exitStatus) {
    Json const summary = readSummary(summaryPath);
    if (!summary.is_object()) {
        return {"no readable summary at " + summaryPath};
    }
    std::vector<std::string> problems;
    if (summary["exit_status"] != Json(exitStatus)) {
        problems.push_back("exit status " + std::to_string(exitStatus) + ", summary says " +
                           summary["exit_status"].dump());
    }
    auto const signal = gc_SignalNames.find(exitStatus);
    Json const interrupted = signal == gc_SignalNames.end() ? Json() : Json(signal->second);
    if (summary["interrupted"] != interrupted) {
        problems.push_back("exit status " + std::to_string(exitStatus) +
                           ", summary's interrupted " + summary["interrupted"].dump());
    }
    bool const byCode = exitStatus == 0 || exitStatus == 4 || exitStatus == 8;
    if (byCode && summary["return_code"] != Json(std::to_string(exitStatus))) {
        problems.push_back("exit status " + std::to_string(exitStatus) +
                           ", summary's return code " + summary["return_code"].dump());
    }
    return problems;
}

} // namespace FleetFaultTest
