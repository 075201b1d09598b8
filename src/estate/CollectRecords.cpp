#include "estate/CollectRecords.h"

#include "utility/FileText.h"

#include <nlohmann/json.hpp>

#include <set>

namespace estate {

using Json = nlohmann::json;

namespace {

[[noreturn]] void refuse(std::string const& path, std::string const& why) {
    throw MalformedInput(path + ": " + why);
}

std::string stringMember(Json const& object, char const* name, std::string const& where) {
    auto const found = object.find(name);
    if (found == object.end() || !found->is_string()) {
        refuse(where, std::string("\"") + name + "\" is missing or not a string");
    }
    return found->get<std::string>();
}

std::optional<long long> optionalNumber(Json const& object, char const* name,
                                        std::string const& where) {
    auto const found = object.find(name);
    if (found == object.end() || found->is_null()) {
        return std::nullopt;
    }
    if (!found->is_number_integer()) {
        refuse(where, std::string("\"") + name + "\" is not a whole number");
    }
    return found->get<long long>();
}

std::optional<std::string> optionalString(Json const& object, char const* name,
                                          std::string const& where) {
    auto const found = object.find(name);
    if (found == object.end() || found->is_null()) {
        return std::nullopt;
    }
    if (!found->is_string()) {
        refuse(where, std::string("\"") + name + "\" is not a string");
    }
    return found->get<std::string>();
}

ConsoleRecord recordOf(Json const& entry, std::string const& where) {
    if (!entry.is_object()) {
        refuse(where, "a console's record is not an object");
    }
    ConsoleRecord record;
    record.console = stringMember(entry, "console", where);
    if (record.console.empty()) {
        refuse(where, "a console's name is empty");
    }
    std::string const console = where + ": console " + record.console;
    std::string const kind = stringMember(entry, "record", console);
    std::optional<RecordKind> const named = recordNamed(kind);
    if (!named) {
        refuse(console, "unknown record \"" + kind + "\"");
    }
    record.kind = *named;
    record.message = optionalString(entry, "message", console).value_or("");
    record.exitStatus = optionalNumber(entry, "exit_status", console);
    record.ageSeconds = optionalNumber(entry, "age_seconds", console);
    record.bundle = optionalString(entry, "bundle", console);
    return record;
}

Json parsedObject(std::string const& text, std::string const& path) {
    Json document = Json::parse(text, nullptr, false);
    if (document.is_discarded() || !document.is_object()) {
        refuse(path, "not a JSON object");
    }
    auto const version = document.find("schema_version");
    if (version == document.end() || *version != gc_RecordsSchemaVersion) {
        refuse(path, "schema_version is not " + std::to_string(gc_RecordsSchemaVersion));
    }
    return document;
}

} // namespace

CollectRecords parseCollectRecords(std::string const& text, std::string const& path) {
    Json const document = parsedObject(text, path);
    CollectRecords records;
    records.collected = stringMember(document, "collected", path);
    auto const consoles = document.find("consoles");
    if (consoles == document.end() || !consoles->is_array()) {
        refuse(path, "\"consoles\" is missing or not a list");
    }
    std::set<std::string> seen;
    for (Json const& entry : *consoles) {
        ConsoleRecord record = recordOf(entry, path);
        if (!seen.insert(record.console).second) {
            refuse(path, "console " + record.console + " is recorded more than once");
        }
        records.consoles.push_back(std::move(record));
    }
    return records;
}

CollectRecords readCollectRecords(std::string const& collectFolder) {
    std::string const path = collectFolder + "/records.json";
    return parseCollectRecords(util::readWholeFile(path), path);
}

} // namespace estate
