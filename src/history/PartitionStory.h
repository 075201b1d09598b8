#pragma once

#include <SQLiteCpp/Database.h>
#include <nlohmann/json.hpp>

#include <cstddef>
#include <optional>
#include <string>

namespace history {

// "history partition MACHINE PARTITION": one partition's story, each run
// that listed it with its outcome, reason and the change it brought, then
// the events of its components.

struct PartitionSelection {
    std::string machine;
    std::string partition;
    // The console, when more than one has listed the same machine.
    std::optional<std::string> console;
};

// The consoles whose runs listed the partition, sorted: the command asks
// for --console when there is more than one.
std::vector<std::string> consolesListing(SQLite::Database& database,
                                         PartitionSelection const& selection);

// The story as text for a terminal width columns wide (0: no limit); the
// selection's console is set.
std::string partitionStoryText(SQLite::Database& database, PartitionSelection const& selection,
                               std::size_t width);

// {"console", "machine", "partition", "runs": [...], "component_events": [...]}
// (docs/history.md).
nlohmann::ordered_json partitionStoryJson(SQLite::Database& database,
                                          PartitionSelection const& selection);

} // namespace history
