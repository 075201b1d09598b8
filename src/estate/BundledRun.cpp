#include "estate/BundledRun.h"

#include "estate/CollectRecords.h"
#include "report/Outcome.h"

#include <optional>
#include <string>

namespace estate {

using Json = nlohmann::ordered_json;

namespace {

Json const& memberOf(Json const& object, char const* name) {
    auto const found = object.find(name);
    if (found == object.end()) {
        throw MalformedInput(std::string("the summary has no member ") + name);
    }
    return *found;
}

template <typename Value> Value valueOf(Json const& object, char const* name) {
    Json const& member = memberOf(object, name);
    try {
        return member.get<Value>();
    } catch (Json::exception const&) {
        throw MalformedInput(std::string("the summary's member ") + name + " is not of its type");
    }
}

// A member the schema allows to be null, or that older summaries lack.
template <typename Value> std::optional<Value> optionalOf(Json const& object, char const* name) {
    auto const found = object.find(name);
    if (found == object.end() || found->is_null()) {
        return std::nullopt;
    }
    return valueOf<Value>(object, name);
}

std::optional<report::ListingFailure> listingFailureOf(Json const& object) {
    auto const found = object.find("listing_failure");
    if (found == object.end() || !found->is_object()) {
        return std::nullopt;
    }
    return report::ListingFailure{found->value("command", ""),
                                  optionalOf<int>(*found, "exit_status"),
                                  found->value("message", "")};
}

report::PartitionSummary partitionOf(Json const& entry) {
    report::PartitionSummary partition;
    partition.id = optionalOf<std::string>(entry, "id");
    partition.host = valueOf<std::string>(entry, "host");
    partition.ip = valueOf<std::string>(entry, "ip");
    partition.activeStatus = optionalOf<std::string>(entry, "active_status");
    auto const outcome = valueOf<std::string>(entry, "outcome");
    std::optional<report::Outcome> const known = report::outcomeNamed(outcome);
    if (!known) {
        throw MalformedInput("the summary names an unknown outcome " + outcome);
    }
    partition.outcome = *known;
    partition.statusText = valueOf<std::string>(entry, "status_text");
    partition.returnCode = valueOf<std::string>(entry, "return_code");
    partition.rc = optionalOf<long long>(entry, "rc");
    partition.rcCmd = optionalOf<long long>(entry, "rc_cmd");
    partition.document = optionalOf<std::string>(entry, "document");
    partition.reason = optionalOf<std::string>(entry, "reason");
    partition.seconds = optionalOf<double>(entry, "seconds");
    return partition;
}

report::MachineSummary machineOf(Json const& entry) {
    report::MachineSummary machine;
    machine.identity = valueOf<std::string>(entry, "identity");
    machine.statusFile = entry.value("status_file", "");
    machine.traceFile = optionalOf<std::string>(entry, "trace_file");
    for (Json const& partition : memberOf(entry, "partitions")) {
        machine.partitions.push_back(partitionOf(partition));
    }
    machine.listingFailure = listingFailureOf(entry);
    return machine;
}

} // namespace

report::RunSummary bundledRun(Json const& summary) {
    report::RunSummary run;
    run.tool = valueOf<std::string>(summary, "tool");
    run.consoleHost = valueOf<std::string>(summary, "console_host");
    run.started = valueOf<std::string>(summary, "started");
    run.ended = valueOf<std::string>(summary, "ended");
    run.interruptedBy = optionalOf<std::string>(summary, "interrupted");
    run.exitStatus = optionalOf<int>(summary, "exit_status");
    for (Json const& machine : memberOf(summary, "machines")) {
        run.machines.push_back(machineOf(machine));
    }
    run.listingFailure = listingFailureOf(summary);
    return run;
}

} // namespace estate
