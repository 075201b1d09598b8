#include "CollectFolder.h"

#include <nlohmann/json.hpp>

#include <sys/stat.h>

namespace QuorvexTest {

namespace {

void makeFolder(std::string const& path) {
    ::mkdir(path.c_str(), 0755);
}

std::string joined(std::vector<std::string> const& items) {
    std::string text;
    for (std::string const& item : items) {
        text += (text.empty() ? "" : ",\n") + item;
    }
    return text;
}

} // namespace

CollectFolder::CollectFolder() {
    makeFolder(_folder.file("consoles"));
}

std::string const& CollectFolder::path() const {
    return _folder.path();
}

void CollectFolder::writeRecords(std::string const& text) const {
    writeFile(_folder.file("records.json"), text);
}

void CollectFolder::addBundle(std::string const& console, std::string const& summary,
                              std::vector<std::string> const& documents) const {
    std::string const bundle = _folder.file("consoles/" + console);
    makeFolder(bundle);
    makeFolder(bundle + "/VPD");
    nlohmann::ordered_json const meta{{"schema_version", 1},
                                      {"console", console},
                                      {"console_host", console + ".example"},
                                      {"mode", "run"},
                                      {"collected", "2026-11-24T18:00:00+00:00"},
                                      {"run_started", "2026-11-24T17:55:00+00:00"},
                                      {"exit_status", 4},
                                      {"product_version", "1.0.0"}};
    writeFile(bundle + "/bundle.json", meta.dump() + "\n");
    writeFile(bundle + "/summary.json", summary);
    for (std::string const& document : documents) {
        std::string documentPath = bundle;
        documentPath += "/VPD/";
        documentPath += document;
        writeFile(documentPath, "<doc/>");
    }
}

std::string CollectFolder::record(std::string const& console, std::string const& kind,
                                  bool withBundle, std::string const& message,
                                  std::string const& exitStatus, std::string const& ageSeconds) {
    return R"({"console": ")" + console + R"(", "record": ")" + kind + R"(", "message": )" +
           message + R"(, "exit_status": )" + exitStatus + R"(, "age_seconds": )" + ageSeconds +
           R"(, "bundle": )" + (withBundle ? "\"consoles/" + console + "\"" : "null") + "}";
}

std::string CollectFolder::records(std::vector<std::string> const& entries) {
    return R"({"schema_version": 1, "collected": "2026-11-24T18:00:00+00:00", "consoles": [)" +
           joined(entries) + "]}\n";
}

std::string CollectFolder::summary(std::vector<std::string> const& partitions) {
    return R"({"schema_version": 1, "tool": "quorvex-survey", "version": "1.0.0", "console_host": "pylon.example",
 "started": "2026-11-24T17:55:00+00:00", "ended": "2026-11-24T17:58:00+00:00", "elapsed_seconds": 180.0,
 "options": {"jobs": 8, "timeout_seconds": 1800, "all": true, "identities": []},
 "interrupted": null, "return_code": "4", "exit_status": 4,
 "totals": {"machines": 1, "partitions": )" +
           std::to_string(partitions.size()) +
           R"(},
 "machines": [{"identity": "9119-MHE_21ABCDE", "return_code": "4",
   "status_file": "/var/adm/quorvex/VPD/x.status", "trace_file": null,
   "counts": {"partitions": )" +
           std::to_string(partitions.size()) + R"(}, "partitions": [)" + joined(partitions) +
           "]}]}\n";
}

std::string CollectFolder::partition(std::string const& id, std::string const& host,
                                     std::string const& outcome, std::string const& reason) {
    nlohmann::ordered_json const entry{
        {"id", id},
        {"host", host},
        {"ip", "10.0.0." + id},
        {"active_status", "3"},
        {"outcome", outcome},
        {"status_text", outcome == "surveyed" ? "Ok" : "RELAY Failed, rc = 1"},
        {"return_code", outcome == "surveyed" ? "0" : "8"},
        {"rc", 0},
        {"rc_cmd", 0},
        {"document", "VPD/" + host + ".VPD.xml"},
        {"reason", reason.empty() ? nlohmann::ordered_json() : nlohmann::ordered_json(reason)},
        {"seconds", 1.5}};
    return entry.dump();
}

} // namespace QuorvexTest
