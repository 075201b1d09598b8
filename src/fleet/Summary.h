#pragma once

#include "fleet/CommandLine.h"
#include "fleet/RunRecords.h"

#include <nlohmann/json.hpp>

#include <string>
#include <vector>

namespace Fleet {

// The facts of a whole run that its summary carries besides the machines.
struct RunFacts {
    Options options;
    std::string consoleHost;
    std::string started;
    std::string ended;
    double elapsedSeconds = 0;
    // "SIGINT", "SIGTERM", or empty when the run was not interrupted.
    std::string interruptedBy;
    std::string returnCode;
    int exitStatus = 0;
};

// The machine-readable summary of a run, in the format of
// docs/summary.schema.json.
class Summary {
public:
    static nlohmann::json build(RunFacts const& facts, std::vector<MachineRecord> const& machines);
    // One of the schema's outcomes: surveyed, inactive, channel_failure,
    // client_failure, fetch_failure, timed_out or interrupted.
    static std::string outcomeName(PartitionRecord const& record);
    // The summary's text; bytes that are not UTF-8 are replaced.
    static std::string text(nlohmann::json const& summary);

private:
    static nlohmann::json _machine(MachineRecord const& machine);
    static nlohmann::json _partition(PartitionRecord const& record);
    static nlohmann::json _counts(std::vector<MachineRecord> const& machines);
    static void _count(nlohmann::json& counts, MachineRecord const& machine);
};

} // namespace Fleet
