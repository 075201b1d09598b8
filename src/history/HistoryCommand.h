#pragma once

#include "history/HistoryFile.h"

#include <CLI/App.hpp>

#include <cstddef>
#include <optional>
#include <ostream>
#include <string>

namespace history {

// The subcommand "history": what the history database holds, read-only
// but for prune (docs/history.md, "The history command").
enum class HistoryAction { None, Runs, Changes, Partition, Export, Prune };

// What "history ACTION [options]" was given.
struct HistoryRequest {
    HistoryAction action = HistoryAction::None;
    std::string file = gc_DefaultHistoryFile;
    bool json = false;
    std::optional<std::string> console;
    // runs: the newest this many; 0 for all.
    std::size_t last = 20;
    // changes
    std::optional<long long> run;
    std::string since;
    std::optional<long long> sinceUnix;
    // partition
    std::string machine;
    std::string partition;
    // export
    std::string format;
    std::string what = "runs";
    std::string output;
    // prune
    std::optional<std::size_t> keep;
    std::string before;
    std::optional<long long> beforeUnix;
};

// Registers "history" and its actions (runs, changes, partition, export,
// prune) on app, filling request; returns the subcommand, so that the
// caller can ask whether it was parsed.
CLI::App* addHistorySubcommand(CLI::App& app, HistoryRequest& request);

// What the parser does not check: an action was named, the dates are
// dates, export has a format, prune one limit. Throws CLI::ValidationError
// with the reason in plain words.
void checkHistoryRequest(CLI::App const& historyCommand, HistoryRequest& request);

// Answers the request on out, for a terminal width columns wide (0: not a
// terminal, no limit). Returns 0, or the exit status of HistoryFile.h with
// one line on errors saying why.
int runHistorySubcommand(HistoryRequest const& request, std::ostream& out, std::ostream& errors,
                         std::size_t width);

} // namespace history
