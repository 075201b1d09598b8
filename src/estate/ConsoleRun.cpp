#include "estate/ConsoleRun.h"

#include "estate/CollectRecords.h"
#include "utility/FileText.h"

#include <filesystem>

namespace estate {

using Json = nlohmann::ordered_json;

namespace {

// A bundle path of records.json stays inside the collect folder: a record
// naming /etc or ../.. would have the estate read what no collection wrote.
std::string bundleFolder(std::string const& collectFolder, std::string const& bundle) {
    std::filesystem::path const relative = std::filesystem::path(bundle).lexically_normal();
    if (bundle.empty() || relative.is_absolute() || *relative.begin() == "..") {
        throw MalformedInput("the bundle path " + bundle + " is not inside the collect folder");
    }
    return collectFolder + "/" + relative.string();
}

Json objectFile(std::string const& path) {
    Json document = Json::parse(util::readWholeFile(path), nullptr, false);
    if (document.is_discarded() || !document.is_object()) {
        throw MalformedInput(path + ": not a JSON object");
    }
    return document;
}

std::string textMember(Json const& object, char const* name) {
    auto const found = object.find(name);
    return found != object.end() && found->is_string() ? found->get<std::string>() : "";
}

void readBundle(std::string const& folder, ConsoleRun& run) {
    Json const bundle = objectFile(folder + "/bundle.json");
    if (bundle.value("schema_version", Json()) != gc_RecordsSchemaVersion) {
        throw MalformedInput(folder + "/bundle.json: schema_version is not " +
                             std::to_string(gc_RecordsSchemaVersion));
    }
    run.consoleHost = textMember(bundle, "console_host");
    run.mode = textMember(bundle, "mode");
    if (std::string const started = textMember(bundle, "run_started"); !started.empty()) {
        run.runStarted = started;
    }
    std::string const summary = folder + "/summary.json";
    // Checked by its syntax alone: each summary is read whole only while its
    // console's outputs are written, one console at a time.
    std::string const text = util::readWholeFile(summary);
    if (text.find_first_not_of(" \t\r\n") == std::string::npos ||
        text[text.find_first_not_of(" \t\r\n")] != '{' || !Json::accept(text)) {
        throw MalformedInput(summary + ": not a JSON object");
    }
    run.summaryFile = summary;
    run.vpdFolder = folder + "/VPD";
}

void markUnreadable(ConsoleRun& run, std::string const& reason) {
    run.record.kind = RecordKind::ToolError;
    run.record.message = "bundle unreadable: " + reason;
    run.summaryFile.clear();
    run.vpdFolder.clear();
}

} // namespace

ConsoleRun readConsoleRun(std::string const& collectFolder, ConsoleRecord const& record) {
    ConsoleRun run;
    run.record = record;
    if (!record.bundle) {
        if (record.kind == RecordKind::Collected) {
            markUnreadable(run, "records.json names no bundle for a collected console");
        }
        return run;
    }
    try {
        readBundle(bundleFolder(collectFolder, *record.bundle), run);
    } catch (std::exception const& failure) {
        markUnreadable(run, failure.what());
    }
    return run;
}

std::optional<Json> readSummary(ConsoleRun const& console) {
    if (!console.hasSummary()) {
        return std::nullopt;
    }
    Json summary = Json::parse(util::readWholeFileOrEmpty(console.summaryFile), nullptr, false);
    if (summary.is_discarded() || !summary.is_object()) {
        return std::nullopt;
    }
    return summary;
}

} // namespace estate
