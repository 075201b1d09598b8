#pragma once

#include <SQLiteCpp/Database.h>
#include <nlohmann/json.hpp>

#include <cstddef>
#include <optional>
#include <string>

namespace history {

// "history prune": removes old runs with their machines, partitions,
// events and components (the tables' ON DELETE CASCADE), in one
// transaction, then gives the space back.

struct PruneSelection {
    // Keeps the newest this many runs of each console.
    std::optional<std::size_t> keep;
    // Removes the runs that started before this moment, and the text given.
    std::optional<long long> beforeUnix;
    std::string beforeText;
};

struct PruneResult {
    long long removed = 0;
    long long kept = 0;
};

// Removes the runs the selection names. The write-ahead log is then folded
// into the file and emptied; the file is rewritten smaller (VACUUM) when
// more than a quarter of it is left free.
PruneResult pruneRuns(SQLite::Database& database, PruneSelection const& selection);

// "Removed 3 runs, kept 7.\n"
std::string pruneText(PruneResult const& result);

// {"removed": N, "kept": N}
nlohmann::ordered_json pruneJson(PruneResult const& result);

} // namespace history
